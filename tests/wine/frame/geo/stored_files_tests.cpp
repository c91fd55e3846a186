// Whole-file reads of stored streams and found files against streams that misbehave the
// way real ones do: S_OK with no bytes at the end, reads in small pieces, failing reads
// and seeks, sizes beyond the cap; files that are missing or larger than allowed.
#include <doctest/doctest.h>

#include <windows.h>
#include <objidl.h>

#include <cstring>
#include <string>

#include "frame/geo/stored_files.h"
#include "tests/wine/common/registry_test_support.h"

namespace {

// A stream that claims `size` bytes and gives `content` (shorter or equal), at most
// `piece` bytes a call, then S_OK with none, as IStream implementations do at their end.
class PieceStream final : public IStream {
public:
  std::string content;
  ULONGLONG size = 0;
  ULONG piece = 0xFFFFFFFFu;
  HRESULT seekResult = S_OK;
  HRESULT readFailure = S_OK;  // answered once the content is used up
  std::size_t at = 0;
  int reads = 0;

  STDMETHODIMP QueryInterface(REFIID iid, void** out) override {
    if (IsEqualIID(iid, IID_IUnknown) || IsEqualIID(iid, IID_IStream) || IsEqualIID(iid, IID_ISequentialStream)) {
      *out = static_cast<IStream*>(this);
      return S_OK;
    }
    *out = nullptr;
    return E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP Read(void* buffer, ULONG want, ULONG* read) override {
    ++reads;
    std::size_t give = content.size() - at;
    if (give > want) give = want;
    if (give > piece) give = piece;
    if (give == 0 && FAILED(readFailure)) {
      *read = 0;
      return readFailure;
    }
    std::memcpy(buffer, content.data() + at, give);
    at += give;
    *read = static_cast<ULONG>(give);
    return S_OK;
  }
  STDMETHODIMP Write(const void*, ULONG, ULONG*) override { return STG_E_ACCESSDENIED; }
  STDMETHODIMP Seek(LARGE_INTEGER move, DWORD origin, ULARGE_INTEGER* position) override {
    if (FAILED(seekResult)) return seekResult;
    at = origin == STREAM_SEEK_END ? static_cast<std::size_t>(size) : static_cast<std::size_t>(move.QuadPart);
    if (position) position->QuadPart = origin == STREAM_SEEK_END ? size : static_cast<ULONGLONG>(move.QuadPart);
    return S_OK;
  }
  STDMETHODIMP SetSize(ULARGE_INTEGER) override { return E_NOTIMPL; }
  STDMETHODIMP CopyTo(IStream*, ULARGE_INTEGER, ULARGE_INTEGER*, ULARGE_INTEGER*) override { return E_NOTIMPL; }
  STDMETHODIMP Commit(DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Revert() override { return E_NOTIMPL; }
  STDMETHODIMP LockRegion(ULARGE_INTEGER, ULARGE_INTEGER, DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP UnlockRegion(ULARGE_INTEGER, ULARGE_INTEGER, DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Stat(STATSTG*, DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Clone(IStream**) override { return E_NOTIMPL; }
};

}  // namespace

TEST_CASE("stored streams: whole, in pieces, short, failing and too large") {
  std::string bytes = "left over";
  PieceStream whole;
  whole.content = std::string("Nul\0inside", 10);
  whole.size = whole.content.size();
  CHECK(br::geo::ReadWholeStream(&whole, bytes) == S_OK);
  CHECK(bytes == whole.content);

  PieceStream pieces;
  pieces.content = "A text handed out three bytes at a time";
  pieces.size = pieces.content.size();
  pieces.piece = 3;
  CHECK(br::geo::ReadWholeStream(&pieces, bytes) == S_OK);
  CHECK(bytes == pieces.content);
  CHECK(pieces.reads == 13);

  // The stream ends before its size: S_OK with 0 bytes is no text, not an empty one.
  PieceStream shortOne;
  shortOne.content = "cut";
  shortOne.size = 20;
  CHECK(br::geo::ReadWholeStream(&shortOne, bytes) == STG_E_READFAULT);
  CHECK(bytes.empty());
  PieceStream nothing;
  nothing.size = 8;
  CHECK(br::geo::ReadWholeStream(&nothing, bytes) == STG_E_READFAULT);

  // A failing read or seek is the result as it is.
  PieceStream failing;
  failing.content = "half";
  failing.size = 8;
  failing.readFailure = STG_E_ACCESSDENIED;
  CHECK(br::geo::ReadWholeStream(&failing, bytes) == STG_E_ACCESSDENIED);
  CHECK(bytes.empty());
  PieceStream unseekable;
  unseekable.seekResult = STG_E_INVALIDFUNCTION;
  CHECK(br::geo::ReadWholeStream(&unseekable, bytes) == STG_E_INVALIDFUNCTION);

  // An empty stream is an empty text.
  PieceStream empty;
  CHECK(br::geo::ReadWholeStream(&empty, bytes) == S_OK);
  CHECK(bytes.empty());

  // Larger than allowed: refused before anything is allocated or read.
  PieceStream huge;
  huge.size = 1ull << 40;
  CHECK(br::geo::ReadWholeStream(&huge, bytes) == E_OUTOFMEMORY);
  CHECK(huge.reads == 0);
  PieceStream overCap;
  overCap.content = "0123456789";
  overCap.size = 10;
  CHECK(br::geo::ReadWholeStream(&overCap, bytes, 9) == E_OUTOFMEMORY);
  CHECK(br::geo::ReadWholeStream(&overCap, bytes, 10) == S_OK);
  CHECK(br::geo::ReadWholeStream(nullptr, bytes) == E_POINTER);
}

TEST_CASE("found files: every byte, missing files and the cap") {
  ScratchFolder folder;
  const std::string text("line one\r\nline two\0tail", 24);
  WriteTextFile(folder / "text.txt", text);
  WriteTextFile(folder / "empty.txt", "");
  std::string bytes = "left over";
  CHECK(br::geo::ReadWholeFile(folder / "text.txt", bytes) == S_OK);
  CHECK(bytes == text);
  CHECK(br::geo::ReadWholeFile(folder / "empty.txt", bytes) == S_OK);
  CHECK(bytes.empty());
  CHECK(br::geo::ReadWholeFile(folder / "absent.txt", bytes) == HRESULT_FROM_WIN32(ERROR_FILE_NOT_FOUND));
  CHECK(br::geo::ReadWholeFile(folder / "text.txt", bytes, 23) == E_OUTOFMEMORY);
  CHECK(bytes.empty());
  CHECK(br::geo::ReadWholeFile(folder / "text.txt", bytes, 24) == S_OK);
  CHECK(bytes.size() == 24);
}

#pragma once
// Files a chart object names in its attributes (texts, pictures), read whole: from the
// object's own storage when the host keeps them there, else from a found path.

#include <windows.h>
#include <objidl.h>

#include <cstdint>
#include <string>

#include "GeoData.h"

namespace br::geo {

// No stored or chart data file read whole is larger; a bigger one is refused
// (E_OUTOFMEMORY, as a failed allocation would be) instead of exhausting the host.
constexpr std::uint64_t kMaxWholeFileBytes = 32u << 20;

// Reads `name` whole (ReadWholeStream) when the object keeps it as a stream of its storage
// (GetStorage, then OpenStream for exclusive reading); `stored` tells whether it does. The
// storage is held while the stream is read: a stream outlived by its storage is reverted.
// An empty name, or one holding a NUL, is never stored.
HRESULT ReadStoredFile(IGeoObject* object, const std::wstring& name, std::string& bytes, bool& stored);

// The whole stream: its size by seeking to the end, then from the start up to that size.
// Streams answer S_OK with 0 bytes at their end, so a stream that gives fewer bytes than
// its size fails (the read's own failure, else STG_E_READFAULT) and `bytes` is emptied.
HRESULT ReadWholeStream(IStream* stream, std::string& bytes, std::uint64_t limit = kMaxWholeFileBytes);

// The whole file at `path`; `bytes` holds what was actually read. A file that shrinks
// while read ends the text early; one that cannot be opened gives its system error.
HRESULT ReadWholeFile(const std::string& path, std::string& bytes, std::uint64_t limit = kMaxWholeFileBytes);

}  // namespace br::geo

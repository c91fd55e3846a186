#include "inspector/panels/cXTextDescr.h"

#include "toolkit/core/system_library.h"

#include <richedit.h>
#include <wrl/client.h>

#include <iterator>

#include "frame/errors/cErr.h"
#include "frame/geo/stored_files.h"
#include "frame/geo/volume_files.h"
#include "frame/settings/data_file_search.h"
#include "toolkit/base/class_records.h"
#include "toolkit/core/ToolkitWindows.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

namespace {

// Chart data names are 8-bit texts of the system code page; a name that does not convert
// both ways cannot name a folder entry.
bool AnsiName(const std::wstring& name, std::string& ansi) {
  ansi.clear();
  if (name.empty()) return false;
  BOOL lossy = FALSE;
  const int size = WideCharToMultiByte(CP_ACP, 0, name.data(), static_cast<int>(name.size()), nullptr, 0, nullptr, &lossy);
  if (size <= 0 || lossy) return false;
  ansi.resize(static_cast<std::size_t>(size));
  WideCharToMultiByte(CP_ACP, 0, name.data(), static_cast<int>(name.size()), &ansi[0], size, nullptr, nullptr);
  return ansi.find('\0') == std::string::npos;
}

// "RICHEDIT" is registered only by its library; the newer one is the fallback.
struct RichEditKind {
  const wchar_t* library;
  const char* windowClass;
};
constexpr RichEditKind kRichEdits[] = {{L"riched32.dll", "RICHEDIT"}, {L"riched20.dll", "RichEdit20A"}};

}  // namespace

cXTextDescr::cXTextDescr() = default;

cXTextDescr::~cXTextDescr() {
  // The rich edit window's procedure lives in the library: the window goes first.
  if (isValid()) destroyWindow();
  for (HMODULE& library : richEditLibraries_) {
    if (library) FreeLibrary(library);
    library = nullptr;
  }
}

const toolkit::ClassRecord* cXTextDescr::getClassRecord() const { return &toolkit::records::cXTextDescr; }

HWND cXTextDescr::MakeRichEdit(HWND ownWindow, std::size_t kind) {
  const char* windowClass = kRichEdits[kind].windowClass;
  HMODULE& held = richEditLibraries_[kind];
  if (!held) {
    // From the system folder only: never a library of that name beside the host.
    held = toolkit::LoadSystemLibrary(kRichEdits[kind].library);
    if (!held) return nullptr;
  }
  HWND edit = CreateWindowExA(WS_EX_CLIENTEDGE, windowClass, "", kRichEditStyle, 0, 0, 0, 0, ownWindow, nullptr,
                              toolkit::ToolkitWindows::moduleInstance(), nullptr);
  if (edit) richEditClass_ = windowClass;
  return edit;
}

HWND cXTextDescr::createNative(HWND ownWindow) {
  HWND edit = nullptr;
  for (std::size_t kind = 0; !edit && kind < std::size(kRichEdits); ++kind) edit = MakeRichEdit(ownWindow, kind);
  if (!edit) {
    const DWORD error = GetLastError();
    throw br::cErr(static_cast<std::uint32_t>(HRESULT_FROM_WIN32(error ? error : ERROR_CANNOT_FIND_WND_CLASS)));
  }
  // Texts are whole files: the control's default limit would cut them.
  SendMessageA(edit, EM_EXLIMITTEXT, 0, static_cast<LPARAM>(br::geo::kMaxWholeFileBytes));
  if (!storedText().empty()) SetWindowTextA(edit, storedText().c_str());
  return edit;
}

void cXTextDescr::destroyWindow() {
  if (isValid()) {
    if (HWND edit = nativeWindow()) DestroyWindow(edit);
    native_ = nullptr;
  }
  ContainedWindow::destroyWindow();
}

int cXTextDescr::onNotify(toolkit::ToolkitEvent&) { return 0; }

void cXTextDescr::Clear() {
  content_ = false;
  setText(std::string_view());
}

void cXTextDescr::Show(std::string bytes) {
  setText(bytes);
  content_ = true;
}

HRESULT cXTextDescr::Fill(IGeoObject* object, long attributeCode) {
  if (!object) return E_NOINTERFACE;
  GUID kind{};
  if (FAILED(object->GetKindId(&kind)) || !IsEqualGUID(kind, GEOKIND_CHART_DATABASE)) return E_INVALIDARG;
  ComPtr<IGeoAttribute> attribute;
  if (object->GetAttribute(attributeCode, &attribute) != S_OK || !attribute) return S_FALSE;
  VARIANT value;
  VariantInit(&value);
  HRESULT hr = attribute->GetValue(&value);
  std::wstring name;
  const bool text = SUCCEEDED(hr) && value.vt == VT_BSTR;
  if (text && value.bstrVal) name.assign(value.bstrVal, SysStringLen(value.bstrVal));
  VariantClear(&value);
  if (!text) return E_NOINTERFACE;
  ComPtr<IGeoDatabase> database;
  if (FAILED(br::geo::DatabaseOfObject(object, &database))) return E_NOINTERFACE;
  return Load(object, database.Get(), name);
}

HRESULT cXTextDescr::Load(IGeoObject* object, IGeoDatabase* database, const std::wstring& name) {
  content_ = false;
  std::string bytes;
  bool stored = false;
  HRESULT hr = br::geo::ReadStoredFile(object, name, bytes, stored);
  if (stored) {
    if (FAILED(hr)) return hr;  // a short read shows nothing rather than part of a text
    Show(std::move(bytes));
    return S_OK;
  }
  // The name is only ever compared with folder entries, never made into a path.
  std::string ansi, path;
  if (!AnsiName(name, ansi)) return kFileNotFound;
  if (FAILED(br::geo::FindVolumeFile(database, ansi.c_str(), path)) && FAILED(br::FindStoreFile(ansi.c_str(), path)))
    return kFileNotFound;
  hr = br::geo::ReadWholeFile(path, bytes);
  if (FAILED(hr)) return hr;
  Show(std::move(bytes));
  return S_OK;
}

}  // namespace br::inspector

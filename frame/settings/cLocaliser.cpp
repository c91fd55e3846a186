#include "frame/settings/cLocaliser.h"

#include <algorithm>

namespace br {

namespace {

constexpr const wchar_t* TABLE_FILE = L"BRInfo.csv";
constexpr const wchar_t* TABLE_NAME = L"BRInfo";

std::string AnsiFromBstrText(BSTR text) {
  const int length = text != nullptr ? static_cast<int>(SysStringLen(text)) : 0;
  if (length == 0) return std::string();
  const int size = WideCharToMultiByte(CP_ACP, 0, text, length, nullptr, 0, nullptr, nullptr);
  std::string ansi(size > 0 ? static_cast<std::size_t>(size) : 0, '\0');
  if (size > 0) WideCharToMultiByte(CP_ACP, 0, text, length, &ansi[0], size, nullptr, nullptr);
  return ansi;
}

// Frees a BSTR the component handed back, whatever the call answered.
class BstrOut {
public:
  ~BstrOut() { SysFreeString(text_); }
  BSTR* Out() { return &text_; }
  BSTR Get() const { return text_; }

private:
  BSTR text_ = nullptr;
};

}  // namespace

cLocaliser::cLocaliser(REFCLSID component) : thread_(GetCurrentThreadId()) {
  comInitialised_ = SUCCEEDED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED));
  ITextTable* table = nullptr;
  if (FAILED(CoCreateInstance(component, nullptr, CLSCTX_ALL, IID_ITextTable,
                              reinterpret_cast<void**>(&table))) ||
      table == nullptr) {
    return;
  }
  BSTR folder = SysAllocString(L"");
  BSTR file = SysAllocString(TABLE_FILE);
  BSTR name = SysAllocString(TABLE_NAME);
  const HRESULT loaded = (folder && file && name) ? table->LoadTable(folder, file, name) : E_OUTOFMEMORY;
  SysFreeString(folder);
  SysFreeString(file);
  SysFreeString(name);
  if (FAILED(loaded)) {
    table->Release();
    return;
  }
  table_ = table;
}

cLocaliser::~cLocaliser() {
  if (table_ != nullptr) table_->Release();
  if (comInitialised_) CoUninitialize();
}

bool cLocaliser::Lookup(const char* section, long id, std::string& text) const {
  if (table_ == nullptr || section == nullptr) return false;
  const int length = MultiByteToWideChar(CP_ACP, 0, section, -1, nullptr, 0);
  if (length <= 0) return false;
  std::wstring wide(static_cast<std::size_t>(length), L'\0');
  MultiByteToWideChar(CP_ACP, 0, section, -1, &wide[0], length);
  BSTR sectionText = SysAllocString(wide.c_str());
  if (sectionText == nullptr) return false;
  BstrOut answer;
  const HRESULT hr = table_->GetText(sectionText, id, answer.Out());
  SysFreeString(sectionText);
  if (hr != S_OK) return false;
  text = AnsiFromBstrText(answer.Get());
  return true;
}

HRESULT cLocaliser::Language(long& language) const {
  language = -1;
  if (table_ == nullptr) return OLE_E_BLANK;
  long answer = -1;
  const HRESULT hr = table_->GetLanguage(&answer);
  if (SUCCEEDED(hr)) language = answer;
  return hr;
}

void cLocaliser::AddClient(const void* client) {
  if (std::find(clients_.begin(), clients_.end(), client) == clients_.end()) clients_.push_back(client);
}

bool cLocaliser::RemoveClient(const void* client) {
  const auto it = std::find(clients_.begin(), clients_.end(), client);
  if (it == clients_.end()) return false;
  clients_.erase(it);
  return true;
}

void cLocaliser::Abandon() noexcept {
  table_ = nullptr;
  comInitialised_ = false;
}

}  // namespace br

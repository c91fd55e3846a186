#include "host/chartscene/server/TextTable.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include <fstream>
#include <sstream>

#include "host/chartscene/server/scene_environment.h"
#include "host/chartscene/server/scene_text.h"

namespace br::chartscene {

TextTable::TextTable()
    : ComObject<ITextTable>("TextTable"), language_(EnvironmentNumber(L"CHARTSCENE_LANGUAGE", 1033)) {
  AddToCounter("TextTable.created", 1);
}

HRESULT TextTable::Create(IUnknown** object) {
  if (EnvironmentText(L"CHARTSCENE_TEXTTABLE") == L"absent") return REGDB_E_CLASSNOTREG;
  *object = static_cast<ITextTable*>(new TextTable);
  return S_OK;
}

STDMETHODIMP TextTable::GetLanguage(long* language) {
  if (auto fault = CallAndFault("ITextTable.GetLanguage")) return static_cast<HRESULT>(*fault);
  if (language == nullptr) return E_POINTER;
  *language = language_;
  return S_OK;
}

STDMETHODIMP TextTable::LoadTable(BSTR folder, BSTR fileName, BSTR) {
  if (auto fault = CallAndFault("ITextTable.LoadTable")) return static_cast<HRESULT>(*fault);
  if (fileName == nullptr || SysStringLen(fileName) == 0) return E_INVALIDARG;
  std::wstring path = folder != nullptr ? std::wstring(folder, SysStringLen(folder)) : std::wstring();
  if (path.empty()) path = EnvironmentText(L"CHARTSCENE_TEXTS");
  if (path.empty()) path = SceneModule::Folder();
  if (path.back() != L'\\' && path.back() != L'/') path += L'\\';
  path.append(fileName, SysStringLen(fileName));

  std::string content;
  if (!ReadWholeFile(path, content)) return HRESULT_FROM_WIN32(ERROR_FILE_NOT_FOUND);
  std::string error;
  TextTableData table;
  if (!ParseTextTable(content, table, error)) return E_FAIL;
  table_ = std::move(table);
  loaded_ = true;
  return S_OK;
}

STDMETHODIMP TextTable::GetText(BSTR section, long id, BSTR* text) {
  if (text == nullptr) return E_POINTER;
  *text = nullptr;
  if (auto fault = CallAndFault("ITextTable.GetText")) {
    *text = SysAllocString(L"injected fault");
    return static_cast<HRESULT>(*fault);
  }
  if (!loaded_) return E_UNEXPECTED;
  SCENE_MISANSWER_NULL("ITextTable.GetText");
  if (Misanswers("ITextTable.GetText", Misanswer::HugeText)) {
    const std::wstring huge(kHugeTextLength, L'x');
    *text = SysAllocStringLen(huge.data(), static_cast<UINT>(huge.size()));
    return S_OK;
  }
  const std::string key = Utf8FromWide(section, section ? SysStringLen(section) : 0);
  const std::optional<std::string> found = FindText(table_, key, id, language_);
  if (!found) return S_FALSE;
  if (!found->empty()) *text = BstrFromUtf8(*found);
  return S_OK;
}

}  // namespace br::chartscene

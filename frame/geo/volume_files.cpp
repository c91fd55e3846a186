#include "frame/geo/volume_files.h"

#include <wrl/client.h>

#include "frame/settings/data_file_search.h"

using Microsoft::WRL::ComPtr;

namespace br::geo {

namespace {

std::string AnsiName(BSTR name) {
  const int length = name != nullptr ? static_cast<int>(SysStringLen(name)) : 0;
  if (length == 0) return std::string();
  const int size = WideCharToMultiByte(CP_ACP, 0, name, length, nullptr, 0, nullptr, nullptr);
  std::string ansi(size > 0 ? static_cast<std::size_t>(size) : 0, '\0');
  if (size > 0) WideCharToMultiByte(CP_ACP, 0, name, length, &ansi[0], size, nullptr, nullptr);
  return ansi;
}

}  // namespace

HRESULT DatabaseOfObject(IGeoObject* object, IGeoDatabase** database) {
  if (database == nullptr) return E_POINTER;
  *database = nullptr;
  if (object == nullptr) return E_POINTER;
  ComPtr<IGeoDataSet> dataSet;
  HRESULT hr = object->GetDataSet(&dataSet);
  if (FAILED(hr)) return hr;
  if (!dataSet) return E_POINTER;
  hr = dataSet->GetDatabase(database);
  if (SUCCEEDED(hr) && *database == nullptr) return E_POINTER;
  return hr;
}

HRESULT FindVolumeFile(IGeoDatabase* database, const char* fileName, std::string& path) {
  if (database == nullptr) return E_POINTER;
  BSTR name = nullptr;
  const HRESULT hr = database->GetName(&name);
  const std::string text = AnsiName(name);
  SysFreeString(name);
  if (FAILED(hr)) return hr;
  return br::FindVolumeFile(text, fileName, path);
}

}  // namespace br::geo

#include "host/chartscene/server/ChartScene.h"

#include <cstring>
#include <cwchar>

#include "frame/geo/dataset_header.h"
#include "host/chartscene/model/scene_counters.h"
#include "host/chartscene/model/scene_loader.h"
#include "host/chartscene/server/base_catalogue.h"
#include "host/chartscene/server/scene_text.h"
#include "host/chartscene/server/scene_wrappers.h"
#include "host/chartscene/server/value_texts.h"

using Microsoft::WRL::ComPtr;

namespace br::chartscene {

namespace {

std::string Utf8(BSTR text) { return Utf8FromWide(text, text ? SysStringLen(text) : 0); }

std::string AnsiPath(const std::wstring& path) {
  const int size = WideCharToMultiByte(CP_ACP, 0, path.c_str(), -1, nullptr, 0, nullptr, nullptr);
  std::string ansi(size > 0 ? static_cast<std::size_t>(size) : 1, '\0');
  if (size > 0) WideCharToMultiByte(CP_ACP, 0, path.c_str(), -1, &ansi[0], size, nullptr, nullptr);
  ansi.resize(ansi.size() - 1);
  return ansi;
}

std::wstring GuidText(const GUID& guid) {
  wchar_t text[40] = {};
  StringFromGUID2(guid, text, 40);
  return text;
}

std::wstring DateText(std::uint64_t fileTime) {
  FILETIME time{static_cast<DWORD>(fileTime), static_cast<DWORD>(fileTime >> 32)};
  SYSTEMTIME date{};
  if (fileTime == 0 || !FileTimeToSystemTime(&time, &date)) return L"none";
  wchar_t text[32];
  std::swprintf(text, 32, L"%04u-%02u-%02u", date.wYear, date.wMonth, date.wDay);
  return text;
}

template <typename T>
std::wstring Field(const std::optional<T>& value) {
  return value ? std::to_wstring(*value) : L"(not in the record)";
}

HRESULT Answer(const std::wstring& text, BSTR* out) {
  *out = BstrFromWide(text);
  return *out ? S_OK : E_OUTOFMEMORY;
}

}  // namespace

ChartScene::ChartScene() : ComObject<IChartScene, ISupportErrorInfo>("ChartScene") {}

HRESULT ChartScene::Create(IUnknown** object) {
  *object = static_cast<IChartScene*>(new ChartScene);
  return S_OK;
}

void* ChartScene::QueryExtra(REFIID iid) {
  return IsEqualIID(iid, IID_IDispatch) ? static_cast<IDispatch*>(static_cast<IChartScene*>(this)) : nullptr;
}

HRESULT ChartScene::TypeInfo(ITypeInfo** info) {
  if (!typeInfo_) {
    ComPtr<ITypeLib> library;
    HRESULT hr = LoadTypeLibEx(SceneModule::FilePath().c_str(), REGKIND_NONE, &library);
    if (SUCCEEDED(hr)) hr = library->GetTypeInfoOfGuid(IID_IChartScene, &typeInfo_);
    if (FAILED(hr)) return hr;
  }
  *info = typeInfo_.Get();
  (*info)->AddRef();
  return S_OK;
}

HRESULT ChartScene::Fail(HRESULT hr, const std::wstring& description) {
  ComPtr<ICreateErrorInfo> create;
  if (SUCCEEDED(CreateErrorInfo(&create))) {
    create->SetGUID(IID_IChartScene);
    create->SetSource(const_cast<LPOLESTR>(L"ChartScene"));
    create->SetDescription(const_cast<LPOLESTR>(description.c_str()));
    ComPtr<IErrorInfo> info;
    if (SUCCEEDED(create.As(&info))) SetErrorInfo(0, info.Get());
  }
  return hr;
}

template <typename List>
std::size_t ChartScene::Named(const List& list, BSTR name, const wchar_t* what) {
  const std::string wanted = Utf8(name);
  for (std::size_t i = 0; i < list.size(); ++i) {
    if (list[i].name == wanted) return i;
  }
  Fail(E_INVALIDARG, std::wstring(L"no ") + what + L" named " + WideFromUtf8(wanted));
  return SIZE_MAX;
}

STDMETHODIMP ChartScene::GetTypeInfoCount(UINT* count) {
  if (count == nullptr) return E_POINTER;
  *count = 1;
  return S_OK;
}

STDMETHODIMP ChartScene::GetTypeInfo(UINT index, LCID, ITypeInfo** info) {
  if (info == nullptr) return E_POINTER;
  *info = nullptr;
  if (index != 0) return DISP_E_BADINDEX;
  return TypeInfo(info);
}

STDMETHODIMP ChartScene::GetIDsOfNames(REFIID iid, LPOLESTR* names, UINT count, LCID, DISPID* ids) {
  if (!IsEqualIID(iid, IID_NULL)) return DISP_E_UNKNOWNINTERFACE;
  ComPtr<ITypeInfo> info;
  const HRESULT hr = TypeInfo(&info);
  return FAILED(hr) ? hr : DispGetIDsOfNames(info.Get(), names, count, ids);
}

STDMETHODIMP ChartScene::Invoke(DISPID id, REFIID iid, LCID, WORD flags, DISPPARAMS* params, VARIANT* result,
                                EXCEPINFO* exception, UINT* argumentError) {
  if (!IsEqualIID(iid, IID_NULL)) return DISP_E_UNKNOWNINTERFACE;
  ComPtr<ITypeInfo> info;
  const HRESULT hr = TypeInfo(&info);
  if (FAILED(hr)) return hr;
  return info->Invoke(static_cast<IChartScene*>(this), id, flags, params, result, exception, argumentError);
}

STDMETHODIMP ChartScene::InterfaceSupportsErrorInfo(REFIID iid) {
  return IsEqualIID(iid, IID_IChartScene) ? S_OK : S_FALSE;
}

STDMETHODIMP ChartScene::Load(BSTR path) {
  if (path == nullptr || SysStringLen(path) == 0) return Fail(E_INVALIDARG, L"no scene file named");
  const std::wstring file(path, SysStringLen(path));
  std::string content;
  if (!ReadWholeFile(file, content)) {
    lastError_ = L"cannot read " + file;
    return Fail(HRESULT_FROM_WIN32(ERROR_FILE_NOT_FOUND), lastError_);
  }
  std::string error;
  const S57Catalogue* catalogue = BaseCatalogue(error);
  if (catalogue == nullptr) {
    lastError_ = WideFromUtf8(error);
    return Fail(E_FAIL, lastError_);
  }
  const std::size_t slash = file.find_last_of(L"\\/");
  const std::string folder = slash == std::wstring::npos ? std::string() : AnsiPath(file.substr(0, slash));
  SceneModel model;
  SceneError refusal;
  if (!LoadScene(content, folder, *catalogue, model, refusal)) {
    lastError_ = WideFromUtf8(refusal.Text());
    return Fail(E_INVALIDARG, lastError_);
  }
  owners_.clear();
  scene_ = std::make_shared<SceneState>(std::move(model));
  lastError_.clear();
  return S_OK;
}

STDMETHODIMP ChartScene::get_LastError(BSTR* text) {
  if (text == nullptr) return E_POINTER;
  return Answer(lastError_, text);
}

STDMETHODIMP ChartScene::Database(BSTR name, IUnknown** database) {
  if (database == nullptr) return E_POINTER;
  *database = nullptr;
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  const std::size_t found = Named(scene_->Model().databases, name, L"database");
  if (found == SIZE_MAX) return E_INVALIDARG;
  *database = NewDatabase(scene_, found);
  return S_OK;
}

STDMETHODIMP ChartScene::DataSet(BSTR id, IUnknown** dataSet) {
  if (dataSet == nullptr) return E_POINTER;
  *dataSet = nullptr;
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  std::string wanted = Utf8(id);
  if (wanted.size() < 8) wanted += std::string(8 - wanted.size(), '.');
  const auto& dataSets = scene_->Model().dataSets;
  for (std::size_t i = 0; i < dataSets.size(); ++i) {
    if (dataSets[i].id == wanted) {
      *dataSet = NewDataSet(scene_, i);
      return S_OK;
    }
  }
  return Fail(E_INVALIDARG, L"no dataset " + WideFromUtf8(Utf8(id)));
}

STDMETHODIMP ChartScene::Object(BSTR name, IUnknown** object) {
  if (object == nullptr) return E_POINTER;
  *object = nullptr;
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  const std::size_t found = Named(scene_->Model().objects, name, L"object");
  if (found == SIZE_MAX) return E_INVALIDARG;
  *object = NewObject(scene_, found);
  return S_OK;
}

STDMETHODIMP ChartScene::Projection(BSTR name, IUnknown** projection) {
  if (projection == nullptr) return E_POINTER;
  *projection = nullptr;
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  const std::size_t found = Named(scene_->Model().projections, name, L"projection");
  if (found == SIZE_MAX) return E_INVALIDARG;
  *projection = NewProjection(scene_, found);
  return S_OK;
}

STDMETHODIMP ChartScene::PresParams(BSTR name, IUnknown** params) {
  if (params == nullptr) return E_POINTER;
  *params = nullptr;
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  const std::size_t found = Named(scene_->Model().presParams, name, L"presentation parameter set");
  if (found == SIZE_MAX) return E_INVALIDARG;
  *params = NewPresParams(scene_, found);
  return S_OK;
}

STDMETHODIMP ChartScene::ColorMap(BSTR name, IUnknown** map) {
  if (map == nullptr) return E_POINTER;
  *map = nullptr;
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  const std::size_t found = Named(scene_->Model().colorMaps, name, L"colour map");
  if (found == SIZE_MAX) return E_INVALIDARG;
  *map = NewColorMap(scene_, found);
  return S_OK;
}

STDMETHODIMP ChartScene::Palette(BSTR name, long* handle) {
  if (handle == nullptr) return E_POINTER;
  *handle = 0;
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  const std::size_t found = Named(scene_->Model().palettes, name, L"palette");
  if (found == SIZE_MAX) return E_INVALIDARG;
  const HPALETTE palette = scene_->Palette(found);
  if (palette == nullptr) return Fail(E_OUTOFMEMORY, L"the palette cannot be made");
  *handle = HandleToLong(palette);
  return S_OK;
}

STDMETHODIMP ChartScene::ObjectRecords(BSTR names, VARIANT* records) {
  if (records == nullptr) return E_POINTER;
  VariantInit(records);
  if (!scene_) return Fail(E_ACCESSDENIED, L"no scene is loaded");
  const SceneModel& model = scene_->Model();
  std::vector<GEO_OBJECT_RECORD> made;
  const std::string all = Utf8(names);
  std::size_t start = 0;
  while (start <= all.size()) {
    std::size_t end = all.find(',', start);
    if (end == std::string::npos) end = all.size();
    std::string name = all.substr(start, end - start);
    start = end + 1;
    while (!name.empty() && name.front() == ' ') name.erase(0, 1);
    while (!name.empty() && name.back() == ' ') name.pop_back();
    if (name.empty()) continue;
    GEO_OBJECT_RECORD record{};
    if (name.compare(0, 8, "dataset:") == 0) {
      std::string id = name.substr(8);
      if (id.size() < 8) id += std::string(8 - id.size(), '.');
      std::size_t found = SIZE_MAX;
      for (std::size_t i = 0; i < model.dataSets.size(); ++i) {
        if (model.dataSets[i].id == id) found = i;
      }
      if (found == SIZE_MAX) return Fail(E_INVALIDARG, L"no dataset " + WideFromUtf8(name.substr(8)));
      ComPtr<IUnknown> owner;
      *owner.GetAddressOf() = NewDataSet(scene_, found);
      record.Owner = owner.Get();
      record.Id = GuidOf(DataSetIdentity(model, found));
      owners_.push_back(owner);
    } else {
      std::size_t found = SIZE_MAX;
      for (std::size_t i = 0; i < model.objects.size(); ++i) {
        if (model.objects[i].name == name) found = i;
      }
      if (found == SIZE_MAX) return Fail(E_INVALIDARG, L"no object named " + WideFromUtf8(name));
      ComPtr<IUnknown> owner;
      *owner.GetAddressOf() = NewDatabase(scene_, model.dataSets[model.objects[found].dataSet].database);
      record.Owner = owner.Get();
      record.Id = GuidOf(ObjectIdentity(model, found));
      owners_.push_back(owner);
    }
    made.push_back(record);
  }
  SAFEARRAY* array = SafeArrayCreateVector(VT_UI1, 0, static_cast<ULONG>(made.size() * sizeof(GEO_OBJECT_RECORD)));
  if (array == nullptr) return E_OUTOFMEMORY;
  void* data = nullptr;
  if (SUCCEEDED(SafeArrayAccessData(array, &data))) {
    if (!made.empty()) std::memcpy(data, made.data(), made.size() * sizeof(GEO_OBJECT_RECORD));
    SafeArrayUnaccessData(array);
  }
  records->vt = VT_ARRAY | VT_UI1;
  records->parray = array;
  return S_OK;
}

STDMETHODIMP ChartScene::Counter(BSTR name, long* value) {
  if (value == nullptr) return E_POINTER;
  *value = CounterValue(Utf8(name));
  return S_OK;
}

STDMETHODIMP ChartScene::SetFault(BSTR operation, long result) {
  br::chartscene::SetFault(Utf8(operation), static_cast<std::uint32_t>(result));
  return S_OK;
}

STDMETHODIMP ChartScene::ClearFaults() {
  br::chartscene::ClearFaults();
  return S_OK;
}

STDMETHODIMP ChartScene::HeaderText(IUnknown* dataSet, BSTR* text) {
  if (text == nullptr) return E_POINTER;
  *text = nullptr;
  ComPtr<IGeoDataSet> face;
  if (dataSet == nullptr || FAILED(dataSet->QueryInterface(IID_IGeoDataSet, reinterpret_cast<void**>(face.GetAddressOf())))) {
    return Fail(E_INVALIDARG, L"not a vector dataset");
  }
  SAFEARRAY* array = nullptr;
  HRESULT hr = face->GetHeader(&array);
  if (FAILED(hr)) {
    if (array) SafeArrayDestroy(array);
    return Fail(hr, L"GetHeader failed");
  }
  std::vector<unsigned char> bytes;
  void* data = nullptr;
  if (array && SafeArrayGetDim(array) == 1 && SafeArrayGetElemsize(array) == 1 &&
      SUCCEEDED(SafeArrayAccessData(array, &data))) {
    bytes.assign(static_cast<unsigned char*>(data), static_cast<unsigned char*>(data) + array->rgsabound[0].cElements);
    SafeArrayUnaccessData(array);
  }
  if (array) SafeArrayDestroy(array);
  const br::geo::DataSetHeader header = br::geo::ParseDataSetHeader(bytes.data(), bytes.size());
  std::wstring lines;
  lines += L"file name: " + WideFromCp1252(header.fileName.value_or("")) + L"\n";
  lines += L"edition: " + Field(header.edition) + L"\n";
  lines += L"update: " + Field(header.update) + L"\n";
  lines += L"update date: " + DateText(header.updateDate.value_or(0)) + L"\n";
  lines += L"issue date: " + DateText(header.issueDate.value_or(0)) + L"\n";
  lines += L"scale: " + Field(header.scale) + L"\n";
  lines += L"level: " + Field(header.level) + L"\n";
  lines += L"producing agency: " + Field(header.agency) + L"\n";
  lines += L"source agency: " + Field(header.sourceAgency) + L"\n";
  lines += L"source id: " + WideFromCp1252(header.sourceId.value_or("")) + L"\n";
  lines += L"status: " + Field(header.status) + L"\n";
  lines += L"usage: " + Field(header.usage) + L"\n";
  return Answer(lines, text);
}

STDMETHODIMP ChartScene::AttributeText(IUnknown* object, BSTR* text) {
  if (text == nullptr) return E_POINTER;
  *text = nullptr;
  ComPtr<IGeoObject> face;
  if (object == nullptr || FAILED(object->QueryInterface(IID_IGeoObject, reinterpret_cast<void**>(face.GetAddressOf())))) {
    return Fail(E_INVALIDARG, L"not an object");
  }
  ComPtr<IGeoCatalog> catalogue;
  *catalogue.GetAddressOf() = CatalogueOfObject(face.Get());
  ComPtr<IGeoObjectEnum> attributes;
  HRESULT hr = face->GetAttributes(&attributes);
  if (FAILED(hr)) return Fail(hr, L"GetAttributes failed");
  std::wstring lines;
  for (int guard = 0; guard < 100000; ++guard) {
    IUnknown* item = nullptr;
    ULONG fetched = 0;
    if (attributes->Next(1, &item, &fetched) != S_OK || fetched == 0 || item == nullptr) {
      if (item) item->Release();
      break;
    }
    ComPtr<IGeoAttribute> attribute;
    long code = 0;
    VARIANT value;
    VariantInit(&value);
    if (SUCCEEDED(item->QueryInterface(IID_IGeoAttribute, reinterpret_cast<void**>(attribute.GetAddressOf()))) &&
        SUCCEEDED(attribute->GetCode(&code)) && SUCCEEDED(attribute->GetValue(&value))) {
      std::wstring name = AttributeNameText(catalogue.Get(), code);
      lines += (name.empty() ? std::to_wstring(code) : name) + L" (" + std::to_wstring(code) + L") = " +
               ValueText(catalogue.Get(), code, value, L", ", L"(no value)") + L"\n";
    }
    VariantClear(&value);
    item->Release();
  }
  return Answer(lines, text);
}

STDMETHODIMP ChartScene::FormatterOption(long id, BSTR* text) {
  if (text == nullptr) return E_POINTER;
  return Answer(WideFromUtf8(br::chartscene::FormatterOption(id)), text);
}

STDMETHODIMP ChartScene::ObjectId(IUnknown* object, BSTR* guid) {
  if (guid == nullptr) return E_POINTER;
  *guid = nullptr;
  ComPtr<IGeoObject> face;
  GUID id{};
  if (object == nullptr || FAILED(object->QueryInterface(IID_IGeoObject, reinterpret_cast<void**>(face.GetAddressOf()))) ||
      FAILED(face->GetId(&id))) {
    return Fail(E_INVALIDARG, L"not an object");
  }
  return Answer(GuidText(id), guid);
}

}  // namespace br::chartscene

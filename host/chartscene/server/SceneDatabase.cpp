#include "host/chartscene/server/SceneDatabase.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include <cstring>

#include "host/chartscene/server/scene_text.h"
#include "host/chartscene/server/scene_variants.h"

namespace br::chartscene {

GUID GuidOf(const std::array<unsigned char, 16>& bytes) {
  GUID guid;
  std::memcpy(&guid, bytes.data(), sizeof(guid));
  return guid;
}

const unsigned char* BytesOf(REFGUID guid) { return reinterpret_cast<const unsigned char*>(&guid); }

HRESULT CopyCatalogueText(const std::string& text, long size, char* buffer) {
  if (buffer == nullptr || size <= 0) return E_INVALIDARG;
  const std::size_t room = static_cast<std::size_t>(size) - 1;
  const std::size_t copied = text.size() < room ? text.size() : room;
  std::memcpy(buffer, text.data(), copied);
  buffer[copied] = '\0';
  return copied == text.size() ? S_OK : S_FALSE;
}

SceneDatabase::SceneDatabase(SceneRef scene, std::size_t index)
    : ComObject<IGeoDatabase, IGeoCatalog>("Database"), scene_(std::move(scene)), index_(index) {}

IGeoDatabase* NewDatabase(const SceneRef& scene, std::size_t database) {
  return new SceneDatabase(scene, database);
}

std::size_t SceneDatabase::OwnDataSet(REFGUID id) const {
  const std::size_t dataSet = FindDataSet(scene_->Model(), BytesOf(id));
  if (dataSet == SIZE_MAX || scene_->Model().dataSets[dataSet].database != index_) return SIZE_MAX;
  return dataSet;
}

STDMETHODIMP SceneDatabase::GetKindId(GUID* kind) {
  SCENE_CALL("IGeoDatabase.GetKindId");
  if (kind == nullptr) return E_POINTER;
  *kind = GuidOf(scene_->Model().databases[index_].kindId);
  return S_OK;
}

STDMETHODIMP SceneDatabase::GetDataSetById(REFGUID id, IGeoDataSet** dataSet) {
  if (dataSet == nullptr) return E_POINTER;
  *dataSet = nullptr;
  SCENE_CALL("IGeoDatabase.GetDataSetById");
  const std::size_t found = OwnDataSet(id);
  if (found == SIZE_MAX) return E_INVALIDARG;
  IUnknown* wrapper = NewDataSet(scene_, found);
  const HRESULT hr = wrapper->QueryInterface(IID_IGeoDataSet, reinterpret_cast<void**>(dataSet));
  wrapper->Release();
  return hr;
}

STDMETHODIMP SceneDatabase::GetDataSetHeader(REFGUID id, SAFEARRAY** header) {
  if (header == nullptr) return E_POINTER;
  *header = nullptr;
  SCENE_CALL("IGeoDatabase.GetDataSetHeader");
  const std::size_t found = OwnDataSet(id);
  if (found == SIZE_MAX) return E_INVALIDARG;
  *header = ByteArray(scene_->Model().dataSets[found].header);
  return *header ? S_OK : E_OUTOFMEMORY;
}

STDMETHODIMP SceneDatabase::GetGeoObject(REFGUID id, IGeoObject** object) {
  if (object == nullptr) return E_POINTER;
  *object = nullptr;
  SCENE_CALL("IGeoDatabase.GetGeoObject");
  if (OwnDataSet(id) == SIZE_MAX) return E_INVALIDARG;
  const std::size_t found = FindObject(scene_->Model(), BytesOf(id));
  if (found == SIZE_MAX) return S_FALSE;  // the dataset itself, or no such object
  *object = NewObject(scene_, found);
  return S_OK;
}

STDMETHODIMP SceneDatabase::CreateSelection(long count, const GEO_SELECTION_RECORD* records, long* selection) {
  if (selection == nullptr) return E_POINTER;
  *selection = 0;
  SCENE_CALL("IGeoDatabase.CreateSelection");
  SCENE_MISANSWER_NULL("IGeoDatabase.CreateSelection");
  if (count < 0 || (count > 0 && records == nullptr)) return E_INVALIDARG;
  std::vector<long> classes;
  for (long i = 0; i < count; ++i) classes.push_back(records[i].ClassCode);
  *selection = scene_->CreateSelection(std::move(classes));
  return S_OK;
}

STDMETHODIMP SceneDatabase::ReleaseSelection(long selection) {
  SCENE_CALL("IGeoDatabase.ReleaseSelection");
  return scene_->ReleaseSelection(selection) ? S_OK : E_INVALIDARG;
}

STDMETHODIMP SceneDatabase::GetName(BSTR* name) {
  if (name == nullptr) return E_POINTER;
  *name = nullptr;
  SCENE_CALL("IGeoDatabase.GetName");
  *name = BstrFromUtf8(scene_->Model().databases[index_].name);
  return *name ? S_OK : E_OUTOFMEMORY;
}

STDMETHODIMP SceneDatabase::GetClassFlags(long classCode, long* flags) {
  if (flags == nullptr) return E_POINTER;
  *flags = 0;
  SCENE_CALL("IGeoCatalog.GetClassFlags");
  const CatalogueClass* found = scene_->Model().catalogue.ClassByCode(classCode);
  if (found == nullptr) return E_INVALIDARG;
  *flags = static_cast<long>(found->flags);
  return S_OK;
}

STDMETHODIMP SceneDatabase::GetClassNameLength(long classCode, long* length) {
  if (length == nullptr) return E_POINTER;
  *length = 0;
  SCENE_CALL("IGeoCatalog.GetClassNameLength");
  const CatalogueClass* found = scene_->Model().catalogue.ClassByCode(classCode);
  if (found == nullptr) return E_INVALIDARG;
  *length = static_cast<long>(found->name.size());
  return S_OK;
}

STDMETHODIMP SceneDatabase::GetClassNameText(long classCode, long size, char* buffer) {
  SCENE_CALL("IGeoCatalog.GetClassNameText");
  const CatalogueClass* found = scene_->Model().catalogue.ClassByCode(classCode);
  if (found == nullptr) return E_INVALIDARG;
  return CopyCatalogueText(found->name, size, buffer);
}

STDMETHODIMP SceneDatabase::GetAttributeCode(const char* acronym, long* code) {
  if (code == nullptr) return E_POINTER;
  *code = 0;
  SCENE_CALL("IGeoCatalog.GetAttributeCode");
  SCENE_MISANSWER_NULL("IGeoCatalog.GetAttributeCode");
  if (acronym == nullptr) return E_INVALIDARG;
  const CatalogueAttribute* found = scene_->Model().catalogue.AttributeByAcronym(acronym);
  if (found == nullptr) return E_INVALIDARG;
  *code = found->code;
  return S_OK;
}

STDMETHODIMP SceneDatabase::GetAttributeFlags(long code, long* flags) {
  if (flags == nullptr) return E_POINTER;
  *flags = 0;
  SCENE_CALL("IGeoCatalog.GetAttributeFlags");
  const CatalogueAttribute* found = scene_->Model().catalogue.AttributeByCode(code);
  if (found == nullptr) return E_INVALIDARG;
  *flags = static_cast<long>(found->flags);
  return S_OK;
}

STDMETHODIMP SceneDatabase::GetAttributeNameLength(long code, long* length) {
  if (length == nullptr) return E_POINTER;
  *length = 0;
  SCENE_CALL("IGeoCatalog.GetAttributeNameLength");
  const CatalogueAttribute* found = scene_->Model().catalogue.AttributeByCode(code);
  if (found == nullptr) return E_INVALIDARG;
  *length = static_cast<long>(found->name.size());
  return S_OK;
}

STDMETHODIMP SceneDatabase::GetAttributeNameText(long code, long size, char* buffer) {
  SCENE_CALL("IGeoCatalog.GetAttributeNameText");
  const CatalogueAttribute* found = scene_->Model().catalogue.AttributeByCode(code);
  if (found == nullptr) return E_INVALIDARG;
  return CopyCatalogueText(found->name, size, buffer);
}

STDMETHODIMP SceneDatabase::GetEnumTextLength(long code, ULONG value, long* length) {
  if (length == nullptr) return E_POINTER;
  *length = 0;
  SCENE_CALL("IGeoCatalog.GetEnumTextLength");
  SCENE_MISANSWER_NULL("IGeoCatalog.GetEnumTextLength");
  if (Misanswers("IGeoCatalog.GetEnumTextLength", Misanswer::HugeText)) {
    *length = static_cast<long>(kHugeTextLength);
    return S_OK;
  }
  const std::string* text = scene_->Model().catalogue.EnumText(code, static_cast<long>(value));
  if (text == nullptr) return E_INVALIDARG;
  *length = static_cast<long>(text->size());
  return S_OK;
}

STDMETHODIMP SceneDatabase::GetEnumText(long code, ULONG value, long size, char* buffer) {
  SCENE_CALL("IGeoCatalog.GetEnumText");
  if (Misanswers("IGeoCatalog.GetEnumText", Misanswer::HugeText)) {
    return CopyCatalogueText(std::string(kHugeTextLength, 'x'), size, buffer);
  }
  const std::string* text = scene_->Model().catalogue.EnumText(code, static_cast<long>(value));
  if (text == nullptr) return E_INVALIDARG;
  return CopyCatalogueText(*text, size, buffer);
}

}  // namespace br::chartscene

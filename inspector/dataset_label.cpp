#include "inspector/dataset_label.h"

#include "frame/com/ComRef.h"
#include "frame/com/bstr_text.h"
#include "frame/geo/header_reader.h"
#include "frame/settings/localised_texts.h"
#include "inspector/object_access.h"
#include "inspector/rules/guid_text.h"

namespace br::inspector {

namespace {

constexpr const char* kSection = "ObjInspector";

std::wstring Text(long id, const char* defaultText) { return br::com::WideFromAnsi(br::GetText(kSection, id, defaultText)); }

std::wstring NameOf(IGeoDatabase* database) {
  br::com::BstrHolder name;
  if (!database || FAILED(database->GetName(name.Out())) || !name.Get()) return L"";
  return std::wstring(name.Get(), SysStringLen(name.Get()));
}

std::wstring Widen(const std::string& text) { return br::com::WideFromAnsi(text); }

}  // namespace

std::wstring DataSetLabel(IUnknown* owner, const GUID& id) {
  const IdBytes bytes = BytesOf(id);
  const std::string idName = DataSetNameOf(bytes);
  if (IsRasterEntry(owner)) return L"Raster chart " + Widen(idName);

  ComRef<IGeoLibraryDataSet> library;
  if (owner && SUCCEEDED(owner->QueryInterface(IID_IGeoLibraryDataSet, library.OutVoid())) && library) {
    std::string name;
    ComRef<IGeoDataSet> dataSet;
    ComRef<IGeoDatabase> database;
    if (SUCCEEDED(library->GetDataSet(dataSet.Out())) && dataSet) {
      br::geo::DataSetHeader header;
      if (SUCCEEDED(br::geo::ReadDataSetHeader(dataSet.Get(), header)) && header.fileName) name = *header.fileName;
      if (FAILED(dataSet->GetDatabase(database.Out()))) database.Reset();
    }
    return Text(53, "Library") + L" " + Widen(name) + L"   " + NameOf(database.Get());
  }

  const ComRef<IGeoDatabase> database = DatabaseOf(owner);
  const std::wstring tail = L"   " + NameOf(database.Get());
  if (idName == "1") return Text(54, "Mariner Objects") + tail;
  std::string fileName = idName;
  br::geo::DataSetHeader header;
  if (database && SUCCEEDED(br::geo::ReadDataSetHeader(database.Get(), id, header)) && header.fileName)
    fileName = std::string(StemOf(*header.fileName));
  return Text(51, "DataSet") + L" " + Widen(fileName) + tail;
}

}  // namespace br::inspector

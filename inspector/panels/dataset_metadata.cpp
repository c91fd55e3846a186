#include "inspector/panels/dataset_metadata.h"

#include <cstdint>
#include <limits>

#include <wrl/client.h>

#include "frame/format/date_time_format.h"
#include "frame/geo/GeodesyLibrary.h"
#include "frame/geo/ParameterList.h"
#include "frame/geo/catalogue_texts.h"
#include "frame/geo/header_reader.h"
#include "frame/geo/raster_chart_codes.h"
#include "frame/settings/localised_texts.h"
#include "inspector/format/raster_chart_rows.h"
#include "inspector/panels/geo_object_rules.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

namespace {

constexpr long kPropertyEmbeddedUpdate = 2;

constexpr std::size_t kMaxRasterRecordBytes = 1u << 16;

struct Target {
  ComPtr<IGeoDataSet> dataSet;
  ComPtr<IGeoRasterDataSet> raster;
  bool library = false;
};

bool IsDataSetIdentity(REFGUID id) {
  const auto* bytes = reinterpret_cast<const unsigned char*>(&id);
  for (int i = 0; i < 8; ++i) {
    if (bytes[i] != 0) return false;
  }
  return true;
}

// The dataset the owner and identity stand for.
HRESULT FindDataSet(IUnknown* owner, REFGUID id, Target& target) {
  ComPtr<IUnknown> unknown(owner);
  if (SUCCEEDED(unknown.As(&target.raster)) && target.raster) return S_OK;
  ComPtr<IGeoLibraryDataSet> library;
  if (SUCCEEDED(unknown.As(&library))) {
    target.library = true;
    if (FAILED(library->GetDataSet(&target.dataSet)) || !target.dataSet) return E_FAIL;
    return S_OK;
  }
  if (SUCCEEDED(unknown.As(&target.dataSet)) && target.dataSet) return S_OK;
  ComPtr<IGeoDatabase> database;
  if (FAILED(unknown.As(&database))) return E_FAIL;
  if (!IsDataSetIdentity(id)) {
    ComPtr<IGeoObject> object;
    if (database->GetGeoObject(id, &object) == S_OK && object && SUCCEEDED(object->GetDataSet(&target.dataSet)) &&
        target.dataSet) {
      return S_OK;
    }
    target.dataSet.Reset();
  }
  if (FAILED(database->GetDataSetById(id, &target.dataSet)) || !target.dataSet) return E_FAIL;
  return S_OK;
}

std::vector<ParameterValue> ValuesOf(const geo::ParameterList& list) {
  std::vector<ParameterValue> values(list.Size());
  for (std::size_t i = 0; i < list.Size(); ++i) {
    const VARIANT& v = *list.At(i);
    ParameterValue& value = values[i];
    value.kind = ParameterValue::kInteger;
    switch (v.vt) {
      case VT_BSTR:
        value.kind = ParameterValue::kText;
        value.text = AnsiText(v.bstrVal);
        break;
      case VT_DATE:
        value.kind = ParameterValue::kDate;
        value.date = v.date;
        break;
      case VT_I1: value.integer = v.cVal; break;
      case VT_I2: value.integer = v.iVal; break;
      case VT_I4: value.integer = v.lVal; break;
      case VT_INT: value.integer = v.intVal; break;
      case VT_I8: value.integer = v.llVal; break;
      case VT_UI1: value.integer = v.bVal; break;
      case VT_UI2: value.integer = v.uiVal; break;
      case VT_UI4: value.integer = v.ulVal; break;
      case VT_UINT: value.integer = v.uintVal; break;
      case VT_UI8:
        if (v.ullVal > static_cast<ULONGLONG>(std::numeric_limits<std::int64_t>::max())) {
          value.kind = ParameterValue::kNone;
        } else {
          value.integer = static_cast<std::int64_t>(v.ullVal);
        }
        break;
      default:
        value.kind = ParameterValue::kNone;  // other types give no row
        break;
    }
  }
  return values;
}

MetadataSources SourcesFor(IGeoDataSet* dataSet, const geo::AgencyTable* agencies) {
  MetadataSources sources;
  sources.text = [](long id, const char* defaultText) { return GetText("ObjInspector", id, defaultText); };
  sources.date = [](double date) { return FormatDate(date, DATE_PATTERN); };
  sources.agency = [agencies](long code) {
    const geo::AgencyRow* row = agencies ? agencies->Find(static_cast<std::int32_t>(code)) : nullptr;
    return row ? row->name : std::string();
  };
  ComPtr<IGeoCatalog> catalogue = CatalogueOf(dataSet);
  sources.catalogue = [catalogue](const char* acronym, long value) -> std::optional<std::string> {
    if (!catalogue) return std::nullopt;
    const std::optional<long> code = geo::FindAttributeCode(catalogue.Get(), acronym);
    std::string text;
    if (!code || !geo::ReadEnumText(catalogue.Get(), *code, static_cast<ULONG>(value), text)) return std::nullopt;
    return text;
  };
  sources.degrees = [](long normalised) { return geo::GeodesyLibrary::Shared().Degrees(normalised); };
  return sources;
}

std::optional<std::uint16_t> EmbeddedUpdate(IGeoDataSet* dataSet) {
  VARIANT value;
  VariantInit(&value);
  std::optional<std::uint16_t> update;
  if (SUCCEEDED(dataSet->GetDataSetProperty(kPropertyEmbeddedUpdate, &value))) {
    VARIANT converted;
    VariantInit(&converted);
    if (SUCCEEDED(VariantChangeType(&converted, &value, 0, VT_UI2))) update = converted.uiVal;
    VariantClear(&converted);
  }
  VariantClear(&value);
  return update;
}

HRESULT LibraryMetadata(IGeoDataSet* dataSet, const geo::AgencyTable* agencies, std::vector<MetadataRow>& rows) {
  geo::ParameterList parameters;
  if (FAILED(parameters.Read(dataSet))) return E_FAIL;
  rows = LibraryRows(ValuesOf(parameters), SourcesFor(dataSet, agencies));
  return S_OK;
}

// The bytes of a record handed back in a VARIANT: an array of bytes, directly or by
// reference; anything else, or a failing call, gives none.
bool RecordBytes(HRESULT answer, VARIANT& record, std::vector<unsigned char>& bytes) {
  bool read = false;
  if (SUCCEEDED(answer)) {
    if (record.vt == (VT_ARRAY | VT_UI1)) {
      read = geo::ReadByteArray(record.parray, kMaxRasterRecordBytes, bytes);
    } else if (record.vt == (VT_BYREF | VT_ARRAY | VT_UI1) && record.pparray != nullptr) {
      read = geo::ReadByteArray(*record.pparray, kMaxRasterRecordBytes, bytes);
    }
  }
  VariantClear(&record);
  return read;
}

HRESULT RasterMetadata(IGeoRasterDataSet* raster, const geo::AgencyTable* agencies, std::vector<MetadataRow>& rows) {
  VARIANT record;
  VariantInit(&record);
  std::vector<unsigned char> header;
  if (!RecordBytes(raster->GetChartHeader(0, &record), record, header)) return E_FAIL;
  VariantInit(&record);
  std::vector<unsigned char> issue;
  std::optional<double> issueDate;
  if (RecordBytes(raster->GetChartIssueRecord(&record), record, issue)) {
    issueDate = ParseRasterIssueDate(issue.data(), issue.size());
  }
  const RasterChart chart = ParseRasterChart(header.data(), header.size());
  static const std::vector<geo::AgencyRow> kNoAgencies;
  const std::string producer =
      chart.producer ? geo::RasterAgencyText(agencies ? agencies->Rows() : kNoAgencies, *chart.producer,
                                             geo::AgencyCodeVariant::Agency)
                     : std::string();
  rows = RasterChartRows(chart, issueDate, producer, SourcesFor(nullptr, agencies));
  return S_OK;
}

}  // namespace

HRESULT ReadDataSetMetadata(IUnknown* owner, REFGUID id, const geo::AgencyTable* agencies,
                            std::vector<MetadataRow>& rows) {
  rows.clear();
  if (owner == nullptr) return E_INVALIDARG;
  Target target;
  const HRESULT found = FindDataSet(owner, id, target);
  if (FAILED(found)) return found;
  if (target.raster) return RasterMetadata(target.raster.Get(), agencies, rows);
  if (target.library) return LibraryMetadata(target.dataSet.Get(), agencies, rows);

  geo::ParameterList parameters;
  if (FAILED(parameters.Read(target.dataSet.Get()))) return E_FAIL;
  geo::DataSetHeader header;
  geo::ReadDataSetHeader(target.dataSet.Get(), header);  // a missing record leaves its rows out
  rows = ChartDataSetRows(ValuesOf(parameters), header, EmbeddedUpdate(target.dataSet.Get()),
                          SourcesFor(target.dataSet.Get(), agencies));
  return S_OK;
}

HRESULT FormatDataSetMetadata(IUnknown* owner, REFGUID id, const geo::AgencyTable* agencies, std::string& text) {
  text.clear();
  if (owner == nullptr) return E_INVALIDARG;
  Target target;
  const HRESULT found = FindDataSet(owner, id, target);
  if (FAILED(found)) return found;
  if (target.raster) return E_NOTIMPL;  // the text form is a vector dataset's
  std::vector<MetadataRow> rows;
  if (target.library) {
    if (FAILED(LibraryMetadata(target.dataSet.Get(), agencies, rows))) return E_FAIL;
  } else {
    geo::DataSetHeader header;
    if (FAILED(geo::ReadDataSetHeader(target.dataSet.Get(), header))) return E_FAIL;
    rows = ChartDataSetTextRows(header, EmbeddedUpdate(target.dataSet.Get()),
                                SourcesFor(target.dataSet.Get(), agencies));
  }
  text = MetadataText(rows);
  return S_OK;
}

}  // namespace br::inspector

#include "legend/XChartLegend.h"

#include "frame/com/ComRef.h"
#include "frame/com/bstr_text.h"
#include "frame/errors/guarded_operation.h"
#include "frame/geo/GeodesyLibrary.h"
#include "frame/geo/ParameterList.h"
#include "frame/geo/catalogue_texts.h"
#include "frame/geo/geo_enumeration.h"
#include "frame/geo/header_reader.h"
#include "frame/geo/raster_chart_codes.h"
#include "frame/settings/localised_texts.h"

#include <cfloat>
#include <cmath>
#include <optional>

namespace br::legend {

using br::com::ComRef;

const br::com::ClassIdentity XChartLegend::kClass = {&CLSID_XChartLegend, &IID_IXChartLegend,
                                                     &DIID__IXChartLegendEvents, L"XChartLegend"};

const XChartLegend::Entry XChartLegend::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_IXChartLegend, Self},
    {&IID_IDispatch, Self},
    {&IID_IConnectionPointContainer, ConnectionPoints},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {nullptr, nullptr},
};

namespace {

constexpr const char* kReportClass = "CXChartLegend";

// Classes of the meta objects and the attributes read from them.
constexpr long kClassMagneticVariation = 81;
constexpr long kClassDataAccuracy = 300;
constexpr long kClassDataQuality = 308;
constexpr long kClassSoundingDatum = 309;
constexpr long kClassVerticalDatum = 312;
constexpr long kAttributeZoneOfConfidence = 72;
constexpr long kAttributeReferenceYear = 130;
constexpr long kAttributeAnnualChange = 173;
constexpr long kAttributeVariation = 176;
constexpr long kAttributeVerdat = 185;
constexpr long kAttributePositionalAccuracy = 401;

// Parameter elements.
constexpr std::size_t kMinParameters = 34;
constexpr std::size_t kParameterHorizontalDatum = 23;
constexpr std::size_t kParameterVerticalDatum = 27;
constexpr std::size_t kParameterSoundingDatum = 28;

// One selection of the meta objects, released whatever happens after it was made.
class Selection {
public:
  Selection(IGeoDatabase* database, long handle) : database_(database), handle_(handle) {}
  ~Selection() { database_->ReleaseSelection(handle_); }
  Selection(const Selection&) = delete;
  Selection& operator=(const Selection&) = delete;

private:
  IGeoDatabase* database_;
  long handle_;
};

// A VARIANT cleared when it goes, also when the host failed after filling it.
struct Variant {
  VARIANT value;
  Variant() { VariantInit(&value); }
  ~Variant() { VariantClear(&value); }
  Variant(const Variant&) = delete;
  Variant& operator=(const Variant&) = delete;
};

// VariantCopy reads its source only; null past the end.
VARIANT* Element(const br::geo::ParameterList& parameters, std::size_t index) {
  return const_cast<VARIANT*>(parameters.At(index));
}

// value converted in place to type; false (value unchanged) when it does not convert.
bool ConvertTo(VARIANT& value, VARTYPE type) {
  return SUCCEEDED(VariantChangeType(&value, &value, 0, type));
}

// An object's attribute converted to type.
bool ReadAttribute(IGeoObject* object, long code, VARTYPE type, Variant& out) {
  ComRef<IGeoAttribute> attribute;
  if (object->GetAttribute(code, attribute.Out()) != S_OK || !attribute) return false;
  if (FAILED(attribute->GetValue(&out.value))) return false;
  // An empty value is a missing one: the platform would make it 0.
  if (out.value.vt == VT_EMPTY || out.value.vt == VT_NULL) return false;
  return ConvertTo(out.value, type);
}

std::optional<double> ReadDouble(IGeoObject* object, long code) {
  Variant value;
  if (!ReadAttribute(object, code, VT_R8, value) || !std::isfinite(value.value.dblVal)) return std::nullopt;
  return value.value.dblVal;
}

bool IsChartObject(IGeoObject* object) {
  ComRef<IGeoDataSet> dataSet;
  if (FAILED(object->GetDataSet(dataSet.Out())) || !dataSet) return false;
  ComRef<IGeoDatabase> database;
  if (FAILED(dataSet->GetDatabase(database.Out())) || !database) return false;
  GUID kind{};
  return SUCCEEDED(database->GetKindId(&kind)) && IsEqualGUID(kind, GEOKIND_CHART_DATABASE);
}

// The variation of one magnetic variation object; "no value" when it has none.
double ObjectVariation(IGeoObject* object) {
  long classCode = 0;
  if (FAILED(object->GetClassCode(&classCode)) || classCode != kClassMagneticVariation) return kNoValue;
  if (!IsChartObject(object)) return kNoValue;
  const std::optional<double> value = ReadDouble(object, kAttributeVariation);
  if (!value) return kNoValue;
  const std::optional<double> change = ReadDouble(object, kAttributeAnnualChange);
  std::optional<std::int32_t> year;
  if (change) {
    Variant raw;
    if (ReadAttribute(object, kAttributeReferenceYear, VT_I4, raw)) year = raw.value.lVal;
  }
  SYSTEMTIME now{};
  GetSystemTime(&now);
  return MagneticVariation(*value, change, year, now.wYear);
}

bool HitTest(const br::geo::GeodesyLibrary& geodesy, IGeoObject* object, IGeoProjection* projection,
             const PixelRect& rect) {
  HRESULT hr = E_FAIL;
  geodesy.WithMapMetrics([&](GEO_MAP_METRICS* metrics) {
    RECT pixels{rect.left, rect.top, rect.right, rect.bottom};
    hr = object->HitTest(projection, &pixels, metrics);
  });
  return hr == S_OK;
}

CalendarDate DateFromFileTime(std::uint64_t fileTime) {
  CalendarDate date;
  if (fileTime == 0) return date;  // no date stored
  FILETIME time{static_cast<DWORD>(fileTime), static_cast<DWORD>(fileTime >> 32)};
  SYSTEMTIME system{};
  if (!FileTimeToSystemTime(&time, &system)) return date;
  date.fields = {system.wYear, system.wMonth, system.wDayOfWeek, system.wDay,
                 system.wHour, system.wMinute, system.wSecond, system.wMilliseconds};
  return date;
}

CalendarDate DateFromAutomation(std::optional<double> automation) {
  SYSTEMTIME system{};
  if (!automation || !std::isfinite(*automation) || !VariantTimeToSystemTime(*automation, &system)) {
    return CalendarDate::Unconvertible();
  }
  CalendarDate date;
  date.fields = {system.wYear, system.wMonth, system.wDayOfWeek, system.wDay,
                 system.wHour, system.wMinute, system.wSecond, system.wMilliseconds};
  return date;
}

// The bytes of a VARIANT holding an array of bytes (directly or by reference).
bool BytesOf(const VARIANT& value, std::size_t maxBytes, std::vector<unsigned char>& bytes) {
  SAFEARRAY* array = nullptr;
  if (value.vt == (VT_ARRAY | VT_UI1)) {
    array = value.parray;
  } else if (value.vt == (VT_BYREF | VT_ARRAY | VT_UI1) && value.pparray) {
    array = *value.pparray;
  }
  return array && br::geo::ReadByteArray(array, maxBytes, bytes);
}

}  // namespace

struct XChartLegend::PositionLookup {
  bool active = false;
  IGeoProjection* projection = nullptr;
  IGeoCatalog* catalogue = nullptr;
  const br::geo::GeodesyLibrary* geodesy = nullptr;
  PixelRect nearRect{};
  PixelRect screen{};
  bool accuracyFound = false;
  double fallback = kNoValue;
};

XChartLegend::XChartLegend() {
  Reset();
  RegisterTextClient(this);
}

XChartLegend::~XChartLegend() { UnregisterTextClient(this); }

void XChartLegend::Reset() {
  record_ = ResetRecord({GetText("ObjInspector", 2, "Meters"), GetText("ObjInspector", 4, "Not defined"),
                         GetText("ObjInspector", 3, "MERCATOR")});
  key_.valid = false;
  parameterSoundingDatum_ = record_.soundingDatum;
  parameterVerticalDatum_ = record_.verticalDatum;
}

STDMETHODIMP XChartLegend::SetLegendData(IUnknown* dataSet, IUnknown* projection, long latitude, long longitude) {
  // A report's box runs a message loop: a host may call again from there. The running fill
  // owns the record until it ends.
  if (busy_) return S_OK;
  // The host may also release us from there; the fill keeps us alive.
  ComRef<IXChartLegend> self(this);
  busy_ = true;
  try {
    if (!dataSet || !projection) {
      Reset();
    } else {
      ErrRecord record;
      const std::int32_t result = RunGuarded(reporter_, kReportClass, BR_ERR_PLACE("SetLegendData"), record,
                                             [&] { Fill(dataSet, projection, latitude, longitude); });
      if (result != 0 && !selectionFailed_) Reset();
      // After a failed selection the values read so far stay, but the next call reads the
      // dataset again: its meta objects were never listed.
      if (selectionFailed_) key_.valid = false;
    }
  } catch (...) {
    // A text lookup of the reset itself ran out of memory: try once more, never throw out.
    try {
      Reset();
    } catch (...) {
    }
  }
  busy_ = false;
  return S_OK;
}

void XChartLegend::Fill(IUnknown* dataSet, IUnknown* projection, long latitude, long longitude) {
  selectionFailed_ = false;
  ComRef<IGeoDataSet> vector;
  ComRef<IGeoRasterDataSet> raster;
  ComRef<IGeoProjection> display;
  if (FAILED(dataSet->QueryInterface(IID_IGeoDataSet, vector.OutVoid()))) vector.Detach();
  if (FAILED(dataSet->QueryInterface(IID_IGeoRasterDataSet, raster.OutVoid()))) raster.Detach();
  if (FAILED(projection->QueryInterface(IID_IGeoProjection, display.OutVoid()))) display.Detach();
  if (vector && display) {
    FillVector(vector.Get(), display.Get(), latitude, longitude);
  } else if (raster) {
    FillRaster(raster.Get());
  } else {
    throw cErr(static_cast<std::uint32_t>(E_NOINTERFACE));
  }
}

void XChartLegend::FillVector(IGeoDataSet* dataSet, IGeoProjection* projection, long latitude, long longitude) {
  ComRef<IGeoDatabase> database;
  if (FAILED(dataSet->GetDatabase(database.Out()))) database.Detach();
  const ComRef<IGeoCatalog> catalogue = database.Query<IGeoCatalog>(IID_IGeoCatalog);

  const bool fresh = FillHeader(dataSet);
  if (fresh) FillParameters(dataSet, catalogue.Get());
  PositionLookup lookup;
  const bool located = BeginPosition(projection, catalogue.Get(), latitude, longitude, lookup);
  if (fresh) {
    try {
      ReadMetaObjects(dataSet, lookup);
    } catch (int) {
      selectionFailed_ = true;
      throw;
    }
  } else if (located) {
    for (const MetaObject& meta : metaObjects_) {
      if (!Wanted(meta.classCode, lookup)) continue;
      ComRef<IGeoObject> object;
      if (dataSet->GetObjectById(meta.id, object.Out()) != S_OK || !object) continue;
      long classCode = meta.classCode;
      if (classCode == 0 && FAILED(object->GetClassCode(&classCode))) continue;
      LookUpObject(object.Get(), classCode, lookup);
    }
  }
  if (record_.magneticVariation == kNoValue) record_.magneticVariation = lookup.fallback;
}

bool XChartLegend::FillHeader(IGeoDataSet* dataSet) {
  br::geo::DataSetHeader header;
  const HRESULT hr = br::geo::ReadDataSetHeader(dataSet, header);
  if (SUCCEEDED(hr) && header.identity && header.edition &&
      key_.Matches(*header.identity, *header.edition, header.update.value_or(0))) {
    return false;
  }
  Reset();
  metaObjects_.clear();
  if (FAILED(hr)) return true;  // no header: nothing to key on, the rest is read every time

  Variant property;
  if (SUCCEEDED(dataSet->GetDataSetProperty(2, &property.value)) && ConvertTo(property.value, VT_UI2)) {
    record_.updateNumber = property.value.uiVal;
  } else {
    record_.updateNumber = header.update.value_or(0);
  }
  record_.editionDate = DateFromFileTime(header.issueDate.value_or(0));
  record_.updateDate = DateFromFileTime(header.updateDate.value_or(0));
  record_.editionNumber = header.edition.value_or(0);
  record_.sourceIdCode = header.sourceId.value_or(std::string());
  record_.defaultScale = static_cast<std::int32_t>(header.scale.value_or(0));
  if (header.sourceAgency) {
    record_.sourceProducingAgency = br::geo::RasterAgencyText(agencies_.Rows(), *header.sourceAgency,
                                                              br::geo::AgencyCodeVariant::Agency);
  }
  if (header.identity && header.edition) {
    key_.identity = *header.identity;
    key_.edition = *header.edition;
    key_.update = header.update.value_or(0);
    key_.valid = true;
  }
  return true;
}

void XChartLegend::FillParameters(IGeoDataSet* dataSet, IGeoCatalog* catalogue) {
  br::geo::ParameterList parameters;
  if (FAILED(parameters.Read(dataSet)) || parameters.Size() < kMinParameters) return;
  if (catalogue) {
    if (const std::optional<long> verdat = br::geo::FindAttributeCode(catalogue, "VERDAT")) {
      VARIANT value;
      VariantInit(&value);
      if (SUCCEEDED(VariantCopy(&value, Element(parameters, kParameterVerticalDatum))) && ConvertTo(value, VT_UI1)) {
        br::geo::ReadEnumText(catalogue, *verdat, value.bVal, record_.verticalDatum);
      }
      VariantClear(&value);
      if (SUCCEEDED(VariantCopy(&value, Element(parameters, kParameterSoundingDatum))) && ConvertTo(value, VT_UI1)) {
        br::geo::ReadEnumText(catalogue, *verdat, value.bVal, record_.soundingDatum);
      }
      VariantClear(&value);
    }
  }
  VARIANT datum;
  VariantInit(&datum);
  if (SUCCEEDED(VariantCopy(&datum, Element(parameters, kParameterHorizontalDatum))) && ConvertTo(datum, VT_I2)) {
    record_.horizontalDatum = br::geo::GeodesyLibrary::Shared().DatumName(datum.iVal);
    if (record_.horizontalDatum.empty()) record_.horizontalDatum = GetText("ObjectInfo", 5, "Unknown Datum");
  }
  VariantClear(&datum);
  parameterSoundingDatum_ = record_.soundingDatum;
  parameterVerticalDatum_ = record_.verticalDatum;
}

void XChartLegend::ReadMetaObjects(IGeoDataSet* dataSet, PositionLookup& lookup) {
  metaObjects_.clear();
  ComRef<IGeoDatabase> database;
  BR_CHECK_HR(dataSet->GetDatabase(database.Out()));
  BR_CHECK(database);
  const GEO_SELECTION_RECORD records[] = {
      {kClassDataQuality, 78, 2, 0},  {kClassDataAccuracy, 78, 3, 0},     {kClassSoundingDatum, 78, 4, 0},
      {kClassVerticalDatum, 78, 5, 0}, {kClassMagneticVariation, 78, 5, 0},
  };
  long handle = 0;
  BR_CHECK_HR(database->CreateSelection(sizeof records / sizeof records[0], records, &handle));
  Selection selection(database.Get(), handle);
  ComRef<IGeoSelectionEnum> objects;
  BR_CHECK_HR(dataSet->GetObjectEnum(objects.Out()));
  BR_CHECK(objects);
  BR_CHECK_HR(objects->SetSelection(handle, 0));
  BR_CHECK_HR(objects->Reset());
  br::geo::ForEachObject(objects.Get(), [&](IGeoObject* object) {
    MetaObject meta{};
    if (FAILED(object->GetId(&meta.id))) return true;
    if (FAILED(object->GetClassCode(&meta.classCode))) meta.classCode = 0;
    metaObjects_.push_back(meta);
    if (lookup.active && meta.classCode != 0) LookUpObject(object, meta.classCode, lookup);
    return true;
  });
}

bool XChartLegend::BeginPosition(IGeoProjection* projection, IGeoCatalog* catalogue, long latitude, long longitude,
                                 PositionLookup& lookup) {
  // Everything the meta objects give belongs to this position only.
  record_.magneticVariation = kNoValue;
  record_.bathymetricQuality.clear();
  record_.nonBathymetricQuality = 0.0;
  record_.soundingDatum = parameterSoundingDatum_;
  record_.verticalDatum = parameterVerticalDatum_;

  const br::geo::GeodesyLibrary& geodesy = br::geo::GeodesyLibrary::Shared();
  if (!geodesy.Loaded()) return false;
  const GEO_POINT point{latitude, longitude};
  POINT pixel{};
  if (FAILED(projection->GeoToPixel(&point, &pixel, 1))) return false;  // no position, no hit tests
  lookup.projection = projection;
  lookup.catalogue = catalogue;
  lookup.geodesy = &geodesy;
  lookup.nearRect = NearRect(pixel.x, pixel.y);
  lookup.screen = ScreenRect(GetSystemMetrics(SM_CXSCREEN), GetSystemMetrics(SM_CYSCREEN));
  lookup.active = true;
  return true;
}

// Whether an object of the class can still change the record: the first object of a class
// that gives a value settles it, and later ones are not even fetched.
bool XChartLegend::Wanted(long classCode, const PositionLookup& lookup) const {
  switch (classCode) {
    case kClassMagneticVariation: return record_.magneticVariation == kNoValue;
    case kClassDataAccuracy: return !lookup.accuracyFound;
    case kClassDataQuality: return lookup.catalogue && record_.bathymetricQuality.empty();
    case kClassSoundingDatum: return lookup.catalogue && record_.soundingDatum.empty();
    case kClassVerticalDatum: return lookup.catalogue && record_.verticalDatum.empty();
    default: return classCode == 0;  // the host gave no class with the list: ask the object
  }
}

void XChartLegend::LookUpObject(IGeoObject* object, long classCode, PositionLookup& lookup) {
  if (!Wanted(classCode, lookup)) return;
  IGeoCatalog* catalogue = lookup.catalogue;
  if (!HitTest(*lookup.geodesy, object, lookup.projection, lookup.nearRect)) {
    if (classCode == kClassMagneticVariation && lookup.fallback == kNoValue &&
        HitTest(*lookup.geodesy, object, lookup.projection, lookup.screen)) {
      lookup.fallback = ObjectVariation(object);
    }
    return;
  }
  switch (classCode) {
    case kClassMagneticVariation:
      record_.magneticVariation = ObjectVariation(object);
      break;
    case kClassDataAccuracy: {
      Variant value;
      ComRef<IGeoAttribute> attribute;
      if (object->GetAttribute(kAttributePositionalAccuracy, attribute.Out()) == S_OK && attribute &&
          SUCCEEDED(attribute->GetValue(&value.value)) && (value.value.vt == VT_R4 || value.value.vt == VT_R8) &&
          ConvertTo(value.value, VT_R4) && std::isfinite(value.value.fltVal) && value.value.fltVal != FLT_MAX) {
        record_.nonBathymetricQuality = value.value.fltVal;
        lookup.accuracyFound = true;
      }
      break;
    }
    case kClassDataQuality: {
      Variant value;
      if (ReadAttribute(object, kAttributeZoneOfConfidence, VT_UI2, value) && value.value.uiVal != 0) {
        br::geo::ReadEnumText(catalogue, kAttributeZoneOfConfidence, value.value.uiVal, record_.bathymetricQuality);
      }
      break;
    }
    case kClassSoundingDatum:
    case kClassVerticalDatum: {
      std::string& datum = classCode == kClassSoundingDatum ? record_.soundingDatum : record_.verticalDatum;
      Variant value;
      if (ReadAttribute(object, kAttributeVerdat, VT_UI1, value) && value.value.bVal != 0) {
        br::geo::ReadEnumText(catalogue, kAttributeVerdat, value.value.bVal, datum);
      }
      break;
    }
    default:
      break;
  }
}

void XChartLegend::FillRaster(IGeoRasterDataSet* raster) {
  Reset();
  metaObjects_.clear();
  Variant header;
  BR_CHECK_HR(raster->GetChartHeader(0, &header.value));
  ComRef<IUnknown> issue;
  BR_CHECK_HR(raster->GetChartIssue(issue.Out()));
  Variant issueRecord;
  BR_CHECK_HR(raster->GetChartIssueRecord(&issueRecord.value));
  std::vector<unsigned char> headerBytes, issueBytes;
  BR_CHECK(issue && BytesOf(header.value, 4096, headerBytes) && BytesOf(issueRecord.value, 4096, issueBytes));

  const RasterChartHeader chart = ParseRasterChartHeader(headerBytes.data(), headerBytes.size());
  const RasterChartIssue dates = ParseRasterChartIssue(issueBytes.data(), issueBytes.size());
  // An unlisted code keeps the field's default.
  const auto set = [](std::string& field, const char* text) {
    if (text) field = text;
  };
  if (chart.depthUnits) set(record_.depthUnits, br::geo::DepthUnitText(*chart.depthUnits));
  if (chart.heightUnits) set(record_.heightUnits, br::geo::HeightUnitText(*chart.heightUnits));
  if (chart.soundingDatum) set(record_.soundingDatum, br::geo::VerticalDatumText(*chart.soundingDatum));
  if (chart.verticalDatum) set(record_.verticalDatum, br::geo::VerticalDatumText(*chart.verticalDatum));
  if (chart.horizontalDatum) set(record_.horizontalDatum, br::geo::HorizontalDatumText(*chart.horizontalDatum));
  if (chart.projection) {
    if (const br::geo::ProjectionCode* projection = br::geo::FindProjection(*chart.projection)) {
      record_.projection = projection->name;
    }
  }
  record_.editionDate = DateFromAutomation(dates.editionDate);
  record_.updateDate = DateFromAutomation(dates.updateDate);
  if (chart.producer) {
    record_.sourceProducingAgency =
        br::geo::RasterAgencyText(agencies_.Rows(), *chart.producer, br::geo::AgencyCodeVariant::Agency);
    record_.sourceIdCode =
        br::geo::RasterAgencyText(agencies_.Rows(), *chart.producer, br::geo::AgencyCodeVariant::Identification);
  }
  record_.editionNumber = -1;
  record_.updateNumber = -1;
  record_.defaultScale = chart.scale.value_or(0);
  record_.bathymetricQuality.clear();
  record_.nonBathymetricQuality = kNoValue;
  record_.magneticVariation = kNoValue;
}

HRESULT XChartLegend::ReadText(const std::string& text, BSTR* value) {
  if (!value) return E_POINTER;
  *value = br::com::BstrFromAnsi(text);
  return *value ? S_OK : E_OUTOFMEMORY;
}

HRESULT XChartLegend::ReadDate(const CalendarDate& date, DATE* value) {
  if (!value) return E_POINTER;
  *value = kNoValue;
  // Checked here: the platform turns an all-zero date into a real one.
  if (date.IsNoValue()) return S_OK;
  SYSTEMTIME system{date.fields[0], date.fields[1], date.fields[2], date.fields[3],
                    date.fields[4], date.fields[5], date.fields[6], date.fields[7]};
  double converted = 0.0;
  if (SystemTimeToVariantTime(&system, &converted)) *value = converted;
  return S_OK;
}

STDMETHODIMP XChartLegend::get_DepthUnits(BSTR* value) { return ReadText(record_.depthUnits, value); }
STDMETHODIMP XChartLegend::get_HeightUnits(BSTR* value) { return ReadText(record_.heightUnits, value); }
STDMETHODIMP XChartLegend::get_SoundingDatum(BSTR* value) { return ReadText(record_.soundingDatum, value); }
STDMETHODIMP XChartLegend::get_VerticalDatum(BSTR* value) { return ReadText(record_.verticalDatum, value); }
STDMETHODIMP XChartLegend::get_HorizontalDatum(BSTR* value) { return ReadText(record_.horizontalDatum, value); }
STDMETHODIMP XChartLegend::get_EditionDate(DATE* value) { return ReadDate(record_.editionDate, value); }
STDMETHODIMP XChartLegend::get_UpdateDate(DATE* value) { return ReadDate(record_.updateDate, value); }
STDMETHODIMP XChartLegend::get_SourceIDCode(BSTR* value) { return ReadText(record_.sourceIdCode, value); }
STDMETHODIMP XChartLegend::get_BathymetricQuality(BSTR* value) {
  return ReadText(record_.bathymetricQuality, value);
}
STDMETHODIMP XChartLegend::get_Projection(BSTR* value) { return ReadText(record_.projection, value); }
STDMETHODIMP XChartLegend::get_SourceProducingAgency(BSTR* value) {
  return ReadText(record_.sourceProducingAgency, value);
}

STDMETHODIMP XChartLegend::get_EditionNumber(long* value) {
  if (!value) return E_POINTER;
  *value = record_.editionNumber;
  return S_OK;
}

STDMETHODIMP XChartLegend::get_UpdateNumber(long* value) {
  if (!value) return E_POINTER;
  *value = record_.updateNumber;
  return S_OK;
}

STDMETHODIMP XChartLegend::get_DefaultScale(long* value) {
  if (!value) return E_POINTER;
  *value = record_.defaultScale;
  return S_OK;
}

STDMETHODIMP XChartLegend::get_NonBathymetricQuality(double* value) {
  if (!value) return E_POINTER;
  *value = record_.nonBathymetricQuality;
  return S_OK;
}

STDMETHODIMP XChartLegend::get_MagneticVariation(double* value) {
  if (!value) return E_POINTER;
  *value = record_.magneticVariation;
  return record_.magneticVariation == kNoValue ? S_FALSE : S_OK;
}

}  // namespace br::legend

// IXChartLegend with bad input, early and late bound: null out-pointers, arguments of every
// wrong type and form, extreme positions and objects that are no dataset. A refused call
// leaves every property as it was; an accepted odd one ends in S_OK with a sound record.
#include "tests/wine/common/boundary_support.h"
#include "tests/wine/common/SceneClient.h"

#include <cfloat>
#include <climits>
#include <cmath>
#include <sstream>

using namespace br::test;
using namespace br::test::boundary;

namespace {

long Unit(double degrees) { return static_cast<long>(std::lround(degrees * 1e7)); }

using TextGetter = HRESULT (STDMETHODCALLTYPE IXChartLegend::*)(BSTR*);
using DoubleGetter = HRESULT (STDMETHODCALLTYPE IXChartLegend::*)(double*);
using LongGetter = HRESULT (STDMETHODCALLTYPE IXChartLegend::*)(long*);

const std::pair<const char*, TextGetter> kTexts[] = {
    {"DepthUnits", &IXChartLegend::get_DepthUnits},       {"HeightUnits", &IXChartLegend::get_HeightUnits},
    {"SoundingDatum", &IXChartLegend::get_SoundingDatum}, {"VerticalDatum", &IXChartLegend::get_VerticalDatum},
    {"HorizontalDatum", &IXChartLegend::get_HorizontalDatum}, {"SourceIDCode", &IXChartLegend::get_SourceIDCode},
    {"BathymetricQuality", &IXChartLegend::get_BathymetricQuality}, {"Projection", &IXChartLegend::get_Projection},
    {"SourceProducingAgency", &IXChartLegend::get_SourceProducingAgency}};
const std::pair<const char*, DoubleGetter> kDoubles[] = {
    {"EditionDate", &IXChartLegend::get_EditionDate}, {"UpdateDate", &IXChartLegend::get_UpdateDate},
    {"NonBathymetricQuality", &IXChartLegend::get_NonBathymetricQuality},
    {"MagneticVariation", &IXChartLegend::get_MagneticVariation}};
const std::pair<const char*, LongGetter> kLongs[] = {{"EditionNumber", &IXChartLegend::get_EditionNumber},
                                                     {"UpdateNumber", &IXChartLegend::get_UpdateNumber},
                                                     {"DefaultScale", &IXChartLegend::get_DefaultScale}};

// Every property with its result, as one text.
std::string Snapshot(IXChartLegend* legend) {
  std::ostringstream out;
  for (const auto& [name, get] : kTexts) {
    BSTR text = nullptr;
    out << name << (legend->*get)(&text) << "=";
    for (const wchar_t* c = text; c && *c; ++c) out << static_cast<char>(*c);
    SysFreeString(text);
    out << ";";
  }
  for (const auto& [name, get] : kDoubles) {
    double value = 0;
    const HRESULT hr = (legend->*get)(&value);
    out << name << hr << "=" << value << ";";
  }
  for (const auto& [name, get] : kLongs) {
    long value = 0;
    const HRESULT hr = (legend->*get)(&value);
    out << name << hr << "=" << value << ";";
  }
  return out.str();
}

VARIANT Unknown(IUnknown* object) {
  VARIANT v;
  v.vt = VT_UNKNOWN;
  v.punkVal = object;  // borrowed: Invoke does not take it
  return v;
}
VARIANT Long(LONG x) {
  VARIANT v;
  v.vt = VT_I4;
  v.lVal = x;
  return v;
}
VARIANT Double(double x) {
  VARIANT v;
  v.vt = VT_R8;
  v.dblVal = x;
  return v;
}

struct Filled {
  DllUnderTest dll;
  SceneClient scene;
  ComRef<IUnknown> dataSet, raster, projection;
  ComRef<IXChartLegend> legend;
  Filled() {
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    dataSet = scene.Component(L"DataSet", L"FR5BR010");
    raster = scene.Component(L"DataSet", L"FR3BR001");
    projection = scene.Component(L"Projection", L"chart");
    REQUIRE(dll.Create(CLSID_XChartLegend, IID_IXChartLegend, legend.OutVoid()) == S_OK);
    REQUIRE(legend->SetLegendData(dataSet.Get(), projection.Get(), Unit(48.35), Unit(-4.55)) == S_OK);
    long edition = 0;
    REQUIRE(legend->get_EditionNumber(&edition) == S_OK);
    REQUIRE(edition == 3);
  }
  HRESULT Finish() { return legend.Reset(), dataSet.Reset(), raster.Reset(), projection.Reset(), dll.CanUnloadNow(); }
};

}  // namespace

TEST_CASE("IXChartLegend refused calls, early and late bound, leave every property") {
  Filled f;
  IXChartLegend* l = f.legend.Get();
  ComRef<IDispatch> late = Query<IDispatch>(l);
  IDispatch* d = late.Get();
  IUnknown* dataSet = f.dataSet.Get();
  IUnknown* projection = f.projection.Get();
  std::vector<Row> rows;
  for (const auto& [name, get] : kTexts)
    rows.push_back({std::string(name) + " into null", [l, get = get] { return (l->*get)(nullptr); }, E_POINTER});
  for (const auto& [name, get] : kDoubles)
    rows.push_back({std::string(name) + " into null", [l, get = get] { return (l->*get)(nullptr); }, E_POINTER});
  for (const auto& [name, get] : kLongs)
    rows.push_back({std::string(name) + " into null", [l, get = get] { return (l->*get)(nullptr); }, E_POINTER});
  const auto call = [d](std::vector<VARIANT> arguments) {
    return InvokeByName(d, L"SetLegendData", DISPATCH_METHOD, std::move(arguments));
  };
  std::vector<Row> lateRows = {
      {"late SetLegendData without arguments", [=] { return call({}); }, DISP_E_BADPARAMCOUNT},
      {"late SetLegendData, a text for the dataset",
       [=] {
         Variant text = Variant::Bstr(L"FR5BR010");
         return call({text.get(), Unknown(projection), Long(0), Long(0)});
       },
       DISP_E_TYPEMISMATCH},
      {"late SetLegendData, empty VARIANTs for the objects",
       [=] {
         VARIANT empty;
         VariantInit(&empty);
         return call({empty, empty, Long(0), Long(0)});
       },
       DISP_E_TYPEMISMATCH},
      {"late SetLegendData, an infinite longitude",
       [=] { return call({Unknown(dataSet), Unknown(projection), Long(0), Double(kInfinity)}); }, DISP_E_OVERFLOW},
      {"late SetLegendData, a latitude past 32 bits",
       [=] { return call({Unknown(dataSet), Unknown(projection), Double(1e12), Long(0)}); }, DISP_E_OVERFLOW},
      {"late put of the read-only DepthUnits",
       [=] {
         Variant text = Variant::Bstr(L"feet");
         return InvokeByName(d, L"DepthUnits", DISPATCH_PROPERTYPUT, {text.get()});
       },
       DISP_E_MEMBERNOTFOUND},
      {"late get of an unknown name", [=] { return InvokeByName(d, L"SetLegend", DISPATCH_METHOD, {}); },
       DISP_E_UNKNOWNNAME},
      {"late call of dispatch id 99",
       [=] {
         DISPPARAMS none{nullptr, nullptr, 0, 0};
         return d->Invoke(99, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &none, nullptr, nullptr, nullptr);
       },
       DISP_E_MEMBERNOTFOUND},
      {"GetTypeInfo 1", [=] {
         ITypeInfo* info = reinterpret_cast<ITypeInfo*>(kUntouchedUnknown);
         const HRESULT hr = d->GetTypeInfo(1, LOCALE_USER_DEFAULT, &info);
         CHECK(info == nullptr);
         return hr;
       }, DISP_E_BADINDEX},
  };
  rows.insert(rows.end(), lateRows.begin(), lateRows.end());
  RunRows(rows, [l] { return Snapshot(l); });
  late.Reset();
  CHECK(f.Finish() == S_OK);
}

TEST_CASE("IXChartLegend odd but accepted calls: S_OK and a sound record") {
  Filled f;
  IXChartLegend* l = f.legend.Get();
  const std::string filled = Snapshot(l);
  ComRef<IXChartLegend> other;
  REQUIRE(f.dll.Create(CLSID_XChartLegend, IID_IXChartLegend, other.OutVoid()) == S_OK);
  const std::string defaults = Snapshot(other.Get());

  SUBCASE("objects that are no dataset or projection reset the record") {
    CHECK(l->SetLegendData(other.Get(), f.projection.Get(), 0, 0) == S_OK);
    CHECK(Snapshot(l) == defaults);
    CHECK(l->SetLegendData(f.dataSet.Get(), f.dataSet.Get(), 0, 0) == S_OK);  // no projection, no raster
    CHECK(Snapshot(l) == defaults);
  }
  SUBCASE("the extreme positions keep the dataset's values") {
    for (long la : {LONG_MIN, LONG_MAX, 0L}) {
      for (long fi : {LONG_MIN, LONG_MAX}) {
        CHECK(l->SetLegendData(f.dataSet.Get(), f.projection.Get(), la, fi) == S_OK);
        long edition = 0, scale = 0;
        CHECK(l->get_EditionNumber(&edition) == S_OK);
        CHECK(l->get_DefaultScale(&scale) == S_OK);
        CHECK(edition == 3);
        CHECK(scale == 22000);
      }
    }
    // Back at the position, the same record as at first.
    CHECK(l->SetLegendData(f.dataSet.Get(), f.projection.Get(), Unit(48.35), Unit(-4.55)) == S_OK);
    CHECK(Snapshot(l) == filled);
  }
  SUBCASE("late bound: by reference, as IDispatch, and null objects") {
    ComRef<IDispatch> d = Query<IDispatch>(l);
    IUnknown* dataSet = f.dataSet.Get();
    VARIANT byRef;
    byRef.vt = VT_BYREF | VT_UNKNOWN;
    byRef.ppunkVal = &dataSet;
    CHECK(InvokeByName(d.Get(), L"SetLegendData", DISPATCH_METHOD,
                       {byRef, Unknown(f.projection.Get()), Long(Unit(48.35)), Long(Unit(-4.55))}) == S_OK);
    CHECK(Snapshot(l) == filled);
    CHECK(InvokeByName(d.Get(), L"SetLegendData", DISPATCH_METHOD,
                       {Unknown(nullptr), Unknown(f.projection.Get()), Long(0), Long(0)}) == S_OK);
    CHECK(Snapshot(l) == defaults);
    // A NaN position: Wine's conversion gives a number where Windows refuses with
    // DISP_E_OVERFLOW; either way the dataset's values stay.
    const HRESULT nan = InvokeByName(d.Get(), L"SetLegendData", DISPATCH_METHOD,
                                     {Unknown(f.dataSet.Get()), Unknown(f.projection.Get()), Double(kNaN), Long(0)});
    CHECK((nan == S_OK || nan == DISP_E_OVERFLOW));
    long edition = 0;
    CHECK(l->get_EditionNumber(&edition) == S_OK);
    CHECK(edition == 3);
    // The positions as texts of numbers convert.
    Variant la = Variant::Bstr(L"483500000"), fi = Variant::Bstr(L"-45500000");
    CHECK(InvokeByName(d.Get(), L"SetLegendData", DISPATCH_METHOD,
                       {Unknown(f.dataSet.Get()), Unknown(f.projection.Get()), la.get(), fi.get()}) == S_OK);
    CHECK(Snapshot(l) == filled);
    VARIANT result;
    VariantInit(&result);
    CHECK(InvokeByName(d.Get(), L"MagneticVariation", DISPATCH_PROPERTYGET, {}, &result) == S_OK);
    CHECK(result.vt == VT_R8);
    d.Reset();
  }
  other.Reset();
  CHECK(f.Finish() == S_OK);
}

// The stand-in chart host as later suites use it, through COM under Wine: the sample scene's
// databases, datasets, objects and catalogue; parameter arrays in their three forms and
// header records as BR_Info's readers take them; enumerators, selections and hit tests;
// stored files; the formatter; injected faults; and every wrapper
// released in the end.
#include <doctest/doctest.h>

#include <windows.h>
#include <objbase.h>
#include <objidl.h>

#include <cstring>
#include <string>
#include <vector>

#include <wrl/client.h>

#include "ChartScene_h.h"
#include "GeoData.h"
#include "frame/geo/GeodesyLibrary.h"
#include "frame/geo/ParameterList.h"
#include "frame/geo/catalogue_texts.h"
#include "frame/geo/geo_enumeration.h"
#include "frame/geo/header_reader.h"

using Microsoft::WRL::ComPtr;
using namespace br::geo;

namespace {

struct ComForTheRun {
  ComForTheRun() { CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED); }
} comForTheRun;

std::wstring SourceDir() {
  wchar_t value[MAX_PATH] = {};
  GetEnvironmentVariableW(L"BR_SOURCE_DIR", value, MAX_PATH);
  std::wstring unixPath = value;
  REQUIRE_MESSAGE(!unixPath.empty(), "BR_SOURCE_DIR names the source tree");
  for (wchar_t& c : unixPath)
    if (c == L'/') c = L'\\';
  return L"Z:" + unixPath;  // Wine's drive for the Unix root
}

std::wstring Harbour(const wchar_t* relative = L"harbour.json") {
  return SourceDir() + L"\\data\\harbour\\" + relative;
}

class Bstr {
public:
  explicit Bstr(const std::wstring& text) : text_(SysAllocString(text.c_str())) {}
  Bstr() = default;
  ~Bstr() { SysFreeString(text_); }
  operator BSTR() const { return text_; }
  BSTR* Out() {
    SysFreeString(text_);
    text_ = nullptr;
    return &text_;
  }
  std::wstring Text() const { return text_ ? std::wstring(text_, SysStringLen(text_)) : std::wstring(); }

private:
  BSTR text_ = nullptr;
};

ComPtr<IChartScene> LoadedScene(const std::wstring& file = Harbour()) {
  ComPtr<IChartScene> scene;
  REQUIRE(CoCreateInstance(CLSID_ChartScene, nullptr, CLSCTX_INPROC_SERVER, IID_IChartScene,
                           reinterpret_cast<void**>(scene.GetAddressOf())) == S_OK);
  REQUIRE(scene->Load(Bstr(file)) == S_OK);
  return scene;
}

template <typename I>
ComPtr<I> Named(IChartScene* scene, HRESULT (STDMETHODCALLTYPE IChartScene::*get)(BSTR, IUnknown**),
                const wchar_t* name) {
  ComPtr<IUnknown> unknown;
  REQUIRE((scene->*get)(Bstr(name), &unknown) == S_OK);
  ComPtr<I> face;
  REQUIRE(unknown.As(&face) == S_OK);
  return face;
}

long Counter(IChartScene* scene, const wchar_t* name) {
  long value = 0;
  REQUIRE(scene->Counter(Bstr(name), &value) == S_OK);
  return value;
}

// Every wrapper kind counted by the stand-in.
long LiveWrappers(IChartScene* scene) {
  long sum = 0;
  for (const wchar_t* kind : {L"live.Database", L"live.DataSet", L"live.RasterDataSet", L"live.Object",
                              L"live.Attribute", L"live.ObjectEnum", L"live.SelectionEnum", L"live.Projection",
                              L"live.PresParams", L"live.ColorMap", L"live.ObjectFormatter"}) {
    sum += Counter(scene, kind);
  }
  return sum;
}

std::wstring ScratchScene(const std::string& json) {
  wchar_t folder[MAX_PATH], file[MAX_PATH];
  GetTempPathW(MAX_PATH, folder);
  GetTempFileNameW(folder, L"scn", 0, file);
  HANDLE handle = CreateFileW(file, GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr);
  DWORD written = 0;
  WriteFile(handle, json.data(), static_cast<DWORD>(json.size()), &written, nullptr);
  CloseHandle(handle);
  return file;
}

std::string ObjectText(IGeoObject* object) {
  BSTR text = nullptr;
  object->GetText(&text);
  std::string ansi;
  for (UINT i = 0; text && i < SysStringLen(text); ++i) ansi += static_cast<char>(text[i]);
  SysFreeString(text);
  return ansi;
}

}  // namespace

TEST_CASE("the sample scene: database, catalogue, datasets and objects as BR_Info's readers take them") {
  ComPtr<IChartScene> scene = LoadedScene();
  const long before = LiveWrappers(scene.Get());
  {
    ComPtr<IGeoDatabase> database = Named<IGeoDatabase>(scene.Get(), &IChartScene::Database, L"BREST");
    GUID kind{};
    REQUIRE(database->GetKindId(&kind) == S_OK);
    CHECK(IsEqualGUID(kind, GEOKIND_CHART_DATABASE));
    Bstr name;
    REQUIRE(database->GetName(name.Out()) == S_OK);
    CHECK(name.Text() == L"BREST");

    ComPtr<IGeoCatalog> catalogue;
    REQUIRE(database.As(&catalogue) == S_OK);
    CHECK(*FindAttributeCode(catalogue.Get(), "VERDAT") == 185);
    CHECK(*FindAttributeCode(catalogue.Get(), "verdat") == 17005);
    std::string text;
    REQUIRE(ReadEnumText(catalogue.Get(), 185, 23, text));
    CHECK(text == "Lowest astronomical tide");
    REQUIRE(ReadEnumText(catalogue.Get(), 400, 13, text));
    CHECK(text == "Astro beacon \"E\" 1945");
    REQUIRE(ReadClassName(catalogue.Get(), 7, text));
    CHECK(text == "Beacon, lateral");
    REQUIRE(ReadAttributeName(catalogue.Get(), 57003, text));  // the scene's own
    CHECK(text == "Hierarchy level");
    long flags = 0;
    REQUIRE(catalogue->GetClassFlags(306, &flags) == S_OK);  // M_NSYS, hidden by the scene
    CHECK(flags == 0x8000);
    REQUIRE(catalogue->GetAttributeFlags(133, &flags) == S_OK);  // SCAMIN, not printed
    CHECK(flags == 0x8000);
    CHECK_FALSE(ReadEnumText(catalogue.Get(), 185, 999, text));

    // The header record, through the dataset and through the database.
    ComPtr<IGeoDataSet> dataSet = Named<IGeoDataSet>(scene.Get(), &IChartScene::DataSet, L"FR5BR010");
    DataSetHeader header;
    REQUIRE(ReadDataSetHeader(dataSet.Get(), header) == S_OK);
    CHECK(*header.fileName == "FR5BR010.000");
    CHECK(*header.edition == 3);
    CHECK(*header.status == kHeaderStatusNewEdition);
    ComPtr<IGeoObject> light = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"minou-light-white");
    GUID id{};
    REQUIRE(light->GetId(&id) == S_OK);
    DataSetHeader viaDatabase;
    REQUIRE(ReadDataSetHeader(database.Get(), id, viaDatabase) == S_OK);
    CHECK(*viaDatabase.scale == 22000u);

    ParameterList parameters;
    REQUIRE(parameters.Read(dataSet.Get()) == S_OK);
    CHECK(parameters.Size() == 34);
    CHECK(*parameters.Text(22) == "Goulet de Brest");
    CHECK(*parameters.Date(5) == 45048.0);
    VARIANT update;
    VariantInit(&update);
    REQUIRE(dataSet->GetDataSetProperty(2, &update) == S_OK);
    CHECK((update.vt == VT_UI2 && update.uiVal == 2));

    // Objects by identity, and what they answer.
    ComPtr<IGeoObject> found;
    REQUIRE(database->GetGeoObject(id, &found) == S_OK);
    long classCode = 0, primitive = 0;
    REQUIRE((found->GetClassCode(&classCode) == S_OK && found->GetPrimitive(&primitive) == S_OK));
    CHECK((classCode == 75 && primitive == 1));
    CHECK(ObjectText(found.Get()) == "Minou directional");
    GUID own{};
    REQUIRE(light->GetId(&own) == S_OK);
    std::memset(&own, 0, 8);  // the dataset itself is no object
    ComPtr<IGeoObject> none;
    CHECK(database->GetGeoObject(own, &none) == S_FALSE);
    CHECK(none == nullptr);
    ComPtr<IGeoAttribute> colour;
    REQUIRE(light->GetAttribute(75, &colour) == S_OK);
    VARIANT value;
    VariantInit(&value);
    REQUIRE(colour->GetValue(&value) == S_OK);
    CHECK(value.vt == (VT_ARRAY | VT_UI1));
    VariantClear(&value);
    ComPtr<IGeoAttribute> absent;
    CHECK(light->GetAttribute(176, &absent) == S_FALSE);
    REQUIRE(light->GetProperty(0, &value) == S_OK);
    CHECK((value.vt == VT_UI4 && value.ulVal == 0));
  }
  CHECK(LiveWrappers(scene.Get()) == before);
}

TEST_CASE("parameters in the three forms, raster and library entries, object records") {
  const std::wstring file = ScratchScene(R"({"format": "chartscene 1", "databases": [{"name": "D", "kind": "chart",
      "datasets": [{"id": "DIRECT", "parameters": {"horizontalDatum": 7}},
                   {"id": "BYREF", "parametersForm": "byReference", "parameters": {"horizontalDatum": 8}},
                   {"id": "INVAR", "parametersForm": "inVariant", "parameters": {"horizontalDatum": 9, "count": 40}}]}]})");
  {
    ComPtr<IChartScene> scene = LoadedScene(file);
    const struct {
      const wchar_t* id;
      VARTYPE form;
      long datum;
      std::size_t size;
    } rows[] = {{L"DIRECT", VT_ARRAY | VT_VARIANT, 7, 34},
                {L"BYREF", VT_BYREF | VT_ARRAY | VT_VARIANT, 8, 34},
                {L"INVAR", VT_BYREF | VT_VARIANT, 9, 40}};
    for (const auto& row : rows) {
      ComPtr<IGeoDataSet> dataSet = Named<IGeoDataSet>(scene.Get(), &IChartScene::DataSet, row.id);
      VARIANT answer;
      VariantInit(&answer);
      REQUIRE(dataSet->GetParameters(&answer) == S_OK);
      CHECK(answer.vt == row.form);
      VariantClear(&answer);
      ParameterList parameters;
      REQUIRE(parameters.Read(dataSet.Get()) == S_OK);
      CHECK(parameters.Size() == row.size);
      CHECK(*parameters.Integer(23) == row.datum);
    }
  }
  DeleteFileW(file.c_str());

  ComPtr<IChartScene> scene = LoadedScene();
  ComPtr<IUnknown> raster;
  REQUIRE(scene->DataSet(Bstr(L"FR3BR001"), &raster) == S_OK);
  ComPtr<IGeoDataSet> notVector;
  CHECK(raster.As(&notVector) == E_NOINTERFACE);
  ComPtr<IGeoRasterDataSet> rasterFace;
  REQUIRE(raster.As(&rasterFace) == S_OK);
  VARIANT header;
  VariantInit(&header);
  REQUIRE(rasterFace->GetChartHeader(0, &header) == S_OK);
  CHECK(header.vt == (VT_ARRAY | VT_UI1));
  CHECK(header.parray->rgsabound[0].cElements == 600);
  VariantClear(&header);
  CHECK(rasterFace->GetChartHeader(1, &header) == E_INVALIDARG);

  ComPtr<IUnknown> library, vector;
  REQUIRE(scene->DataSet(Bstr(L"LIBBRST"), &library) == S_OK);
  REQUIRE(scene->DataSet(Bstr(L"FR5BR010"), &vector) == S_OK);
  ComPtr<IGeoLibraryDataSet> libraryFace, notLibrary;
  CHECK(library.As(&libraryFace) == S_OK);
  CHECK(vector.As(&notLibrary) == E_NOINTERFACE);

  VARIANT records;
  VariantInit(&records);
  REQUIRE(scene->ObjectRecords(Bstr(L"fillettes-beacon, dataset:FR3BR001"), &records) == S_OK);
  REQUIRE(records.vt == (VT_ARRAY | VT_UI1));
  REQUIRE(records.parray->rgsabound[0].cElements == 2 * sizeof(GEO_OBJECT_RECORD));
  const auto* record = static_cast<const GEO_OBJECT_RECORD*>(records.parray->pvData);
  ComPtr<IGeoDatabase> owner;
  REQUIRE(record[0].Owner->QueryInterface(IID_IGeoDatabase, reinterpret_cast<void**>(owner.GetAddressOf())) == S_OK);
  ComPtr<IGeoObject> beacon;
  REQUIRE(owner->GetGeoObject(record[0].Id, &beacon) == S_OK);
  CHECK(ObjectText(beacon.Get()) == "Fillettes");
  ComPtr<IGeoRasterDataSet> entry;
  CHECK(record[1].Owner->QueryInterface(IID_IGeoRasterDataSet, reinterpret_cast<void**>(entry.GetAddressOf())) == S_OK);
  const unsigned char* entryId = reinterpret_cast<const unsigned char*>(&record[1].Id);
  CHECK(std::vector<unsigned char>(entryId, entryId + 8) == std::vector<unsigned char>(8, 0));
  VariantClear(&records);
  CHECK(scene->ObjectRecords(Bstr(L"no-such-object"), &records) == E_INVALIDARG);
}

TEST_CASE("relations both ways, selections, projection and hit test") {
  ComPtr<IChartScene> scene = LoadedScene();
  const long before = LiveWrappers(scene.Get());
  {
    const auto classes = [](IGeoObjectEnum* items) {
      std::vector<long> codes;
      ForEachItem(items, [&](IUnknown* item) {
        ComPtr<IGeoObject> object;
        long code = 0;
        if (SUCCEEDED(item->QueryInterface(IID_IGeoObject, reinterpret_cast<void**>(object.GetAddressOf()))) &&
            SUCCEEDED(object->GetClassCode(&code)))
          codes.push_back(code);
        return true;
      });
      return codes;
    };
    ComPtr<IGeoObject> light = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"fillettes-light");
    ComPtr<IGeoObjectEnum> related;
    REQUIRE(light->GetRelated(&related) == S_OK);
    CHECK(classes(related.Get()) == std::vector<long>{7});  // held by its beacon
    ComPtr<IGeoObject> group = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"minou-group");
    ComPtr<IGeoObjectEnum> members;
    REQUIRE(group->GetMembers(&members) == S_OK);
    CHECK(classes(members.Get()) == std::vector<long>{74, 75, 75});
    ComPtr<IGeoObject> node = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"csi-note-lateral");
    ComPtr<IGeoObjectEnum> up;
    REQUIRE(node->GetRelated(&up) == S_OK);
    CHECK(classes(up.Get()) == std::vector<long>{57004});  // its parent node first
    CHECK(ObjectText(node.Get()) == "IALA A lateral marks");

    // A selection of the meta classes, as the legend asks for it.
    ComPtr<IGeoDatabase> database = Named<IGeoDatabase>(scene.Get(), &IChartScene::Database, L"BREST");
    const GEO_SELECTION_RECORD wanted[] = {{308, 78, 2, 0}, {300, 78, 3, 0}, {81, 78, 5, 0}};
    long selection = 0;
    REQUIRE(database->CreateSelection(3, wanted, &selection) == S_OK);
    CHECK(Counter(scene.Get(), L"selections.open") == 1);
    ComPtr<IGeoDataSet> dataSet = Named<IGeoDataSet>(scene.Get(), &IChartScene::DataSet, L"FR5BR010");
    ComPtr<IGeoSelectionEnum> objects;
    REQUIRE(dataSet->GetObjectEnum(&objects) == S_OK);
    REQUIRE(objects->SetSelection(selection, 0) == S_OK);
    std::vector<long> selected;
    for (int pass = 0; pass < 2; ++pass) {
      REQUIRE(objects->Reset() == S_OK);
      ForEachObject(objects.Get(), [&](IGeoObject* object) {
        long code = 0;
        object->GetClassCode(&code);
        selected.push_back(code);
        return true;
      });
    }
    CHECK(selected == std::vector<long>{81, 308, 300, 81, 308, 300});
    CHECK(objects->SetSelection(selection + 100, 0) == E_INVALIDARG);
    REQUIRE(database->ReleaseSelection(selection) == S_OK);
    CHECK(database->ReleaseSelection(selection) == E_INVALIDARG);
    CHECK(Counter(scene.Get(), L"selections.open") == 0);

    // The projection's centre lands mid-display; a hit test needs a real map-metrics block.
    ComPtr<IGeoProjection> projection = Named<IGeoProjection>(scene.Get(), &IChartScene::Projection, L"chart");
    GEO_POINT centre{483550000, -45600000};
    POINT pixel{};
    REQUIRE(projection->GeoToPixel(&centre, &pixel, 1) == S_OK);
    CHECK((pixel.x == 512 && pixel.y == 384));
    GEO_POINT beaconPosition{483488000, -45712000};
    REQUIRE(projection->GeoToPixel(&beaconPosition, &pixel, 1) == S_OK);
    ComPtr<IGeoObject> beacon = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"fillettes-beacon");
    const RECT closeBy{pixel.x - 8, pixel.y - 8, pixel.x + 8, pixel.y + 8};
    const RECT awayFrom{pixel.x + 20, pixel.y - 8, pixel.x + 36, pixel.y + 8};
    GEO_MAP_METRICS blank{};
    CHECK(beacon->HitTest(projection.Get(), &closeBy, &blank) == E_INVALIDARG);
    wchar_t program[MAX_PATH];
    GetModuleFileNameW(nullptr, program, MAX_PATH);
    std::wstring folder = program;
    bool ran = false;
    for (int up = 0; up < 6 && !ran; ++up) {
      folder.resize(folder.find_last_of(L'\\'));
      GeodesyLibrary geodesy({folder});
      ran = geodesy.WithMapMetrics([&](GEO_MAP_METRICS* metrics) {
        CHECK(beacon->HitTest(projection.Get(), &closeBy, metrics) == S_OK);
        CHECK(beacon->HitTest(projection.Get(), &awayFrom, metrics) == S_FALSE);
      });
    }
    CHECK(ran);
  }
  CHECK(LiveWrappers(scene.Get()) == before);
}

TEST_CASE("stored files: an object's storage hands out its file whole") {
  ComPtr<IChartScene> scene = LoadedScene();
  ComPtr<IGeoObject> beacon = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"fillettes-beacon");
  ComPtr<IStorage> storage;
  REQUIRE(beacon->GetStorage(&storage) == S_OK);
  ComPtr<IStream> stream;
  CHECK(storage->OpenStream(L"beacon.png", nullptr, STGM_READ, 0, &stream) != S_OK);  // as on Windows: exclusive only
  REQUIRE(storage->OpenStream(L"beacon.png", nullptr, STGM_READ | STGM_SHARE_EXCLUSIVE, 0, &stream) == S_OK);
  std::string bytes;
  char block[1024];
  ULONG read = 0;
  while (SUCCEEDED(stream->Read(block, sizeof(block), &read)) && read > 0) bytes.append(block, read);
  CHECK(bytes.compare(0, 8, "\x89PNG\r\n\x1a\n") == 0);
  HANDLE file = CreateFileW(Harbour(L"files\\beacon.png").c_str(), GENERIC_READ, FILE_SHARE_READ, nullptr,
                            OPEN_EXISTING, 0, nullptr);
  REQUIRE(file != INVALID_HANDLE_VALUE);
  CHECK(GetFileSize(file, nullptr) == bytes.size());
  CloseHandle(file);
  ComPtr<IGeoObject> plain = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"minou-light-red");
  ComPtr<IStorage> nothing;
  CHECK(FAILED(plain->GetStorage(&nothing)));
}

TEST_CASE("the object formatter: labels, attribute texts with enumeration texts, options recorded") {
  ComPtr<IChartScene> scene = LoadedScene();
  const long before = LiveWrappers(scene.Get());
  {
    ComPtr<IObjectFormatter> formatter;
    REQUIRE(CoCreateInstance(CLSID_ObjectFormatter, nullptr, CLSCTX_ALL, IID_IObjectFormatter,
                             reinterpret_cast<void**>(formatter.GetAddressOf())) == S_OK);
    VARIANT option;
    VariantInit(&option);
    option.vt = VT_I4;
    option.lVal = 1036;
    REQUIRE(formatter->SetOption(61, option) == S_OK);
    option.vt = VT_BSTR;
    option.bstrVal = SysAllocString(L"unknown");
    REQUIRE(formatter->SetOption(64, option) == S_OK);
    VariantClear(&option);
    Bstr recorded;
    REQUIRE(scene->FormatterOption(61, recorded.Out()) == S_OK);
    CHECK(recorded.Text() == L"I4:1036");
    REQUIRE(scene->FormatterOption(64, recorded.Out()) == S_OK);
    CHECK(recorded.Text() == L"BSTR:unknown");

    ComPtr<IGeoObject> light = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"fillettes-light");
    Bstr text;
    REQUIRE(formatter->FormatObject(0, 6, light.Get(), 0, 0, text.Out()) == S_OK);
    CHECK(text.Text() == L"Light Fillettes light");
    REQUIRE(formatter->FormatObject(0, 4, light.Get(), 0, 0, text.Out()) == S_OK);
    CHECK(text.Text() ==
          L"Light#Light characteristic=flashing|Signal period=4|Colour=red|Height=8|Value of nominal range=5"
          L"|Category of light=|Object name=Fillettes light");

    ComPtr<IGeoObject> beacon = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"fillettes-beacon");
    ComPtr<IGeoAttribute> colours;
    REQUIRE(beacon->GetAttribute(75, &colours) == S_OK);
    REQUIRE(formatter->FormatAttribute(0, 4, colours.Get(), 0, 0, text.Out()) == S_OK);
    CHECK(text.Text() == L"Colour=red|white|red");
    ComPtr<IGeoObject> wreck = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"old-wreck");
    ComPtr<IGeoAttribute> category;
    REQUIRE(wreck->GetAttribute(71, &category) == S_OK);
    REQUIRE(formatter->FormatAttribute(0, 4, category.Get(), 0, 0, text.Out()) == S_OK);
    CHECK(text.Text() == L"Category of wreck=dangerous wreck");
    REQUIRE(formatter->GetAttributeName(GEOKIND_CHART_DATABASE, 0, 107, 0, 0, text.Out()) == S_OK);
    CHECK(text.Text() == L"Light characteristic");
    CHECK(formatter->GetAttributeName(GEOKIND_HIERARCHY, 0, 107, 0, 0, text.Out()) == E_INVALIDARG);
  }
  CHECK(LiveWrappers(scene.Get()) == before);
}

TEST_CASE("faults from the scene file and from SetFault; a refused scene keeps the one loaded before") {
  const std::wstring file = ScratchScene(R"({"format": "chartscene 1",
      "faults": {"IGeoDatabase.GetName": "0x80070005", "IGeoObjectEnum.Next": 1},
      "databases": [{"name": "D", "kind": "user", "datasets": [{"id": "A",
        "objects": [{"name": "o", "class": "LIGHTS", "attributes": {"COLOUR": [1]}}]}]}]})");
  ComPtr<IChartScene> scene = LoadedScene(file);
  DeleteFileW(file.c_str());
  ComPtr<IGeoDatabase> database = Named<IGeoDatabase>(scene.Get(), &IChartScene::Database, L"D");
  Bstr name;
  const long calls = Counter(scene.Get(), L"calls.IGeoDatabase.GetName");
  CHECK(database->GetName(name.Out()) == E_ACCESSDENIED);
  CHECK(Counter(scene.Get(), L"calls.IGeoDatabase.GetName") == calls + 1);
  ComPtr<IGeoObject> object = Named<IGeoObject>(scene.Get(), &IChartScene::Object, L"o");
  ComPtr<IGeoObjectEnum> attributes;
  REQUIRE(object->GetAttributes(&attributes) == S_OK);
  CHECK(ForEachItem(attributes.Get(), [](IUnknown*) { return true; }) == 0);  // S_FALSE at once

  REQUIRE(scene->SetFault(Bstr(L"IGeoObject.GetClassCode"), E_UNEXPECTED) == S_OK);
  long code = 0;
  CHECK(object->GetClassCode(&code) == E_UNEXPECTED);
  REQUIRE(scene->ClearFaults() == S_OK);
  CHECK(object->GetClassCode(&code) == S_OK);

  const std::wstring bad = ScratchScene("{\"format\": \"chartscene 1\", \"databases\": [}");
  CHECK(scene->Load(Bstr(bad)) == E_INVALIDARG);
  DeleteFileW(bad.c_str());
  Bstr error;
  REQUIRE(scene->get_LastError(error.Out()) == S_OK);
  CHECK(error.Text() == L"line 1, column 42: expected a value");
  ComPtr<IUnknown> stillThere;
  CHECK(scene->Database(Bstr(L"D"), &stillThere) == S_OK);
}

TEST_CASE("palettes, colour maps and presentation parameters") {
  ComPtr<IChartScene> scene = LoadedScene();
  long handle = 0;
  REQUIRE(scene->Palette(Bstr(L"day"), &handle) == S_OK);
  CHECK(GetObjectType(LongToHandle(handle)) == OBJ_PAL);
  long again = 0;
  REQUIRE(scene->Palette(Bstr(L"day"), &again) == S_OK);
  CHECK(again == handle);  // made once, kept by the scene

  ComPtr<IColorMap> map = Named<IColorMap>(scene.Get(), &IChartScene::ColorMap, L"day");
  USHORT index = 0;
  CHECK(map->GetPaletteIndex(99, &index) == E_INVALIDARG);
  ComPtr<IPresParams> four = Named<IPresParams>(scene.Get(), &IChartScene::PresParams, L"four-shades");
  VARIANT value;
  VariantInit(&value);
  CHECK(four->GetParam(7, &value) == E_INVALIDARG);
}

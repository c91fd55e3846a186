// Times the inspector's attribute table panel as a selection fills it: an object of 60
// attributes with its heading and related objects, and the metadata of a dataset header;
// also the metadata text form. The scene is written to a temporary file and loaded into the
// stand-in host (ChartScene.Scene, registered). Usage: inspector_panels_bench [COUNT]
#include <windows.h>
#include <objbase.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <cwchar>
#include <string>
#include <vector>

#include <wrl/client.h>

#include "GeoData.h"
#include "inspector/panels/PanelSettings.h"
#include "inspector/panels/cAttrViewPanel_Tbl.h"
#include "inspector/panels/dataset_metadata.h"

using Microsoft::WRL::ComPtr;
using Clock = std::chrono::steady_clock;

namespace {

constexpr int kAttributes = 60;

// 60 text attributes of the scene's own catalogue on one buoy, with two related buoys.
std::string SceneJson() {
  std::string attributes;
  std::string values;
  for (int i = 1; i <= kAttributes; ++i) {
    char line[160];
    std::snprintf(line, sizeof line, "%s{\"code\": %d, \"acronym\": \"ba%03d\", \"name\": \"Bench attribute %d\", \"type\": \"S\"}",
                  i > 1 ? ", " : "", 60000 + i, i, i);
    attributes += line;
    std::snprintf(line, sizeof line, "%s\"ba%03d\": \"value %d|second line<br>third\"", i > 1 ? ", " : "", i, i);
    values += line;
  }
  return std::string(R"({"format": "chartscene 1", "catalogue": {"attributes": [)") + attributes +
         R"(]}, "databases": [{"name": "BENCH", "kind": "chart", "datasets": [{"id": "BENCH001",
      "header": {"scale": 22000, "level": 5, "edition": 3, "update": 2, "updateDate": "2023-05-02",
                 "issueDate": "2022-11-15", "agency": 170, "sourceAgency": 550, "sourceId": "SHOM 7401", "usage": 5},
      "parameters": {"official": 0, "title": "Bench", "archiveCode": "A1", "horizontalDatum": 2,
                     "horizontalDatumSource": 2, "datumShiftLon": 12000, "datumShiftLat": -8000,
                     "verticalDatum": 3, "soundingDatum": 23},
      "properties": {"2": {"UI2": 4}},
      "objects": [
        {"name": "a", "class": "BOYLAT", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Alpha", "COLOUR": [3]}},
        {"name": "b", "class": "BOYLAT", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Bravo", "COLOUR": [4]}},
        {"name": "big", "class": "BOYLAT", "point": [48.3, -4.5], "attributes": {)" +
         values + R"(}, "members": ["b", "a"]}]}]}]})";
}

ComPtr<IUnknown> Call(IDispatch* scene, const wchar_t* method, const std::wstring& argument, HRESULT& hr) {
  DISPID id = 0;
  LPOLESTR name = const_cast<LPOLESTR>(method);
  hr = scene->GetIDsOfNames(IID_NULL, &name, 1, LOCALE_USER_DEFAULT, &id);
  if (FAILED(hr)) return nullptr;
  VARIANT in;
  VariantInit(&in);
  in.vt = VT_BSTR;
  in.bstrVal = SysAllocString(argument.c_str());
  VARIANT out;
  VariantInit(&out);
  DISPPARAMS params{&in, nullptr, 1, 0};
  hr = scene->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &params, &out, nullptr, nullptr);
  VariantClear(&in);
  ComPtr<IUnknown> result;
  if (hr == S_OK && out.vt == VT_UNKNOWN) result = out.punkVal;
  VariantClear(&out);
  return result;
}

struct Figures {
  double median;
  double worst;
};

template <class Body>
Figures Time(int count, Body&& body) {
  std::vector<double> ms;
  for (int i = 0; i < count; ++i) {
    const auto start = Clock::now();
    body();
    ms.push_back(std::chrono::duration<double, std::milli>(Clock::now() - start).count());
  }
  std::sort(ms.begin(), ms.end());
  return {ms[ms.size() / 2], ms.back()};
}

int Fail(const char* what, HRESULT hr) {
  std::fprintf(stderr, "inspector_panels_bench: %s (0x%08lX)\n", what, static_cast<unsigned long>(hr));
  return 1;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  const int count = argc > 1 ? std::max(1, static_cast<int>(std::wcstol(argv[1], nullptr, 10))) : 50;
  CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  int result = 0;
  {
    wchar_t folder[MAX_PATH] = {};
    wchar_t file[MAX_PATH] = {};
    GetTempPathW(MAX_PATH, folder);
    GetTempFileNameW(folder, L"bnc", 0, file);
    const std::string json = SceneJson();
    HANDLE handle = CreateFileW(file, GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr);
    DWORD written = 0;
    WriteFile(handle, json.data(), static_cast<DWORD>(json.size()), &written, nullptr);
    CloseHandle(handle);

    CLSID clsid{};
    ComPtr<IDispatch> scene;
    HRESULT hr = CLSIDFromProgID(L"ChartScene.Scene", &clsid);
    if (SUCCEEDED(hr)) {
      hr = CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch,
                            reinterpret_cast<void**>(scene.GetAddressOf()));
    }
    if (FAILED(hr)) return Fail("ChartScene.Scene is not registered", hr);
    Call(scene.Get(), L"Load", file, hr);
    DeleteFileW(file);
    if (hr != S_OK) return Fail("the scene was refused", hr);
    ComPtr<IGeoObject> big;
    ComPtr<IGeoDatabase> database;
    if (ComPtr<IUnknown> unknown = Call(scene.Get(), L"Object", L"big", hr)) unknown.As(&big);
    if (ComPtr<IUnknown> unknown = Call(scene.Get(), L"Database", L"BENCH", hr)) unknown.As(&database);
    if (!big || !database) return Fail("the scene lacks its objects", hr);
    GUID header{};
    std::memcpy(reinterpret_cast<unsigned char*>(&header) + 8, "BENCH001", 8);

    HWND host = CreateWindowExA(0, "STATIC", "bench", WS_POPUP, 0, 0, 520, 400, nullptr, nullptr,
                                GetModuleHandleA(nullptr), nullptr);
    br::inspector::PanelSettings settings;
    if (FAILED(hr = settings.Create())) return Fail("no object formatter", hr);
    br::inspector::cAttrViewPanel_Tbl panel(settings);
    panel.create(host);
    panel.setBounds(0, 0, 500, 380, true, true);

    int rows = 0;
    const Figures selection = Time(count, [&] {
      panel.Clear();
      panel.FillObject(big.Get(), true, true);
      rows = panel.table().getRowCount();
    });
    int metadataRows = 0;
    const Figures metadata = Time(count, [&] {
      panel.Clear();
      panel.FillDataSetMetadata(database.Get(), header);
      metadataRows = panel.table().getRowCount();
    });
    std::string text;
    const Figures textForm = Time(count, [&] { br::inspector::FormatDataSetMetadata(database.Get(), header, &panel.agencies(), text); });

    std::printf("inspector_panels_bench: %d runs each (median / worst, ms)\n", count);
    std::printf("  select an object of %d attributes (%d rows):  %.2f / %.2f   target 30\n", kAttributes, rows,
                selection.median, selection.worst);
    std::printf("  metadata panel of a dataset header (%d rows):  %.2f / %.2f   target 30\n", metadataRows,
                metadata.median, metadata.worst);
    std::printf("  metadata text form (%zu characters):           %.2f / %.2f\n", text.size(), textForm.median,
                textForm.worst);
    if (rows < kAttributes || metadataRows == 0 || text.empty()) result = Fail("rows are missing", E_FAIL);
    panel.Clear();
    DestroyWindow(host);
  }
  CoUninitialize();
  return result;
}

// Times XChartLegend::SetLegendData on a dataset held by the stand-in chart host: COUNT
// objects (default 10,000) spread over a grid of the chart, of which every META_EVERY-th is
// a meta object (default 1: all), every fifth of those a magnetic variation object.
//  - a cache miss (the record reset first, so the header, parameters and meta object list
//    are read again) and a cache hit (the same dataset again: only the position's hit
//    tests), each REPEATS times;
//  - POSITIONS calls (default 1,000) at positions spread over the grid, as a host moving its
//    cursor over the chart: total, median and worst;
//  - one contours paint for comparison.
//   legend_bench [COUNT] [REPEATS] [POSITIONS] [META_EVERY]
//   legend_bench 100000 5 1000 100    the scale run: 100,000 objects, 1,000 meta objects
#include "BR_Info.h"
#include "GeoData.h"
#include "bench/common/contours_setup.h"

#include <windows.h>
#include <ocidl.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cwchar>
#include <fstream>
#include <string>
#include <vector>

namespace {

using Clock = std::chrono::steady_clock;
using namespace br::bench;

int Fail(const char* message) {
  std::fprintf(stderr, "legend_bench: %s\n", message);
  return 1;
}

double Ms(Clock::time_point since) { return std::chrono::duration<double, std::milli>(Clock::now() - since).count(); }

// A scene of one chart dataset with count meta objects on a grid around 50 N 0 E.
std::string SceneJson(int count, int metaEvery) {
  const char* classes[] = {"M_QUAL", "M_ACCY", "M_SDAT", "M_VDAT", "MAGVAR"};
  const char* attributes[] = {R"("CATZOC": 3)", R"("POSACC": {"R4": 2.5})", R"("VERDAT": 23)", R"("VERDAT": 3)",
                              R"("VALMAG": 1.5, "VALACM": 6, "RYRMGV": "2020")"};
  std::string json = R"({"format": "chartscene 1", "databases": [{"name": "BENCH", "kind": "chart", "datasets": [
    {"id": "BENCH1", "header": {"scale": 22000, "edition": 3, "update": 1, "issueDate": "2022-11-15",
     "sourceAgency": 170, "sourceId": "BENCH"},
     "parameters": {"horizontalDatum": 2, "verticalDatum": 3, "soundingDatum": 23}, "objects": [)";
  const int side = 100;
  for (int i = 0; i < count; ++i) {
    const double lat = 49.5 + (i / side % side) * 0.01, lon = -0.5 + (i % side) * 0.01;
    char object[256];
    if (i % metaEvery == 0) {
      const int meta = i / metaEvery;
      std::snprintf(object, sizeof object,
                    R"(%s{"name": "m%d", "class": "%s", "point": [%.4f, %.4f], "attributes": {%s}})",
                    i ? ",\n" : "", i, classes[meta % 5], lat, lon, attributes[meta % 5]);
    } else {
      std::snprintf(object, sizeof object,
                    R"(%s{"name": "m%d", "class": "SOUNDG", "point": [%.4f, %.4f], "attributes": {"VALSOU": %d}})",
                    i ? ",\n" : "", i, lat + 0.005, lon + 0.005, i % 40);
    }
    json += object;
  }
  json += R"(]}]}], "projections": [{"name": "p", "kind": "mercator", "centre": [50, 0], "pixelsPerDegree": 1000}]})";
  return json;
}

VARIANT Call(IDispatch* scene, const wchar_t* method, const std::wstring& text) {
  DISPID id = 0;
  LPOLESTR names[] = {const_cast<LPOLESTR>(method)};
  VARIANT result;
  VariantInit(&result);
  if (FAILED(scene->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id))) return result;
  VARIANT argument;
  argument.vt = VT_BSTR;
  argument.bstrVal = SysAllocString(text.c_str());
  DISPPARAMS parameters{&argument, nullptr, 1, 0};
  scene->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, &result, nullptr, nullptr);
  VariantClear(&argument);
  return result;
}

struct Timing {
  double median = 0, worst = 0;
};
Timing Summary(std::vector<double> times) {
  std::sort(times.begin(), times.end());
  return {times[times.size() / 2], times.back()};
}

double ContoursPaint() {
  CLSID clsid{};
  IXContoursView* view = nullptr;
  if (FAILED(CLSIDFromProgID(L"BR_Info.XContoursView", &clsid)) ||
      FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IXContoursView,
                              reinterpret_cast<void**>(&view)))) {
    return -1;
  }
  IViewObject* drawing = nullptr;
  view->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&drawing));
  const HPALETTE palette = BenchPalette();
  BenchParams params;
  BenchColours colours;
  view->SetContoursData(&params, &colours, 10.0);
  view->put_Palette(static_cast<long>(reinterpret_cast<LONG_PTR>(palette)));
  BITMAPINFO info{};
  info.bmiHeader = {sizeof info.bmiHeader, 300, -600, 1, 32, BI_RGB, 0, 0, 0, 0, 0};
  void* bits = nullptr;
  const HDC dc = CreateCompatibleDC(nullptr);
  const HBITMAP bitmap = CreateDIBSection(dc, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  const HGDIOBJ old = SelectObject(dc, bitmap);
  const RECTL box{0, 0, 300, 600};
  const Clock::time_point start = Clock::now();
  const HRESULT hr = drawing ? drawing->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, dc, &box, nullptr,
                                             nullptr, 0)
                             : E_NOINTERFACE;
  const double ms = Ms(start);
  const bool drawn = SUCCEEDED(hr) && static_cast<const DWORD*>(bits)[0] == 0x0000C8FAu;
  SelectObject(dc, old);
  DeleteObject(bitmap);
  DeleteDC(dc);
  if (drawing) drawing->Release();
  view->Release();
  DeleteObject(palette);
  return drawn ? ms : -1;
}

int Run(int count, int repeats, int positions, int metaEvery) {
  IDispatch* scene = nullptr;
  CLSID sceneClass{};
  if (FAILED(CLSIDFromProgID(L"ChartScene.Scene", &sceneClass)) ||
      FAILED(CoCreateInstance(sceneClass, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch,
                              reinterpret_cast<void**>(&scene)))) {
    return Fail("ChartScene.Scene cannot be made (is chartscene.dll registered?)");
  }
  wchar_t folder[MAX_PATH] = L"";
  GetTempPathW(MAX_PATH, folder);
  const std::wstring file = std::wstring(folder) + L"legend_bench_scene.json";
  {
    std::ofstream out(file.c_str(), std::ios::binary);
    out << SceneJson(count, metaEvery);
  }
  const Clock::time_point loading = Clock::now();
  VARIANT loaded = Call(scene, L"Load", file);
  VariantClear(&loaded);
  const double loadMs = Ms(loading);
  DeleteFileW(file.c_str());
  VARIANT dataSet = Call(scene, L"DataSet", L"BENCH1");
  VARIANT projection = Call(scene, L"Projection", L"p");
  if (dataSet.vt != VT_UNKNOWN || projection.vt != VT_UNKNOWN) return Fail("the scene was not loaded");

  CLSID legendClass{};
  IXChartLegend* legend = nullptr;
  if (FAILED(CLSIDFromProgID(L"BR_Info.XChartLegend", &legendClass)) ||
      FAILED(CoCreateInstance(legendClass, nullptr, CLSCTX_INPROC_SERVER, IID_IXChartLegend,
                              reinterpret_cast<void**>(&legend)))) {
    return Fail("BR_Info.XChartLegend cannot be made (is BR_Info.dll registered?)");
  }
  const long la = 500250000, fi = 2500000;  // 50.025 N 0.25 E, amid the grid
  std::vector<double> misses, hits;
  for (int i = 0; i < repeats; ++i) {
    legend->SetLegendData(nullptr, nullptr, 0, 0);
    Clock::time_point start = Clock::now();
    legend->SetLegendData(dataSet.punkVal, projection.punkVal, la, fi);
    misses.push_back(Ms(start));
    start = Clock::now();
    legend->SetLegendData(dataSet.punkVal, projection.punkVal, la, fi);
    hits.push_back(Ms(start));
  }
  double variation = 0;
  const HRESULT found = legend->get_MagneticVariation(&variation);
  long edition = 0;
  legend->get_EditionNumber(&edition);
  if (found != S_OK || edition != 3) return Fail("the legend was not filled");
  // A cursor moving over the grid (and off it): every call a cache hit of new positions.
  std::vector<double> moves;
  const Clock::time_point sweeping = Clock::now();
  for (int i = 0; i < positions; ++i) {
    const long moveLa = 495000000 + static_cast<long>((i * 7919L) % 110) * 100000;
    const long moveFi = -5000000 + static_cast<long>((i * 104729L) % 110) * 100000;
    const Clock::time_point start = Clock::now();
    legend->SetLegendData(dataSet.punkVal, projection.punkVal, moveLa, moveFi);
    moves.push_back(Ms(start));
  }
  const double sweepMs = Ms(sweeping);
  const Timing miss = Summary(misses), hit = Summary(hits), move = Summary(moves);
  std::printf("scene of %d objects (%d meta objects) loaded in %.1f ms\n", count, (count + metaEvery - 1) / metaEvery,
              loadMs);
  std::printf("SetLegendData, cache miss: %.3f ms median, %.3f ms worst (%d calls)\n", miss.median, miss.worst,
              repeats);
  std::printf("SetLegendData, cache hit:  %.3f ms median, %.3f ms worst (%d calls)\n", hit.median, hit.worst,
              repeats);
  std::printf("SetLegendData at %d positions: %.1f ms in all, %.3f ms median, %.3f ms worst\n", positions, sweepMs,
              move.median, move.worst);
  const double paint = ContoursPaint();
  if (paint < 0) return Fail("the contours view did not paint");
  std::printf("one contours paint, 300 x 600, four shades: %.3f ms\n", paint);

  legend->Release();
  VariantClear(&dataSet);
  VariantClear(&projection);
  scene->Release();
  return 0;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  const int count = argc > 1 ? static_cast<int>(std::wcstol(argv[1], nullptr, 10)) : 10000;
  const int repeats = argc > 2 ? static_cast<int>(std::wcstol(argv[2], nullptr, 10)) : 20;
  const int positions = argc > 3 ? static_cast<int>(std::wcstol(argv[3], nullptr, 10)) : 1000;
  const int metaEvery = argc > 4 ? static_cast<int>(std::wcstol(argv[4], nullptr, 10)) : 1;
  if (count < 1 || count > 1000000 || repeats < 1 || positions < 1 || metaEvery < 1) {
    return Fail("COUNT, REPEATS, POSITIONS and META_EVERY must be positive");
  }
  if (FAILED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED))) return Fail("COM cannot start");
  const int result = Run(count, repeats, positions, metaEvery);
  CoUninitialize();
  return result;
}

// Times SetInfo of a hosted XObjectInspector with 1,000 object records. The scene it writes
// holds, in a chart database, 1,000 beacons with a light and a topmark each (the fill adds
// both below every beacon: 3,000 items), and in a user database 1,000 objects of mixed
// classes (grouped, no relations). Each round replaces the whole tree; the figures are the
// best and the median of the rounds. With "scale": one chart dataset of 100,000 objects,
// 20,000 beacons each holding a light, a topmark, a fog signal, a radio station and the next
// beacon's light, and SetInfo of 5,000 of the beacons, which the fill cuts at its item cap;
// the process's memory is printed before and after.
// Usage: inspector_bench [ROUNDS] [scale]
#include "BR_Info.h"
#include "GeoData.h"

#include <windows.h>
#include <commctrl.h>
#include <psapi.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

namespace {

using Clock = std::chrono::steady_clock;

int Fail(const char* message) {
  std::fprintf(stderr, "inspector_bench: %s\n", message);
  return 1;
}

std::string SceneJson() {
  std::string chart, user;
  const char* classes[] = {"LIGHTS", "UWTROC", "ADMARE", "NAVLNE", "BUAARE", "DEPARE", "WRECKS", "BOYLAT"};
  for (int i = 0; i < 1000; ++i) {
    const std::string n = std::to_string(i);
    if (i) chart += ",", user += ",";
    chart += "{\"name\":\"b" + n + "\",\"class\":\"BCNLAT\",\"point\":[48.3,-4.5],\"attributes\":{\"OBJNAM\":\"Beacon " +
             n + "\",\"COLOUR\":[3]},\"members\":[\"l" + n + "\",\"t" + n + "\"]}";
    chart += ",{\"name\":\"l" + n + "\",\"class\":\"LIGHTS\",\"point\":[48.3,-4.5],\"attributes\":{\"OBJNAM\":\"Light " +
             n + "\",\"SIGPER\":4.0}}";
    chart += ",{\"name\":\"t" + n + "\",\"class\":\"TOPMAR\",\"point\":[48.3,-4.5],\"attributes\":{\"TOPSHP\":3}}";
    const char* cls = classes[i % 8];
    const bool area = std::string(cls) == "ADMARE" || std::string(cls) == "BUAARE" || std::string(cls) == "DEPARE";
    const bool line = std::string(cls) == "NAVLNE";
    user += "{\"name\":\"u" + n + "\",\"class\":\"" + cls + "\"," +
            (area ? "\"area\":[[48,-4],[48,-4.1],[48.1,-4.1]]" : line ? "\"line\":[[48,-4],[48.1,-4.1]]" : "\"point\":[48,-4]") +
            ",\"attributes\":{\"OBJNAM\":\"Object " + n + "\"}}";
  }
  return "{\"format\":\"chartscene 1\",\"databases\":["
         "{\"name\":\"BENCH\",\"kind\":\"chart\",\"datasets\":[{\"id\":\"BENCH001\",\"objects\":[" + chart + "]}]},"
         "{\"name\":\"USERS\",\"kind\":\"user\",\"datasets\":[{\"id\":\"USER0001\",\"objects\":[" + user + "]}]}]}";
}

// 100,000 objects in one dataset, related densely: every light belongs to two beacons.
std::string ScaleJson() {
  constexpr int kBeacons = 20000;
  std::string objects;
  objects.reserve(16u << 20);
  for (int i = 0; i < kBeacons; ++i) {
    const std::string n = std::to_string(i), next = std::to_string((i + 1) % kBeacons);
    if (i) objects += ",";
    objects += "{\"name\":\"b" + n + "\",\"class\":\"BCNLAT\",\"point\":[48.3,-4.5],\"attributes\":{\"OBJNAM\":\"Beacon " +
               n + "\"},\"members\":[\"l" + n + "\",\"t" + n + "\",\"f" + n + "\",\"r" + n + "\",\"l" + next + "\"]}";
    objects += ",{\"name\":\"l" + n + "\",\"class\":\"LIGHTS\",\"point\":[48.3,-4.5],\"attributes\":{\"SIGPER\":4.0}}";
    objects += ",{\"name\":\"t" + n + "\",\"class\":\"TOPMAR\",\"point\":[48.3,-4.5],\"attributes\":{\"TOPSHP\":3}}";
    objects += ",{\"name\":\"f" + n + "\",\"class\":\"FOGSIG\",\"point\":[48.3,-4.5]}";
    objects += ",{\"name\":\"r" + n + "\",\"class\":\"RDOSTA\",\"point\":[48.3,-4.5]}";
  }
  return "{\"format\":\"chartscene 1\",\"databases\":[{\"name\":\"SCALE\",\"kind\":\"chart\",\"datasets\":"
         "[{\"id\":\"SCALE001\",\"objects\":[" + objects + "]}]}]}";
}

double MemoryMb() {
  PROCESS_MEMORY_COUNTERS counters{};
  counters.cb = sizeof counters;
  if (!K32GetProcessMemoryInfo(GetCurrentProcess(), &counters, sizeof counters)) return -1;
  return static_cast<double>(counters.PagefileUsage) / (1024.0 * 1024.0);
}

class Scene {
public:
  bool Load(const std::wstring& path) {
    CLSID clsid{};
    if (FAILED(CLSIDFromProgID(L"ChartScene.Scene", &clsid)) ||
        FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, reinterpret_cast<void**>(&scene_))))
      return false;
    VARIANT result = Call(L"Load", path);
    const bool ok = result.vt != VT_ERROR;
    VariantClear(&result);
    return ok;
  }
  ~Scene() {
    if (scene_) scene_->Release();
  }
  VARIANT Call(const wchar_t* method, const std::wstring& text) {
    VARIANT result;
    VariantInit(&result);
    DISPID id = 0;
    LPOLESTR names[] = {const_cast<LPOLESTR>(method)};
    if (FAILED(scene_->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id))) {
      result.vt = VT_ERROR;
      return result;
    }
    VARIANT argument;
    argument.vt = VT_BSTR;
    argument.bstrVal = SysAllocString(text.c_str());
    DISPPARAMS parameters{&argument, nullptr, 1, 0};
    if (FAILED(scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, &result, nullptr,
                              nullptr)))
      result.vt = VT_ERROR;
    VariantClear(&argument);
    return result;
  }

private:
  IDispatch* scene_ = nullptr;
};

struct Figures {
  double best = 0;
  double median = 0;
  double cpuBest = 0;  // this thread's processor time: steadier on a shared machine
  int items = 0;
};

double ThreadCpuMs() {
  FILETIME created, exited, kernel, user;
  if (!GetThreadTimes(GetCurrentThread(), &created, &exited, &kernel, &user)) return 0;
  auto ticks = [](const FILETIME& t) { return (static_cast<unsigned long long>(t.dwHighDateTime) << 32) | t.dwLowDateTime; };
  return static_cast<double>(ticks(kernel) + ticks(user)) / 10000.0;
}

Figures Time(IXObjectInspector* inspector, VARIANT& records, HWND tree, int rounds) {
  std::vector<double> ms, cpu;
  for (int r = 0; r < rounds; ++r) {
    const Clock::time_point start = Clock::now();
    const double cpuStart = ThreadCpuMs();
    inspector->SetInfo(records);
    cpu.push_back(ThreadCpuMs() - cpuStart);
    ms.push_back(std::chrono::duration<double, std::milli>(Clock::now() - start).count());
  }
  std::sort(ms.begin(), ms.end());
  std::sort(cpu.begin(), cpu.end());
  Figures figures;
  figures.cpuBest = cpu.front();
  figures.best = ms.front();
  figures.median = ms[ms.size() / 2];
  figures.items = tree ? static_cast<int>(SendMessageW(tree, TVM_GETCOUNT, 0, 0)) : -1;
  return figures;
}

HWND FindTree(HWND parent) {
  for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    wchar_t name[64] = {};
    GetClassNameW(child, name, 64);
    if (lstrcmpiW(name, WC_TREEVIEWW) == 0) return child;
    if (HWND deeper = FindTree(child)) return deeper;
  }
  return nullptr;
}

int Run(int rounds, bool scale) {
  HMODULE atl = LoadLibraryW(L"atl.dll");
  using InitFn = BOOL(WINAPI*)();
  using GetControlFn = HRESULT(WINAPI*)(HWND, IUnknown**);
  auto init = atl ? reinterpret_cast<InitFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxWinInit"))) : nullptr;
  auto getControl =
      atl ? reinterpret_cast<GetControlFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxGetControl"))) : nullptr;
  if (!init || !getControl || !init()) return Fail("atl.dll is not available");

  wchar_t folder[MAX_PATH] = {};
  GetTempPathW(MAX_PATH, folder);
  const std::wstring path = std::wstring(folder) + L"inspector_bench_" + std::to_wstring(GetCurrentProcessId()) + L".json";
  const std::string json = scale ? ScaleJson() : SceneJson();
  HANDLE file = CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, FILE_ATTRIBUTE_NORMAL, nullptr);
  if (file == INVALID_HANDLE_VALUE) return Fail("the scene file cannot be written");
  DWORD written = 0;
  WriteFile(file, json.data(), static_cast<DWORD>(json.size()), &written, nullptr);
  CloseHandle(file);

  int status = 0;
  {
    Scene scene;
    const bool loaded = scene.Load(path);
    DeleteFileW(path.c_str());
    if (!loaded) return Fail("ChartScene.Scene cannot load the scene (is chartscene.dll registered?)");
    const double loadedMb = MemoryMb();
    std::wstring beacons, users;
    for (int i = 0; i < (scale ? 5000 : 1000); ++i) {
      beacons += (i ? L",b" : L"b") + std::to_wstring(i);
      users += (i ? L",u" : L"u") + std::to_wstring(i);
    }
    VARIANT chartRecords = scene.Call(L"ObjectRecords", beacons);
    VARIANT userRecords = scene.Call(L"ObjectRecords", users);
    VARIANT oneRecord = scene.Call(L"ObjectRecords", L"b0");
    if (chartRecords.vt != (VT_ARRAY | VT_UI1) || (!scale && userRecords.vt != (VT_ARRAY | VT_UI1)))
      return Fail("no records");

    HWND host = CreateWindowExW(0, L"AtlAxWin", L"BR_Info.XObjectInspector", WS_POPUP | WS_VISIBLE, 0, 0, 600, 400,
                                nullptr, nullptr, GetModuleHandleW(nullptr), nullptr);
    IUnknown* control = nullptr;
    IXObjectInspector* inspector = nullptr;
    if (!host || FAILED(getControl(host, &control)) ||
        FAILED(control->QueryInterface(IID_IXObjectInspector, reinterpret_cast<void**>(&inspector)))) {
      status = Fail("BR_Info.XObjectInspector cannot be hosted");
    } else {
      HWND tree = FindTree(host);
      if (scale) {
        const Figures big = Time(inspector, chartRecords, tree, rounds);
        const double filledMb = MemoryMb();
        for (int i = 0; i < rounds; ++i) inspector->SetInfo(chartRecords);
        std::printf("scene: 100000 objects in one dataset, records: 5000, rounds: %d\n", rounds);
        std::printf("SetInfo, 5000 beacons of 5 related objects each: best %.1f ms, median %.1f ms, processor best "
                    "%.1f ms (%d items)\n",
                    big.best, big.median, big.cpuBest, big.items);
        std::printf("memory: %.1f MB with the scene loaded, %.1f MB after the fills, %.1f MB after %d more\n",
                    loadedMb, filledMb, MemoryMb(), rounds);
        inspector->Release();
        inspector = nullptr;
      }
    }
    if (inspector) {
      HWND tree = FindTree(host);
      const Figures chart = Time(inspector, chartRecords, tree, rounds);
      const Figures user = Time(inspector, userRecords, tree, rounds);
      const Figures one = Time(inspector, oneRecord, tree, rounds);
      std::printf("records: 1000, rounds: %d\n", rounds);
      auto line = [](const char* what, const Figures& f) {
        std::printf("SetInfo, %s: best %.1f ms, median %.1f ms, processor best %.1f ms (%d items)\n", what, f.best,
                    f.median, f.cpuBest, f.items);
      };
      line("chart beacons with a light and a topmark each", chart);
      line("grouped user objects", user);
      line("one beacon (clearing, header, the selected header's metadata)", one);
      inspector->Release();
    }
    if (control) control->Release();
    if (host) DestroyWindow(host);
    VariantClear(&chartRecords);
    VariantClear(&userRecords);
    VariantClear(&oneRecord);
  }
  return status;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  const int rounds = argc > 1 ? std::max(1, _wtoi(argv[1])) : 5;
  const bool scale = argc > 2 && lstrcmpiW(argv[2], L"scale") == 0;
  if (FAILED(OleInitialize(nullptr))) return Fail("OLE cannot start");
  const int status = Run(rounds, scale);
  OleUninitialize();
  return status;
}

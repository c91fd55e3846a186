// ITidesDatabase at its boundary: every member with null out-pointers, bad and extreme
// indices, NaN and infinite box corners, awkward folder texts, before and after Initialize,
// early bound and late bound through IDispatch::Invoke as script hosts call it. Each row
// names the call and the result it must give; after each row the database must read as
// before, and out-parameters of a failed call must hold what they held.
#include "tests/wine/boundary/boundary_support.h"
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <climits>
#include <functional>
#include <string>
#include <vector>

using namespace br::test;
using namespace br::test::boundary;

namespace {

const TestConstituent kLevel = {0, 1500, 0};
const TestConstituent kM2 = {29, 1200, 1100};

std::vector<TestStation> Stations() {
  return {
      {"North", 600, 1200, 0, {kLevel, kM2}},
      {"South", -630, -315, 1, {kLevel, kM2}},
      {"Greenwich", 0, 0, 0, {kLevel}},
  };
}
constexpr long kStations = 3;

enum DispId : DISPID { kInitialize = 1, kNumPorts = 2, kGetPortInfo = 3, kGetPort = 4, kGetPorts = 5 };

// What a database shows from outside; equal before and after a call that changes nothing.
struct Fingerprint {
  HRESULT countResult = S_OK;
  long count = 0;
  double latitude = 0, longitude = 0;
  std::wstring name;
  bool operator==(const Fingerprint& o) const {
    return countResult == o.countResult && count == o.count && latitude == o.latitude &&
           longitude == o.longitude && name == o.name;
  }
};

Fingerprint Read(ITidesDatabase* db) {
  Fingerprint f;
  f.countResult = db->get_NumPorts(&f.count);
  if (f.countResult == S_OK && f.count > 0) {
    BSTR name = nullptr;
    db->GetPortInfo(f.count - 1, &f.latitude, &f.longitude, &name);
    f.name = name ? name : L"<null>";
    SysFreeString(name);
  }
  return f;
}

// Out-parameters a row may pass; Reset() puts the untouched markers back.
struct Outs {
  long count;
  double latitude, longitude;
  BSTR name;
  IUnknown* port;
  VARIANT list;
  BSTR marker = SysAllocString(L"marker");
  Outs() { Reset(); }
  ~Outs() { SysFreeString(marker); }
  void Reset() {
    count = kUntouchedLong;
    latitude = longitude = kUntouchedDouble;
    name = marker;
    port = kUntouchedUnknown;
    VariantInit(&list);
    list.vt = VT_I2;
    list.iVal = -3;
  }
  bool Untouched() const {
    return count == kUntouchedLong && latitude == kUntouchedDouble && longitude == kUntouchedDouble &&
           name == marker && port == kUntouchedUnknown && list.vt == VT_I2 && list.iVal == -3;
  }
};

struct Row {
  const char* what;
  std::function<HRESULT()> call;
  HRESULT expected;
  // Checked after the call; by default, that no out-parameter was written.
  std::function<bool()> outs = nullptr;
};

void RunRows(ITidesDatabase* db, Outs& outs, const std::vector<Row>& rows) {
  for (const Row& row : rows) {
    INFO(std::string(row.what));
    outs.Reset();
    const Fingerprint before = Read(db);
    CHECK(row.call() == row.expected);
    if (row.outs) CHECK(row.outs());
    else CHECK(outs.Untouched());
    CHECK(Read(db) == before);
  }
}

ITidesDatabase* NewDatabase(const DllUnderTest& dll) {
  ITidesDatabase* db = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &db) == S_OK);
  return db;
}

HRESULT InitializeWith(ITidesDatabase* db, const std::wstring& folder) {
  Variant text = Variant::Bstr(folder);
  return db->Initialize(text.get().bstrVal);
}

// Number of ports in a GetPorts result, releasing nothing (the VARIANT still owns them).
long PortCount(const VARIANT& list) {
  if (list.vt != (VT_ARRAY | VT_UNKNOWN)) return -1;
  LONG lower = 0, upper = -1;
  SafeArrayGetLBound(list.parray, 1, &lower);
  SafeArrayGetUBound(list.parray, 1, &upper);
  return upper - lower + 1;
}

}  // namespace

TEST_CASE("ITidesDatabase before Initialize: every member refuses and writes nothing") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  ITidesDatabase* db = NewDatabase(dll);
  Outs o;
  RunRows(db, o, {
      {"NumPorts", [&] { return db->get_NumPorts(&o.count); }, E_ACCESSDENIED},
      {"NumPorts(null)", [&] { return db->get_NumPorts(nullptr); }, E_ACCESSDENIED},
      {"GetPortInfo(0)", [&] { return db->GetPortInfo(0, &o.latitude, &o.longitude, &o.name); }, E_ACCESSDENIED},
      {"GetPortInfo(-1, null, null, null)", [&] { return db->GetPortInfo(-1, nullptr, nullptr, nullptr); },
       E_ACCESSDENIED},
      {"GetPort(0)", [&] { return db->GetPort(0, &o.port); }, E_ACCESSDENIED},
      {"GetPort(0, null)", [&] { return db->GetPort(0, nullptr); }, E_ACCESSDENIED},
      {"GetPorts(world)", [&] { return db->GetPorts(-90, -180, 90, 180, &o.list); }, E_ACCESSDENIED},
      {"GetPorts(null)", [&] { return db->GetPorts(-90, -180, 90, 180, nullptr); }, E_ACCESSDENIED},
  });
  db->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("ITidesDatabase Initialize: folder texts that name no station folder, then a good one") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  ITidesDatabase* db = NewDatabase(dll);
  Outs o;
  const std::wstring good = folder.Path();
  RunRows(db, o, {
      {"null BSTR", [&] { return db->Initialize(nullptr); }, E_INVALIDARG},
      {"empty text", [&] { return InitializeWith(db, L""); }, E_INVALIDARG},
      {"241 characters", [&] { return InitializeWith(db, good + L"\\" + std::wstring(240 - good.size(), L'x')); },
       E_INVALIDARG},
      {"a very long text", [&] { return InitializeWith(db, std::wstring(100000, L'a')); }, E_INVALIDARG},
      {"a folder that does not exist", [&] { return InitializeWith(db, good + L"\\missing"); }, E_INVALIDARG},
      {"a station file instead of its folder", [&] { return InitializeWith(db, good + L"\\td_num.ntx"); },
       E_INVALIDARG},
      {"characters outside the ANSI code page", [&] { return InitializeWith(db, good + L"\x6771\x4eac"); },
       E_INVALIDARG},
      {"only separators", [&] { return InitializeWith(db, L"\\\\\\"); }, E_INVALIDARG},
  });
  CHECK(db->get_NumPorts(&o.count) == E_ACCESSDENIED);

  // None of the refusals keeps a good folder from opening afterwards. A text with a zero
  // inside names the folder before the zero, as the file functions read it (buffers
  // filled by API calls in Basic hosts carry such tails).
  CHECK(InitializeWith(db, good + std::wstring(1, L'\0') + L"junk") == S_OK);
  CHECK(db->get_NumPorts(&o.count) == S_OK);
  CHECK(o.count == kStations);
  db->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("ITidesDatabase after Initialize: null out-pointers, indices and boxes at the extremes") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  ITidesDatabase* db = NewDatabase(dll);
  REQUIRE(InitializeWith(db, folder.Path()) == S_OK);
  Outs o;
  auto portIsNull = [&] { return o.port == nullptr; };
  auto positionOnly = [&] {
    return o.latitude == Degrees(-630) && o.longitude == Degrees(-315) && o.name == o.marker;
  };
  auto empty = [&] { return o.list.vt == VT_EMPTY; };
  auto allStations = [&] {
    const bool all = PortCount(o.list) == kStations;
    VariantClear(&o.list);
    return all;
  };
  RunRows(db, o, {
      // Null out-pointers come before the index check.
      {"NumPorts(null)", [&] { return db->get_NumPorts(nullptr); }, E_POINTER},
      {"GetPortInfo(lat null)", [&] { return db->GetPortInfo(0, nullptr, &o.longitude, &o.name); }, E_POINTER},
      {"GetPortInfo(lon null)", [&] { return db->GetPortInfo(0, &o.latitude, nullptr, &o.name); }, E_POINTER},
      {"GetPortInfo(-1, null, null)", [&] { return db->GetPortInfo(-1, nullptr, nullptr, &o.name); }, E_POINTER},
      {"GetPort(0, null)", [&] { return db->GetPort(0, nullptr); }, E_POINTER},
      {"GetPort(-1, null)", [&] { return db->GetPort(-1, nullptr); }, E_POINTER},
      {"GetPorts(null)", [&] { return db->GetPorts(-90, -180, 90, 180, nullptr); }, E_POINTER},
      {"GetPorts(NaN, null)", [&] { return db->GetPorts(kNaN, kNaN, kNaN, kNaN, nullptr); }, E_POINTER},
      // Indices outside the stations.
      {"GetPortInfo(-1)", [&] { return db->GetPortInfo(-1, &o.latitude, &o.longitude, &o.name); }, E_INVALIDARG},
      {"GetPortInfo(count)", [&] { return db->GetPortInfo(kStations, &o.latitude, &o.longitude, &o.name); },
       E_INVALIDARG},
      {"GetPortInfo(LONG_MAX)", [&] { return db->GetPortInfo(LONG_MAX, &o.latitude, &o.longitude, &o.name); },
       E_INVALIDARG},
      {"GetPortInfo(LONG_MIN)", [&] { return db->GetPortInfo(LONG_MIN, &o.latitude, &o.longitude, &o.name); },
       E_INVALIDARG},
      {"GetPortInfo(32767)", [&] { return db->GetPortInfo(32767, &o.latitude, &o.longitude, &o.name); },
       E_INVALIDARG},
      {"GetPortInfo(65536 + 1)", [&] { return db->GetPortInfo(65537, &o.latitude, &o.longitude, &o.name); },
       E_INVALIDARG},
      {"GetPortInfo(1) without a name", [&] { return db->GetPortInfo(1, &o.latitude, &o.longitude, nullptr); }, S_OK,
       positionOnly},
      {"GetPort(-1)", [&] { return db->GetPort(-1, &o.port); }, S_OK, portIsNull},
      {"GetPort(count)", [&] { return db->GetPort(kStations, &o.port); }, S_OK, portIsNull},
      {"GetPort(LONG_MAX)", [&] { return db->GetPort(LONG_MAX, &o.port); }, S_OK, portIsNull},
      {"GetPort(LONG_MIN)", [&] { return db->GetPort(LONG_MIN, &o.port); }, S_OK, portIsNull},
      {"GetPort(65536)", [&] { return db->GetPort(65536, &o.port); }, S_OK, portIsNull},
      // Boxes: NaN in any corner compares false everywhere, so nothing is inside.
      {"GetPorts(NaN latMin)", [&] { return db->GetPorts(kNaN, -180, 90, 180, &o.list); }, S_OK, empty},
      {"GetPorts(NaN lonMin)", [&] { return db->GetPorts(-90, kNaN, 90, 180, &o.list); }, S_OK, empty},
      {"GetPorts(NaN latMax)", [&] { return db->GetPorts(-90, -180, kNaN, 180, &o.list); }, S_OK, empty},
      {"GetPorts(NaN lonMax)", [&] { return db->GetPorts(-90, -180, 90, kNaN, &o.list); }, S_OK, empty},
      {"GetPorts(infinite box)", [&] { return db->GetPorts(-kInfinity, -kInfinity, kInfinity, kInfinity, &o.list); },
       S_OK, allStations},
      {"GetPorts(infinite box, corners swapped)",
       [&] { return db->GetPorts(kInfinity, kInfinity, -kInfinity, -kInfinity, &o.list); }, S_OK, allStations},
      {"GetPorts(largest doubles)", [&] { return db->GetPorts(-kLargest, -kLargest, kLargest, kLargest, &o.list); },
       S_OK, allStations},
      {"GetPorts(one point on a station)", [&] { return db->GetPorts(0, 0, 0, 0, &o.list); }, S_OK, empty},
      {"GetPorts(denormal box around a station)",
       [&] { return db->GetPorts(-kSmallestDenormal, -kSmallestDenormal, kSmallestDenormal, kSmallestDenormal, &o.list); },
       S_OK, [&] { const bool one = PortCount(o.list) == 1; VariantClear(&o.list); return one; }},
      {"GetPorts(infinite latitudes, NaN longitudes)",
       [&] { return db->GetPorts(-kInfinity, kNaN, kInfinity, kNaN, &o.list); }, S_OK, empty},
      // Once open, later folders are ignored, whatever they are.
      {"Initialize(null) again", [&] { return db->Initialize(nullptr); }, S_OK},
      {"Initialize(missing folder) again", [&] { return InitializeWith(db, L"C:\\no\\such\\folder"); }, S_OK},
  });
  db->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("ITidesDatabase late bound: argument types, counts and forms as script hosts pass them") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  ITidesDatabase* db = NewDatabase(dll);
  IDispatch* d = db;

  struct LateRow {
    const char* what;
    std::function<void(LateCall&)> build;
    DISPID id;
    WORD flags;
    HRESULT expected;  // for DISP_E_EXCEPTION: the method's own failure in the exception
    // Where Wine's type-library dispatch answers otherwise (it does not count surplus
    // arguments, and turns NaN into a number where a long is wanted): its result.
    HRESULT onWine = E_UNEXPECTED;
  };
  auto runLate = [&](const std::vector<LateRow>& rows) {
    for (const LateRow& row : rows) {
      INFO(std::string(row.what));
      const Fingerprint before = Read(db);
      LateCall call(d, row.id, row.flags);
      row.build(call);
      const HRESULT hr = call.Run();
      const HRESULT result = LateResult(hr, call.exception);
      CAPTURE(result);
    CHECK((result == row.expected || result == row.onWine));
      CHECK(Read(db) == before);
    }
  };

  // Before the folder is open: refusals come back as exceptions with the method's result.
  runLate({
      {"Initialize(VT_I4 5)", [](LateCall& c) { c.Arg(Variant::I4(5)); }, kInitialize, DISPATCH_METHOD, E_INVALIDARG},
      {"Initialize(VT_EMPTY)", [](LateCall& c) { c.Arg(Variant::Empty()); }, kInitialize, DISPATCH_METHOD,
       E_INVALIDARG},
      {"Initialize(VT_NULL)", [](LateCall& c) { c.Arg(Variant::Null()); }, kInitialize, DISPATCH_METHOD,
       DISP_E_TYPEMISMATCH},
      {"Initialize(null BSTR)", [](LateCall& c) { c.Arg(Variant::NullBstr()); }, kInitialize, DISPATCH_METHOD,
       E_INVALIDARG},
      {"Initialize(VT_ARRAY)", [](LateCall& c) { c.Arg(Variant::Array(VT_I4, MakeLongArray({1, 2}))); }, kInitialize,
       DISPATCH_METHOD, DISP_E_TYPEMISMATCH},
      {"Initialize()", [](LateCall&) {}, kInitialize, DISPATCH_METHOD, DISP_E_BADPARAMCOUNT},
      {"Initialize(two texts)", [](LateCall& c) { c.Arg(Variant::Bstr(L"a")).Arg(Variant::Bstr(L"b")); }, kInitialize,
       DISPATCH_METHOD, DISP_E_BADPARAMCOUNT, E_INVALIDARG},
      {"NumPorts", [](LateCall&) {}, kNumPorts, DISPATCH_PROPERTYGET, E_ACCESSDENIED},
      {"unknown member 99", [](LateCall&) {}, 99, DISPATCH_METHOD, DISP_E_MEMBERNOTFOUND},
      {"interface other than IID_NULL", [](LateCall& c) { c.Interface(IID_ITidesDatabase); }, kNumPorts,
       DISPATCH_PROPERTYGET, DISP_E_UNKNOWNINTERFACE},
  });

  // The folder by reference, as Basic passes a String variable.
  {
    Variant path = Variant::Bstr(folder.Path());
    VARIANT inner = path.get();
    LateCall call(d, kInitialize);
    call.Arg(Variant::RefVariant(&inner));
    CHECK(LateResult(call.Run(), call.exception) == S_OK);
  }

  double latitude = kUntouchedDouble, longitude = kUntouchedDouble;
  BSTR name = nullptr;
  runLate({
      {"NumPorts as a method", [](LateCall&) {}, kNumPorts, DISPATCH_METHOD | DISPATCH_PROPERTYGET, S_OK},
      {"GetPortInfo(text index \"x\")",
       [&](LateCall& c) {
         c.Arg(Variant::Bstr(L"x")).Arg(Variant::RefR8(&latitude)).Arg(Variant::RefR8(&longitude)).Arg(
             Variant::RefBstr(&name));
       },
       kGetPortInfo, DISPATCH_METHOD, DISP_E_TYPEMISMATCH},
      {"GetPortInfo(index 1e300)",
       [&](LateCall& c) {
         c.Arg(Variant::R8(1e300)).Arg(Variant::RefR8(&latitude)).Arg(Variant::RefR8(&longitude)).Arg(
             Variant::RefBstr(&name));
       },
       kGetPortInfo, DISPATCH_METHOD, DISP_E_OVERFLOW},
      {"GetPortInfo(index NaN)",
       [&](LateCall& c) {
         c.Arg(Variant::R8(kNaN)).Arg(Variant::RefR8(&latitude)).Arg(Variant::RefR8(&longitude)).Arg(
             Variant::RefBstr(&name));
       },
       kGetPortInfo, DISPATCH_METHOD, DISP_E_OVERFLOW, E_INVALIDARG},
      {"GetPortInfo(index -1)",
       [&](LateCall& c) {
         c.Arg(Variant::I4(-1)).Arg(Variant::RefR8(&latitude)).Arg(Variant::RefR8(&longitude)).Arg(
             Variant::RefBstr(&name));
       },
       kGetPortInfo, DISPATCH_METHOD, E_INVALIDARG},
      {"GetPortInfo(missing outs)", [&](LateCall& c) { c.Arg(Variant::I4(0)); }, kGetPortInfo, DISPATCH_METHOD,
       DISP_E_BADPARAMCOUNT},
      {"GetPort(index \"1\")", [](LateCall& c) { c.Arg(Variant::Bstr(L"1")); }, kGetPort, DISPATCH_METHOD, S_OK},
      {"GetPort(index VT_NULL)", [](LateCall& c) { c.Arg(Variant::Null()); }, kGetPort, DISPATCH_METHOD,
       DISP_E_TYPEMISMATCH},
      {"GetPort(index as an object)", [&](LateCall& c) { c.Arg(Variant::Dispatch(d)); }, kGetPort, DISPATCH_METHOD,
       DISP_E_TYPEMISMATCH},
      {"GetPorts(text corner)",
       [](LateCall& c) {
         c.Arg(Variant::Bstr(L"north")).Arg(Variant::R8(-180)).Arg(Variant::R8(90)).Arg(Variant::R8(180));
       },
       kGetPorts, DISPATCH_METHOD, DISP_E_TYPEMISMATCH},
      {"GetPorts(NaN corners)",
       [](LateCall& c) {
         c.Arg(Variant::R8(kNaN)).Arg(Variant::R8(kNaN)).Arg(Variant::R8(kNaN)).Arg(Variant::R8(kNaN));
       },
       kGetPorts, DISPATCH_METHOD, S_OK},
      {"GetPorts(three corners)",
       [](LateCall& c) { c.Arg(Variant::R8(-90)).Arg(Variant::R8(-180)).Arg(Variant::R8(90)); }, kGetPorts,
       DISPATCH_METHOD, DISP_E_BADPARAMCOUNT},
  });
  CHECK(latitude == kUntouchedDouble);
  CHECK(longitude == kUntouchedDouble);
  CHECK(name == nullptr);

  // A whole box through Invoke: the ports come back as the retval VARIANT.
  {
    LateCall call(d, kGetPorts);
    call.Arg(Variant::I2(-90)).Arg(Variant::Bstr(L"-180")).Arg(Variant::Date(90)).Arg(Variant::R4(180));
    REQUIRE(call.Run() == S_OK);
    CHECK(PortCount(call.result) == kStations);
  }
  db->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

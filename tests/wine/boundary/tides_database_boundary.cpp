// ITidesDatabase with bad input: each row's result, out-parameters untouched, database unchanged.
#include "tests/wine/boundary/boundary_support.h"

#include <climits>
#include <tuple>

using namespace br::test;
using namespace br::test::boundary;

namespace {

std::vector<TestStation> Stations() {
  const TestConstituent level = {0, 1500, 0}, m2 = {29, 1200, 1100};
  return {{"North", 600, 1200, 0, {level, m2}}, {"South", -630, -315, 1, {level, m2}}, {"Greenwich", 0, 0, 0, {level}}};
}
constexpr long kStations = 3;
enum DispId : DISPID { kInitialize = 1, kNumPorts, kGetPortInfo, kGetPort, kGetPorts };

// What the database shows from outside: the count and the last station.
std::tuple<HRESULT, long, double, double, std::wstring> Read(ITidesDatabase* db) {
  long count = 0;
  double latitude = 0, longitude = 0;
  BSTR name = nullptr;
  const HRESULT counted = db->get_NumPorts(&count);
  if (counted == S_OK && count > 0) db->GetPortInfo(count - 1, &latitude, &longitude, &name);
  const std::wstring text = name ? name : L"<null>";
  SysFreeString(name);
  return {counted, count, latitude, longitude, text};
}

HRESULT InitializeWith(ITidesDatabase* db, const std::wstring& folder) {
  return db->Initialize(Variant::Bstr(folder).get().bstrVal);
}

long PortCount(const VARIANT& list) {
  return list.vt == (VT_ARRAY | VT_UNKNOWN) ? static_cast<long>(list.parray->rgsabound[0].cElements) : -1;
}

}  // namespace

TEST_CASE("ITidesDatabase before Initialize: every member refuses and writes nothing; bad folders keep it closed") {
  OpenTides t(Stations(), false);
  ITidesDatabase* db = t.db;
  Outs o;
  const std::wstring good = t.folder.Path();
  RunRows({
      {"NumPorts", [&] { return db->get_NumPorts(&o.number); }, E_ACCESSDENIED},
      {"NumPorts(null)", [&] { return db->get_NumPorts(nullptr); }, E_ACCESSDENIED},
      {"GetPortInfo(0)", [&] { return db->GetPortInfo(0, &o.value, &o.second, &o.name); }, E_ACCESSDENIED},
      {"GetPort(0)", [&] { return db->GetPort(0, &o.unknown); }, E_ACCESSDENIED},
      {"GetPorts(world)", [&] { return db->GetPorts(-90, -180, 90, 180, &o.variant); }, E_ACCESSDENIED},
      {"Initialize(null BSTR)", [&] { return db->Initialize(nullptr); }, E_INVALIDARG},
      {"Initialize(empty text)", [&] { return InitializeWith(db, L""); }, E_INVALIDARG},
      {"Initialize(241 characters)",
       [&] { return InitializeWith(db, good + L"\\" + std::wstring(240 - good.size(), L'x')); }, E_INVALIDARG},
      {"Initialize(missing folder)", [&] { return InitializeWith(db, good + L"\\missing"); }, E_INVALIDARG},
      {"Initialize(a station file)", [&] { return InitializeWith(db, good + L"\\td_num.ntx"); }, E_INVALIDARG},
      {"Initialize(outside the ANSI code page)", [&] { return InitializeWith(db, good + L"\x6771\x4eac"); },
       E_INVALIDARG},
  }, [&] { return Read(db); }, &o);
  // A zero inside ends the folder text, as the file functions read it (Basic buffers).
  CHECK(InitializeWith(db, good + std::wstring(1, L'\0') + L"junk") == S_OK);
  CHECK(db->get_NumPorts(&o.number) == S_OK);
  CHECK(o.number == kStations);
  CHECK(t.Finish() == S_OK);
}

TEST_CASE("ITidesDatabase after Initialize: null out-pointers, indices and boxes at the extremes") {
  OpenTides t(Stations());
  ITidesDatabase* db = t.db;
  Outs o;
  auto portIsNull = [&] { return o.unknown == nullptr; };
  auto ports = [&](long n) {
    return [&o, n] {
      const bool same = (n == 0 ? o.variant.vt == VT_EMPTY : PortCount(o.variant) == n);
      VariantClear(&o.variant);
      return same;
    };
  };
  auto info = [&](long i) { return db->GetPortInfo(i, &o.value, &o.second, &o.name); };
  auto box = [&](double a, double b, double c, double d) { return db->GetPorts(a, b, c, d, &o.variant); };
  const double n = kNaN, inf = kInfinity, tiny = kSmallestDenormal;
  RunRows({
      // Null out-pointers come before the index check.
      {"NumPorts(null)", [&] { return db->get_NumPorts(nullptr); }, E_POINTER},
      {"GetPortInfo(lat null)", [&] { return db->GetPortInfo(0, nullptr, &o.second, &o.name); }, E_POINTER},
      {"GetPortInfo(-1, null, null)", [&] { return db->GetPortInfo(-1, nullptr, nullptr, &o.name); }, E_POINTER},
      {"GetPort(-1, null)", [&] { return db->GetPort(-1, nullptr); }, E_POINTER},
      {"GetPorts(NaN, null)", [&] { return db->GetPorts(n, n, n, n, nullptr); }, E_POINTER},
      {"GetPortInfo(-1)", [&] { return info(-1); }, E_INVALIDARG},
      {"GetPortInfo(count)", [&] { return info(kStations); }, E_INVALIDARG},
      {"GetPortInfo(LONG_MIN)", [&] { return info(LONG_MIN); }, E_INVALIDARG},
      {"GetPortInfo(65537)", [&] { return info(65537); }, E_INVALIDARG},
      {"GetPortInfo(1) without a name", [&] { return db->GetPortInfo(1, &o.value, &o.second, nullptr); }, S_OK,
       [&] { return o.value == Degrees(-630) && o.second == Degrees(-315) && o.name == o.marker; }},
      {"GetPort(-1)", [&] { return db->GetPort(-1, &o.unknown); }, S_OK, portIsNull},
      {"GetPort(count)", [&] { return db->GetPort(kStations, &o.unknown); }, S_OK, portIsNull},
      {"GetPort(65536)", [&] { return db->GetPort(65536, &o.unknown); }, S_OK, portIsNull},
      // NaN in any corner compares false everywhere: nothing is inside.
      {"GetPorts(NaN latMin)", [&] { return box(n, -180, 90, 180); }, S_OK, ports(0)},
      {"GetPorts(NaN lonMax)", [&] { return box(-90, -180, 90, n); }, S_OK, ports(0)},
      {"GetPorts(infinite box)", [&] { return box(-inf, -inf, inf, inf); }, S_OK, ports(kStations)},
      {"GetPorts(denormal box)", [&] { return box(-tiny, -tiny, tiny, tiny); }, S_OK, ports(1)},
      // Once open, a later null folder is ignored.
      {"Initialize(null) again", [&] { return db->Initialize(nullptr); }, S_OK},
  }, [&] { return Read(db); }, &o);
  CHECK(t.Finish() == S_OK);
}

TEST_CASE("ITidesDatabase late bound: the method's own answers and the forms script hosts pass") {
  OpenTides t(Stations(), false);
  ITidesDatabase* db = t.db;
  // Through the type library the method's refusal comes back as the exception's scode;
  // an interface other than IID_NULL is refused before it.
  RunRows({
      {"Initialize(VT_I4 5)", [&] { return LateCall(db, kInitialize).Arg(Variant::I4(5)).Result(); }, E_INVALIDARG},
      {"interface other than IID_NULL",
       [&] { return LateCall(db, kNumPorts, DISPATCH_PROPERTYGET).Interface(IID_ITidesDatabase).Result(); },
       DISP_E_UNKNOWNINTERFACE},
  }, [&] { return Read(db); });
  LateCall count(db, kNumPorts, DISPATCH_PROPERTYGET);  // the refusal as an exception with its scode
  CHECK(count.Run() == DISP_E_EXCEPTION);
  CHECK(count.exception.scode == E_ACCESSDENIED);

  // The folder by reference, as Basic passes a String variable.
  Variant path = Variant::Bstr(t.folder.Path());
  LateCall open(db, kInitialize);
  CHECK(open.Arg(Variant::RefVariant(&path.get())).Result() == S_OK);

  double latitude = kUntouchedDouble, longitude = kUntouchedDouble;
  BSTR name = nullptr;
  LateCall info(db, kGetPortInfo);
  info.Arg(Variant::R8(-1)).Arg(Variant::RefR8(&latitude)).Arg(Variant::RefR8(&longitude)).Arg(Variant::RefBstr(&name));
  CHECK(info.Result() == E_INVALIDARG);
  CHECK(latitude == kUntouchedDouble);
  CHECK(longitude == kUntouchedDouble);
  CHECK(name == nullptr);

  {  // A whole box through Invoke: the array comes back as the result.
    LateCall call(db, kGetPorts);
    call.Arg(Variant::I2(-90)).Arg(Variant::Bstr(L"-180")).Arg(Variant::R8(90)).Arg(Variant::R8(180));
    REQUIRE(call.Run() == S_OK);
    CHECK(PortCount(call.result) == kStations);
  }
  CHECK(t.Finish() == S_OK);
}

// ITidesDatabase with bad input: each row's result, out-parameters untouched, database unchanged.
#include "tests/wine/common/boundary_support.h"

#include <tuple>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr long kStations = 3;  // ThreeStations()

// What the database shows from outside: the count and the last station's position and name.
std::tuple<HRESULT, long, double, double, std::wstring> Read(ITidesDatabase* db) {
  long count = 0;
  Outs o;
  const HRESULT counted = db->get_NumPorts(&count);
  if (counted != S_OK || db->GetPortInfo(count - 1, &o.value, &o.second, &o.name) != S_OK) return {counted, 0, 0, 0, L""};
  const std::wstring text(o.name, SysStringLen(o.name));
  SysFreeString(o.name);
  return {counted, count, o.value, o.second, text};
}

HRESULT InitializeWith(ITidesDatabase* db, const std::wstring& folder) {
  return db->Initialize(Variant::Bstr(folder).get().bstrVal);
}

long PortCount(const VARIANT& list) {
  return list.vt == (VT_ARRAY | VT_UNKNOWN) ? static_cast<long>(list.parray->rgsabound[0].cElements) : -1;
}

}  // namespace

TEST_CASE("ITidesDatabase before Initialize: every member refuses and writes nothing; bad folders keep it closed") {
  OpenTides t(ThreeStations(), false);
  ITidesDatabase* db = t.db.Get();
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
      {"Initialize(outside the ANSI code page)", [&] { return InitializeWith(db, good + L"\x6771\x4eac"); },
       E_INVALIDARG},
  }, [&] { return Read(db); }, &o);
  // A zero inside ends the folder text, as the file functions read it (Basic buffers).
  CHECK(InitializeWith(db, good + std::wstring(1, L'\0') + L"junk") == S_OK);
  CHECK(CountOf(db) == kStations);
  CHECK(t.Finish() == S_OK);
}

TEST_CASE("ITidesDatabase after Initialize: null out-pointers, indices and boxes at the extremes") {
  OpenTides t(ThreeStations());
  ITidesDatabase* db = t.db.Get();
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
  const double n = kNaN, inf = kInfinity;
  RunRows({
      // Null out-pointers come before the index check.
      {"NumPorts(null)", [&] { return db->get_NumPorts(nullptr); }, E_POINTER},
      {"GetPortInfo(lat null)", [&] { return db->GetPortInfo(0, nullptr, &o.second, &o.name); }, E_POINTER},
      {"GetPort(-1, null)", [&] { return db->GetPort(-1, nullptr); }, E_POINTER},
      {"GetPorts(NaN, null)", [&] { return db->GetPorts(n, n, n, n, nullptr); }, E_POINTER},
      {"GetPortInfo(-1)", [&] { return info(-1); }, E_INVALIDARG},
      {"GetPortInfo(count)", [&] { return info(kStations); }, E_INVALIDARG},
      {"GetPortInfo(65537)", [&] { return info(65537); }, E_INVALIDARG},
      {"GetPortInfo(1) without a name", [&] { return db->GetPortInfo(1, &o.value, &o.second, nullptr); }, S_OK,
       [&] { return o.value == Degrees(610) && o.second == Degrees(610) && o.name == o.marker; }},
      {"GetPort(-1)", [&] { return db->GetPort(-1, &o.unknown); }, S_OK, portIsNull},
      {"GetPort(count)", [&] { return db->GetPort(kStations, &o.unknown); }, S_OK, portIsNull},
      // NaN in any corner compares false everywhere: nothing is inside.
      {"GetPorts(NaN latMin)", [&] { return box(n, -180, 90, 180); }, S_OK, ports(0)},
      {"GetPorts(infinite box)", [&] { return box(-inf, -inf, inf, inf); }, S_OK, ports(kStations)},
      // Once open, a later null folder is ignored.
      {"Initialize(null) again", [&] { return db->Initialize(nullptr); }, S_OK},
  }, [&] { return Read(db); }, &o);
  CHECK(t.Finish() == S_OK);
}

// Bad input at IXObjectInspector's boundary, early and late bound: VARIANTs of every type
// and by-reference form for SetInfo and AddInfo, record arrays of every shape, owners that
// are no database, null out-pointers, identity texts that are no GUIDs. A row names the
// call, its result and the tree it leaves; a refused AddInfo leaves the tree as it was.
#include "tests/wine/inspector/InspectorControl.h"

#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/common/boundary_support.h"

#include <doctest/doctest.h>

#include <cstring>
#include <functional>
#include <string>
#include <vector>

using namespace br::test;
using br::test::boundary::Variant;

namespace {

const char* kScene = R"({"format":"chartscene 1",
 "databases":[{"name":"USERDB","kind":"user","datasets":[{"id":"GROUPS1","objects":[
   {"name":"u-rock","class":"UWTROC","point":[0,0],"attributes":{"OBJNAM":"Rock"}},
   {"name":"u-light","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Lamp"}}]}]}]})";

std::vector<unsigned char> TwoRecords(const ScratchScene& scene) {
  VARIANT records = scene.Records(L"u-rock, u-light");
  std::vector<unsigned char> bytes(records.parray->rgsabound[0].cElements);
  std::memcpy(bytes.data(), records.parray->pvData, bytes.size());
  VariantClear(&records);
  REQUIRE(bytes.size() == 2 * sizeof(GEO_OBJECT_RECORD));
  return bytes;
}

// An array of the given element type and bounds holding the bytes (cut or padded with 0).
SAFEARRAY* ArrayOf(VARTYPE type, std::initializer_list<SAFEARRAYBOUND> bounds, const std::vector<unsigned char>& bytes) {
  SAFEARRAY* array = boundary::MakeArray(type, bounds);
  std::size_t size = SafeArrayGetElemsize(array);
  for (const SAFEARRAYBOUND& b : bounds) size *= b.cElements;
  std::memcpy(array->pvData, bytes.data(), size < bytes.size() ? size : bytes.size());
  return array;
}

// The records with each owner replaced.
std::vector<unsigned char> WithOwner(std::vector<unsigned char> bytes, IUnknown* owner) {
  for (std::size_t at = 0; at + sizeof(GEO_OBJECT_RECORD) <= bytes.size(); at += sizeof(GEO_OBJECT_RECORD)) {
    GEO_OBJECT_RECORD record;
    std::memcpy(&record, bytes.data() + at, sizeof record);
    record.Owner = owner;
    std::memcpy(bytes.data() + at, &record, sizeof record);
  }
  return bytes;
}

// The records with each identity's object number changed to one the dataset lacks.
std::vector<unsigned char> Unknown(std::vector<unsigned char> bytes) {
  for (std::size_t at = 0; at + sizeof(GEO_OBJECT_RECORD) <= bytes.size(); at += sizeof(GEO_OBJECT_RECORD)) {
    GEO_OBJECT_RECORD record;
    std::memcpy(&record, bytes.data() + at, sizeof record);
    record.Id.Data1 = 0x7ffffff0;
    std::memcpy(bytes.data() + at, &record, sizeof record);
  }
  return bytes;
}

struct ValueRow {
  std::string what;
  std::function<Variant()> make;
  std::size_t items;  // after SetInfo, with the header
  bool lateRefused = false;  // the type library refuses it before the call: nothing changes
};

HRESULT InvokeWith(IDispatch* dispatch, const wchar_t* name, VARIANT* arguments, UINT count, VARIANT* result) {
  DISPID id = 0;
  LPOLESTR names[] = {const_cast<LPOLESTR>(name)};
  REQUIRE(dispatch->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
  DISPPARAMS params{arguments, nullptr, count, 0};
  EXCEPINFO exception{};
  UINT bad = 0;
  const HRESULT hr =
      dispatch->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &params, result, &exception, &bad);
  SysFreeString(exception.bstrSource);
  SysFreeString(exception.bstrDescription);
  SysFreeString(exception.bstrHelpFile);
  return hr;
}

}  // namespace

TEST_CASE("SetInfo and AddInfo: every VARIANT form and array shape, early and late bound") {
  DllUnderTest dll;
  {
    ScratchScene scene{kScene};
    const std::vector<unsigned char> two = TwoRecords(scene);
    const auto rock = scene.Object(L"u-rock");
    InspectorControl inspector(dll);
    inspector.Host();
    Variant good = Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{static_cast<ULONG>(two.size()), 0}}, two));

    SAFEARRAY* nowhere = nullptr;
    Variant empty;
    LONG number = 3;
    const ULONG recordBytes = sizeof(GEO_OBJECT_RECORD);
    const std::vector<ValueRow> rows = {
        {"VT_EMPTY", [] { return Variant::Empty(); }, 0},
        {"VT_NULL", [] { return Variant::Make(VT_NULL, [](VARIANT&) {}); }, 0},
        {"VT_I4", [] { return Variant::I4(2); }, 0},
        {"VT_R8 NaN", [] { return Variant::R8(boundary::kNaN); }, 0},
        {"VT_R8 infinite", [] { return Variant::R8(-boundary::kInfinity); }, 0},
        {"VT_BSTR of object names", [] { return Variant::Bstr(L"u-rock, u-light"); }, 0},
        {"VT_BSTR null", [] { return Variant::NullBstr(); }, 0},
        {"VT_UNKNOWN of an object", [&] { return Variant::Unknown(rock.Get()); }, 0},
        {"VT_DISPATCH null", [] { return Variant::Make(VT_DISPATCH, [](VARIANT& v) { v.pdispVal = nullptr; }); }, 0},
        {"VT_ERROR, left out", [] { return Variant::Make(VT_ERROR, [](VARIANT& v) { v.scode = DISP_E_PARAMNOTFOUND; }); }, 0},
        {"VT_BYREF|VT_I4", [&] { return Variant::RefI4(&number); }, 0},
        {"VT_BYREF|VT_VARIANT to nothing", [] { return Variant::RefVariant(nullptr); }, 0},
        {"VT_BYREF|VT_VARIANT to VT_EMPTY", [&] { return Variant::RefVariant(&empty.get()); }, 0},
        {"VT_BYREF|VT_VARIANT to the records", [&] { return Variant::RefVariant(&good.get()); }, 3},
        {"VT_BYREF|VT_ARRAY, no pointer", [] { return Variant::RefArray(VT_UI1, nullptr); }, 0},
        {"VT_BYREF|VT_ARRAY to a null array", [&] { return Variant::RefArray(VT_UI1, &nowhere); }, 0},
        {"VT_BYREF|VT_ARRAY to the records", [&] { return Variant::RefArray(VT_UI1, &good.get().parray); }, 3},
        {"VT_ARRAY of no dimension", [] { return Variant::ZeroDimensions(VT_UI1); }, 0, true},
        {"VT_ARRAY of nothing", [] { return Variant::Array(VT_UI1, boundary::MakeArray(VT_UI1, {{0, 0}})); }, 0},
        {"two dimensions",
         [&] { return Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{recordBytes, 0}, {2, 0}}, two)); }, 0},
        {"lower bound -5",
         [&] { return Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{static_cast<ULONG>(two.size()), -5}}, two)); }, 3},
        // Bytes count whole records when their number is a multiple of 4; others are no records.
        {"lower bound 7, four bytes short",
         [&] { return Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{static_cast<ULONG>(two.size() - 4), 7}}, two)); }, 2},
        {"one byte short",
         [&] { return Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{static_cast<ULONG>(two.size() - 1), 0}}, two)); }, 0},
        // Elements are bytes or whole records, never words of a record.
        {"VT_I4 elements",
         [&] { return Variant::Array(VT_I4, ArrayOf(VT_I4, {{static_cast<ULONG>(two.size() / 4), 0}}, two)); }, 0},
        {"VT_R8 elements",
         [&] { return Variant::Array(VT_R8, ArrayOf(VT_R8, {{static_cast<ULONG>(two.size() / 8), 0}}, two)); }, 0},
        {"VT_I4 elements in a record-sized descriptor",
         [&] {
           SAFEARRAY* array = boundary::MakeRawArray(recordBytes, 2);
           std::memcpy(array->pvData, two.data(), two.size());
           return Variant::Array(VT_I4, array);
         },
         3},
        {"VT_BSTR elements", [] { return Variant::Array(VT_BSTR, boundary::MakeArray(VT_BSTR, {{6, 0}})); }, 0},
        {"VT_UNKNOWN elements", [] { return Variant::Array(VT_UNKNOWN, boundary::MakeArray(VT_UNKNOWN, {{6, 0}})); }, 0},
        {"records of zeros", [&] { return Variant::Array(VT_UI1, boundary::MakeArray(VT_UI1, {{recordBytes * 2, 0}})); }, 0},
        {"records without owner",
         [&] { return Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{static_cast<ULONG>(two.size()), 0}}, WithOwner(two, nullptr))); }, 0},
        {"records owned by a chart object",
         [&] { return Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{static_cast<ULONG>(two.size()), 0}}, WithOwner(two, rock.Get()))); }, 0},
        {"records of objects the dataset lacks",
         [&] { return Variant::Array(VT_UI1, ArrayOf(VT_UI1, {{static_cast<ULONG>(two.size()), 0}}, Unknown(two))); }, 0},
    };

    ComRef<IDispatch> dispatch = Query<IDispatch>(inspector.Get());
    for (const ValueRow& row : rows) {
      INFO(row.what);
      // Early bound: SetInfo replaces the tree with what the value holds.
      REQUIRE(inspector->SetInfo(good.get()) == S_OK);
      Variant value = row.make();
      CHECK(inspector->SetInfo(value.get()) == S_OK);
      CHECK(inspector.Items().size() == row.items);

      // AddInfo of nothing readable leaves the tree as it was.
      REQUIRE(inspector->SetInfo(good.get()) == S_OK);
      const std::vector<TreeItem> before = inspector.Items();
      Variant again = row.make();
      CHECK(inspector->AddInfo(again.get()) == S_OK);
      if (row.items == 0) CHECK(inspector.Items().size() == before.size());

      // Late bound: the same value through Invoke.
      Variant late = row.make();
      VARIANT argument = late.get();
      if (row.lateRefused) {
        const std::size_t held = inspector.Items().size();
        CHECK(InvokeWith(dispatch.Get(), L"SetInfo", &argument, 1, nullptr) == E_INVALIDARG);
        CHECK(inspector.Items().size() == held);
      } else {
        CHECK(InvokeWith(dispatch.Get(), L"SetInfo", &argument, 1, nullptr) == S_OK);
        CHECK(inspector.Items().size() == row.items);
      }
    }
    CHECK(InvokeWith(dispatch.Get(), L"SetInfo", nullptr, 0, nullptr) == DISP_E_BADPARAMCOUNT);
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("out-pointers, owners and identity texts of GetSelectedObject, FormatAttributes and HOCode2Name") {
  DllUnderTest dll;
  {
    ScratchScene scene{kScene};
    InspectorControl inspector(dll);
    inspector.Host();
    VARIANT records = scene.Records(L"u-rock, u-light");
    REQUIRE(inspector->SetInfo(records) == S_OK);
    VariantClear(&records);
    const auto database = scene.Database(L"USERDB");
    const auto rock = scene.Object(L"u-rock");
    wchar_t rockText[40] = {};
    REQUIRE(StringFromGUID2(ScratchScene::IdOf(rock.Get()), rockText, 40) == 39);

    BSTR guid = reinterpret_cast<BSTR>(1);
    IUnknown* owner = boundary::kUntouchedUnknown;
    CHECK(inspector->GetSelectedObject(nullptr, &owner) == E_INVALIDARG);
    CHECK(owner == boundary::kUntouchedUnknown);
    CHECK(inspector->GetSelectedObject(&guid, nullptr) == E_INVALIDARG);
    CHECK(guid == reinterpret_cast<BSTR>(1));

    const std::wstring lower = [&] {
      std::wstring text = rockText;
      for (wchar_t& c : text) c = static_cast<wchar_t>(towlower(c));
      return text;
    }();
    struct TextRow {
      std::string what;
      std::wstring text;
      HRESULT expected;
    };
    const std::vector<TextRow> texts = {
        {"the identity", rockText, S_OK},
        {"in small letters", lower, S_OK},
        {"without braces", std::wstring(rockText + 1, 36), E_INVALIDARG},
        {"with a space after", std::wstring(rockText) + L" ", E_INVALIDARG},
        {"cut by a zero", std::wstring(rockText, 20) + L'\0' + std::wstring(rockText + 21), E_INVALIDARG},
        {"braces only", L"{}", E_INVALIDARG},
        {"a program identifier", L"BR_Info.XObjectInspector", E_INVALIDARG},
        {"an identity of no object", L"{12345678-0000-0000-5553-455244422E2E}", E_INVALIDARG},
        // First 8 bytes zero: a dataset's metadata, which the database cannot find.
        {"a dataset identity the database lacks", L"{00000000-0000-0000-C000-000000000046}", E_FAIL},
        {"a megabyte of letters", std::wstring(1 << 20, L'A'), E_INVALIDARG},
    };
    for (const TextRow& row : texts) {
      INFO(row.what);
      BSTR id = SysAllocStringLen(row.text.data(), static_cast<UINT>(row.text.size()));
      BSTR text = reinterpret_cast<BSTR>(1);
      CHECK(inspector->FormatAttributes(database.Get(), id, &text) == row.expected);
      if (row.expected == S_OK) CHECK(text != nullptr);
      else CHECK(text == nullptr);
      SysFreeString(text);
      SysFreeString(id);
    }

    BSTR id = SysAllocString(rockText);
    BSTR text = nullptr;
    CHECK(inspector->FormatAttributes(database.Get(), id, nullptr) == E_INVALIDARG);
    // Owners that are no database: the object itself, and the inspector.
    CHECK(inspector->FormatAttributes(rock.Get(), id, &text) == E_INVALIDARG);
    CHECK(text == nullptr);
    CHECK(inspector->FormatAttributes(inspector.Get(), id, &text) == E_INVALIDARG);
    CHECK(text == nullptr);

    // Late bound: arguments of the wrong type are coerced or refused by the type library.
    ComRef<IDispatch> dispatch = Query<IDispatch>(inspector.Get());
    VARIANT arguments[2];  // in reverse order
    arguments[0].vt = VT_BSTR;
    arguments[0].bstrVal = id;
    arguments[1].vt = VT_I4;
    arguments[1].lVal = 12;
    VARIANT result;
    VariantInit(&result);
    CHECK(InvokeWith(dispatch.Get(), L"FormatAttributes", arguments, 2, &result) == DISP_E_TYPEMISMATCH);
    arguments[1].vt = VT_UNKNOWN;
    arguments[1].punkVal = database.Get();
    CHECK(InvokeWith(dispatch.Get(), L"FormatAttributes", arguments, 2, &result) == S_OK);
    CHECK(result.vt == VT_BSTR);
    CHECK(std::wstring(result.bstrVal) == L"Object name\rRock");
    VariantClear(&result);
    arguments[0].vt = VT_R8;
    arguments[0].dblVal = boundary::kNaN;
    const HRESULT nan = InvokeWith(dispatch.Get(), L"FormatAttributes", arguments, 2, &result);
    CHECK(FAILED(nan));
    // Whatever the dispatch layer leaves in the result holds no text.
    CHECK((result.vt == VT_EMPTY || (result.vt == VT_BSTR && SysStringLen(result.bstrVal) == 0)));
    VariantClear(&result);
    SysFreeString(id);
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}

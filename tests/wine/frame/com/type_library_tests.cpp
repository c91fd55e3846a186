// The type library embedded in BR_Info.dll against the header generated from the same IDL:
// every class the header declares is a creatable coclass of that name and GUID, with its
// dual interface as default and its event interface as default source; each dual
// interface's functions take the header's vtable slots, name for name.
#include "tests/wine/common/DllUnderTest.h"

#include <doctest/doctest.h>

#include <fstream>
#include <map>
#include <regex>
#include <iterator>
#include <string>
#include <vector>

namespace {

struct Header {
  std::map<std::string, GUID> guids;                        // class or interface name -> GUID
  std::vector<std::string> classes;                         // coclass names
  std::map<std::string, std::vector<std::string>> vtables;  // interface -> members in slot order
};

// The generated header sits beside the DLL's build tree (resources/generated).
Header ReadHeader() {
  std::wstring path = br::test::BuiltDllPath();
  path = path.substr(0, path.find_last_of(L"\\/")) + L"\\resources\\generated\\BR_Info.h";
  std::ifstream file(path.c_str());
  REQUIRE(file.good());
  const std::string text{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  const std::sregex_iterator end;
  Header header;
  // Each class and interface declaration with its GUID.
  const std::regex declared(R"x((MIDL_INTERFACE|class DECLSPEC_UUID)\("([-0-9a-f]+)"\)\s+(\w+))x");
  for (std::sregex_iterator m(text.begin(), text.end(), declared); m != end; ++m) {
    const std::string braced = "{" + (*m)[2].str() + "}";
    REQUIRE(IIDFromString(std::wstring(braced.begin(), braced.end()).c_str(), &header.guids[(*m)[3]]) == S_OK);
    if ((*m)[1] == "class DECLSPEC_UUID") header.classes.push_back((*m)[3]);
  }
  const std::regex vtable(R"(typedef struct (\w+)Vtbl \{([^}]*)\} \1Vtbl;)");
  const std::regex member(R"(\(STDMETHODCALLTYPE \*(\w+)\))");
  for (std::sregex_iterator m(text.begin(), text.end(), vtable); m != end; ++m) {
    const std::string body = (*m)[2];
    for (std::sregex_iterator f(body.begin(), body.end(), member); f != end; ++f)
      header.vtables[(*m)[1]].push_back((*f)[1]);
  }
  return header;
}

std::string NameOf(ITypeInfo* info, MEMBERID id = MEMBERID_NIL) {
  BSTR name = nullptr;
  info->GetDocumentation(id, &name, nullptr, nullptr, nullptr);
  std::string result(name, name + SysStringLen(name));  // the names are ASCII
  SysFreeString(name);
  return result;
}

// The vtable view's functions as the header names them (get_/put_ for properties), by slot.
std::vector<std::string> SlotNames(ITypeInfo* info) {
  TYPEATTR* attributes = nullptr;
  REQUIRE(info->GetTypeAttr(&attributes) == S_OK);
  CHECK((attributes->wTypeFlags & TYPEFLAG_FOLEAUTOMATION) != 0);
  std::vector<std::string> slots = {"QueryInterface", "AddRef",        "Release", "GetTypeInfoCount",
                                    "GetTypeInfo",    "GetIDsOfNames", "Invoke"};
  slots.resize(7 + attributes->cFuncs);
  for (UINT i = 0; i < attributes->cFuncs; ++i) {
    FUNCDESC* f = nullptr;
    REQUIRE(info->GetFuncDesc(i, &f) == S_OK);
    CHECK(f->elemdescFunc.tdesc.vt == VT_HRESULT);
    const std::size_t slot = static_cast<std::size_t>(f->oVft) / sizeof(void*);
    REQUIRE((slot >= 7 && slot < slots.size()));
    slots[slot] = (f->invkind == INVOKE_PROPERTYGET ? "get_" : f->invkind == INVOKE_PROPERTYPUT ? "put_" : "") +
                  NameOf(info, f->memid);
    info->ReleaseFuncDesc(f);
  }
  info->ReleaseTypeAttr(attributes);
  return slots;
}

// Answers HOCode2Name through the type library's own Invoke, as every class of the DLL
// does, and keeps what the call handed it; the other members are not called.
class InspectorProbe : public IXObjectInspector {
public:
  int calls = 0;
  long code = 0;
  bool abbreviationPointer = false;

  STDMETHODIMP QueryInterface(REFIID, void** out) override {
    *out = nullptr;
    return E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 1; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP GetTypeInfoCount(UINT*) override { return E_NOTIMPL; }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override {
    return E_NOTIMPL;
  }
  STDMETHODIMP SetInfo(VARIANT) override { return E_NOTIMPL; }
  STDMETHODIMP AddInfo(VARIANT) override { return E_NOTIMPL; }
  STDMETHODIMP get_DataSet(IUnknown**) override { return E_NOTIMPL; }
  STDMETHODIMP HOCode2Name(LONG Code, BSTR* reVal, BSTR* pAbbreviation) override {
    ++calls;
    code = Code;
    abbreviationPointer = pAbbreviation != nullptr;
    if (reVal) *reVal = SysAllocString(L"Service hydrographique");
    if (pAbbreviation) *pAbbreviation = SysAllocString(L"SHOM");
    return S_OK;
  }
  STDMETHODIMP GetSelectedObject(BSTR*, IUnknown**) override { return E_NOTIMPL; }
  STDMETHODIMP FormatAttributes(IUnknown*, BSTR, BSTR*) override { return E_NOTIMPL; }
};

}  // namespace

TEST_CASE("the type library agrees with the generated header: classes, interfaces and vtable slots") {
  const Header header = ReadHeader();
  REQUIRE(header.classes.size() == 8);
  ITypeLib* library = nullptr;
  REQUIRE(LoadTypeLibEx(br::test::BuiltDllPath().c_str(), REGKIND_NONE, &library) == S_OK);
  for (const std::string& name : header.classes) {
    INFO("class ", name);
    ITypeInfo* coclass = nullptr;
    REQUIRE(library->GetTypeInfoOfGuid(header.guids.at(name), &coclass) == S_OK);
    CHECK(NameOf(coclass) == name);
    TYPEATTR* attributes = nullptr;
    REQUIRE(coclass->GetTypeAttr(&attributes) == S_OK);
    CHECK(attributes->typekind == TKIND_COCLASS);
    CHECK((attributes->wTypeFlags & TYPEFLAG_FCANCREATE) != 0);
    const UINT implemented = attributes->cImplTypes;
    coclass->ReleaseTypeAttr(attributes);
    CHECK(implemented == 1 + header.guids.count("_I" + name + "Events"));
    int duals = 0;
    for (UINT i = 0; i < implemented; ++i) {
      INT flags = 0;
      HREFTYPE ref = 0;
      ITypeInfo* face = nullptr;
      coclass->GetImplTypeFlags(i, &flags);
      coclass->GetRefTypeOfImplType(i, &ref);
      REQUIRE(coclass->GetRefTypeInfo(ref, &face) == S_OK);
      const std::string faceName = NameOf(face);
      INFO("interface ", faceName);
      CHECK((flags & IMPLTYPEFLAG_FDEFAULT) != 0);
      const bool source = (flags & IMPLTYPEFLAG_FSOURCE) != 0;
      REQUIRE(face->GetTypeAttr(&attributes) == S_OK);
      CHECK(attributes->typekind == TKIND_DISPATCH);
      CHECK(((attributes->wTypeFlags & TYPEFLAG_FDUAL) != 0) == !source);
      REQUIRE(header.guids.count(faceName) == 1);
      CHECK(IsEqualGUID(attributes->guid, header.guids.at(faceName)));
      face->ReleaseTypeAttr(attributes);
      if (!source) {
        ++duals;
        ITypeInfo* vtableView = nullptr;
        REQUIRE(face->GetRefTypeOfImplType(-1, &ref) == S_OK);
        REQUIRE(face->GetRefTypeInfo(ref, &vtableView) == S_OK);
        REQUIRE(header.vtables.count(faceName) == 1);
        CHECK(SlotNames(vtableView) == header.vtables.at(faceName));
        vtableView->Release();
      }
      face->Release();
    }
    CHECK(duals == 1);
    coclass->Release();
  }
  library->Release();
}

TEST_CASE("HOCode2Name keeps dispatch id 4 and out BSTRs; a late-bound caller may leave the abbreviation out") {
  ITypeLib* library = nullptr;
  REQUIRE(LoadTypeLibEx(br::test::BuiltDllPath().c_str(), REGKIND_NONE, &library) == S_OK);
  ITypeInfo* info = nullptr;
  REQUIRE(library->GetTypeInfoOfGuid(IID_IXObjectInspector, &info) == S_OK);
  MEMBERID id = MEMBERID_NIL;
  LPOLESTR name = const_cast<LPOLESTR>(L"HOCode2Name");
  REQUIRE(info->GetIDsOfNames(&name, 1, &id) == S_OK);
  CHECK(id == 4);

  bool found = false;
  FUNCDESC* f = nullptr;
  for (UINT i = 0; !found && info->GetFuncDesc(i, &f) == S_OK; ++i) {
    if (f->memid == 4 && f->invkind == INVOKE_FUNC) {
      found = true;
      REQUIRE(f->cParams == 3);
      const ELEMDESC* p = f->lprgelemdescParam;
      CHECK(p[0].tdesc.vt == VT_I4);
      for (int out = 1; out <= 2; ++out) {
        INFO("parameter ", out);
        CHECK(p[out].tdesc.vt == VT_PTR);
        CHECK(p[out].tdesc.lptdesc->vt == VT_BSTR);
        CHECK((p[out].paramdesc.wParamFlags & PARAMFLAG_FOUT) != 0);
        CHECK((p[out].paramdesc.wParamFlags & PARAMFLAG_FRETVAL) == 0);
      }
      CHECK((p[1].paramdesc.wParamFlags & PARAMFLAG_FOPT) == 0);
      CHECK((p[2].paramdesc.wParamFlags & PARAMFLAG_FOPT) != 0);
    }
    info->ReleaseFuncDesc(f);
  }
  CHECK(found);

  // Arguments run last to first: [abbreviation,] name, code.
  InspectorProbe probe;
  BSTR agency = nullptr, abbreviation = nullptr;
  VARIANT args[3];
  V_VT(&args[0]) = VT_BYREF | VT_BSTR;
  V_BSTRREF(&args[0]) = &abbreviation;
  V_VT(&args[1]) = VT_BYREF | VT_BSTR;
  V_BSTRREF(&args[1]) = &agency;
  V_VT(&args[2]) = VT_I4;
  V_I4(&args[2]) = 550;
  DISPPARAMS all{args, nullptr, 3, 0};
  CHECK(info->Invoke(static_cast<IXObjectInspector*>(&probe), 4, DISPATCH_METHOD, &all, nullptr, nullptr, nullptr) ==
        S_OK);
  CHECK((probe.calls == 1 && probe.code == 550 && probe.abbreviationPointer));
  REQUIRE((agency != nullptr && abbreviation != nullptr));
  CHECK(std::wstring(abbreviation) == L"SHOM");
  SysFreeString(agency);
  SysFreeString(abbreviation);

  agency = nullptr;
  DISPPARAMS withoutAbbreviation{args + 1, nullptr, 2, 0};
  CHECK(info->Invoke(static_cast<IXObjectInspector*>(&probe), 4, DISPATCH_METHOD, &withoutAbbreviation, nullptr,
                     nullptr, nullptr) == S_OK);
  CHECK(probe.calls == 2);
  REQUIRE(agency != nullptr);
  CHECK(std::wstring(agency) == L"Service hydrographique");
  SysFreeString(agency);

  info->Release();
  library->Release();
}

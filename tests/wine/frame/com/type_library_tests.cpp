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

// The type library embedded in BR_Info.dll against the header generated from the same IDL:
// every class the header declares is a creatable coclass of that name and GUID, with its
// dual interface as default and its event interface as default source; each dual
// interface's functions take the header's vtable slots, name for name.
#include "tests/wine/common/dll_under_test.h"

#include <doctest/doctest.h>

#include <cstdio>
#include <fstream>
#include <map>
#include <regex>
#include <sstream>
#include <string>
#include <vector>

namespace {

struct Header {
  std::map<std::string, GUID> guids;                      // IID_/DIID_/CLSID_ name -> GUID
  std::vector<std::pair<std::string, GUID>> classes;      // coclass name, CLSID
  std::map<std::string, std::vector<std::string>> vtables;  // interface -> members in slot order
};

// The generated header sits beside the DLL's build tree (resources/generated).
Header ReadHeader() {
  std::wstring path = br::test::BuiltDllPath();
  path = path.substr(0, path.find_last_of(L"\\/")) + L"\\resources\\generated\\BR_Info.h";
  std::ifstream file(path.c_str());
  REQUIRE(file.good());
  std::stringstream buffer;
  buffer << file.rdbuf();
  const std::string text = buffer.str();
  Header header;
  const std::regex guid(R"(DEFINE_GUID\((\w+), *(0x\w+), *(0x\w+), *(0x\w+), *((?:0x\w+, *){7}0x\w+)\))");
  for (std::sregex_iterator m(text.begin(), text.end(), guid), end; m != end; ++m) {
    GUID g = {};
    unsigned b[8] = {};
    g.Data1 = std::stoul((*m)[2], nullptr, 16);
    g.Data2 = static_cast<WORD>(std::stoul((*m)[3], nullptr, 16));
    g.Data3 = static_cast<WORD>(std::stoul((*m)[4], nullptr, 16));
    REQUIRE(std::sscanf((*m)[5].str().c_str(), "%x,%x,%x,%x,%x,%x,%x,%x", &b[0], &b[1], &b[2], &b[3], &b[4], &b[5],
                        &b[6], &b[7]) == 8);
    for (int i = 0; i < 8; ++i) g.Data4[i] = static_cast<BYTE>(b[i]);
    header.guids[(*m)[1]] = g;
  }
  const std::regex coclass(R"(class DECLSPEC_UUID\("[-0-9a-f]+"\) (\w+);)");
  for (std::sregex_iterator m(text.begin(), text.end(), coclass), end; m != end; ++m) {
    REQUIRE(header.guids.count("CLSID_" + (*m)[1].str()) == 1);
    header.classes.emplace_back((*m)[1], header.guids["CLSID_" + (*m)[1].str()]);
  }
  const std::regex vtable(R"(typedef struct (\w+)Vtbl \{([^}]*)\} \1Vtbl;)");
  const std::regex member(R"(\(STDMETHODCALLTYPE \*(\w+)\))");
  for (std::sregex_iterator m(text.begin(), text.end(), vtable), end; m != end; ++m) {
    const std::string body = (*m)[2];
    std::vector<std::string>& members = header.vtables[(*m)[1]];
    for (std::sregex_iterator f(body.begin(), body.end(), member); f != end; ++f) members.push_back((*f)[1]);
  }
  return header;
}

std::string NameOf(ITypeInfo* info, MEMBERID id = MEMBERID_NIL) {
  BSTR name = nullptr;
  info->GetDocumentation(id, &name, nullptr, nullptr, nullptr);
  std::string result;
  for (const wchar_t* c = name; c && *c; ++c) result += static_cast<char>(*c);
  SysFreeString(name);
  return result;
}

// The vtable view's functions as the header names them (get_/put_ for properties), by slot.
std::vector<std::string> SlotNames(ITypeInfo* info) {
  TYPEATTR* attributes = nullptr;
  REQUIRE(info->GetTypeAttr(&attributes) == S_OK);
  CHECK(attributes->typekind == TKIND_INTERFACE);
  CHECK((attributes->wTypeFlags & TYPEFLAG_FOLEAUTOMATION) != 0);
  std::vector<std::string> slots(7 + attributes->cFuncs);
  for (UINT i = 0; i < attributes->cFuncs; ++i) {
    FUNCDESC* f = nullptr;
    REQUIRE(info->GetFuncDesc(i, &f) == S_OK);
    CHECK(f->elemdescFunc.tdesc.vt == VT_HRESULT);
    const std::size_t slot = static_cast<std::size_t>(f->oVft) / sizeof(void*);
    REQUIRE(slot < slots.size());
    slots[slot] = (f->invkind == INVOKE_PROPERTYGET ? "get_" : f->invkind == INVOKE_PROPERTYPUT ? "put_" : "") +
                  NameOf(info, f->memid);
    info->ReleaseFuncDesc(f);
  }
  info->ReleaseTypeAttr(attributes);
  const char* const dispatch[] = {"QueryInterface", "AddRef", "Release", "GetTypeInfoCount",
                                  "GetTypeInfo", "GetIDsOfNames", "Invoke"};
  for (std::size_t i = 0; i < 7; ++i) slots[i] = dispatch[i];
  return slots;
}

}  // namespace

TEST_CASE("the type library agrees with the generated header: classes, interfaces and vtable slots") {
  const Header header = ReadHeader();
  REQUIRE(header.classes.size() == 8);
  ITypeLib* library = nullptr;
  REQUIRE(LoadTypeLibEx(br::test::BuiltDllPath().c_str(), REGKIND_NONE, &library) == S_OK);
  for (const auto& [name, clsid] : header.classes) {
    INFO("class ", name);
    ITypeInfo* coclass = nullptr;
    REQUIRE(library->GetTypeInfoOfGuid(clsid, &coclass) == S_OK);
    CHECK(NameOf(coclass) == name);
    TYPEATTR* attributes = nullptr;
    REQUIRE(coclass->GetTypeAttr(&attributes) == S_OK);
    CHECK(attributes->typekind == TKIND_COCLASS);
    CHECK((attributes->wTypeFlags & TYPEFLAG_FCANCREATE) != 0);
    const UINT implemented = attributes->cImplTypes;
    coclass->ReleaseTypeAttr(attributes);
    CHECK(implemented == 1 + header.guids.count("DIID__I" + name + "Events"));
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
      const auto declared = header.guids.find((source ? "DIID_" : "IID_") + faceName);
      REQUIRE(declared != header.guids.end());
      CHECK(IsEqualGUID(attributes->guid, declared->second));
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

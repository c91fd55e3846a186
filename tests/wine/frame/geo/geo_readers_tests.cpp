// The readers of host answers against hosts that answer badly: arrays of every shape
// (24-byte VARIANT elements on 64-bit), catalogue lengths out of range and failing text
// calls, enumerators that stop oddly or never stop. Every item handed out comes back.
#include <doctest/doctest.h>

#include <windows.h>
#include <oleauto.h>

#include <cstring>
#include <string>
#include <vector>

#include "GeoData.h"
#include "frame/geo/ParameterList.h"
#include "frame/geo/catalogue_texts.h"
#include "frame/geo/geo_enumeration.h"
#include "frame/geo/header_reader.h"
#include "frame/geo/volume_files.h"
#include "frame/settings/cRegSettings.h"
#include "frame/settings/settings.h"
#include "tests/wine/common/registry_test_support.h"

using namespace br::geo;

namespace {

#define RESERVED(n) \
  STDMETHODIMP Reserved##n() override { return E_NOTIMPL; }

// IUnknown for one interface, counting live objects of the test.
template <typename I>
class Fake : public I {
public:
  static inline long live = 0;
  Fake() { ++live; }
  virtual ~Fake() { --live; }
  STDMETHODIMP QueryInterface(REFIID iid, void** out) override {
    if (out == nullptr) return E_POINTER;
    if (IsEqualIID(iid, IID_IUnknown) || IsEqualIID(iid, __uuidof(I))) {
      *out = static_cast<I*>(this);
      AddRef();
      return S_OK;
    }
    *out = nullptr;
    return E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override {
    const ULONG left = --refs_;
    if (left == 0) delete this;
    return left;
  }

private:
  ULONG refs_ = 1;
};

// A dataset whose header and parameters are whatever the test puts there.
class FakeDataSet : public Fake<IGeoDataSet> {
public:
  HRESULT headerResult = S_OK;
  SAFEARRAY* header = nullptr;  // handed over on GetHeader
  HRESULT parametersResult = S_OK;
  VARIANT parameters{};         // copied out on GetParameters

  ~FakeDataSet() override {
    if (header) SafeArrayDestroy(header);
    VariantClear(&parameters);
  }
  STDMETHODIMP GetDatabase(IGeoDatabase**) override { return E_NOTIMPL; }
  STDMETHODIMP GetKindId(GUID*) override { return E_NOTIMPL; }
  RESERVED(5) RESERVED(6) RESERVED(7) RESERVED(8) RESERVED(9)
  STDMETHODIMP GetHeader(SAFEARRAY** out) override {
    *out = header;
    header = nullptr;
    return headerResult;
  }
  STDMETHODIMP GetParameters(VARIANT* out) override {
    VariantInit(out);
    VariantCopy(out, &parameters);
    return parametersResult;
  }
  RESERVED(12)
  STDMETHODIMP GetObjectById(REFGUID, IGeoObject**) override { return E_NOTIMPL; }
  STDMETHODIMP GetObjectEnum(IGeoSelectionEnum**) override { return E_NOTIMPL; }
  RESERVED(15) RESERVED(16) RESERVED(17) RESERVED(18) RESERVED(19) RESERVED(20)
  RESERVED(21) RESERVED(22) RESERVED(23)
  STDMETHODIMP GetDataSetProperty(long, VARIANT*) override { return E_NOTIMPL; }
};

// Enumerated items: plain counted objects.
class FakeItem : public Fake<IUnknown> {};

// An enumerator that hands out `count` items, then answers `endResult` with `endItem`
// and `endFetched` (a well-behaved end is S_FALSE, null, 0). count < 0: never ends.
class FakeEnum : public Fake<IGeoObjectEnum> {
public:
  long count = 0;
  HRESULT endResult = S_FALSE;
  bool endItem = false;
  ULONG endFetched = 0;
  long calls = 0;

  RESERVED(3)
  STDMETHODIMP Next(ULONG, IUnknown** item, ULONG* fetched) override {
    ++calls;
    if (count != 0) {
      if (count > 0) --count;
      *item = new FakeItem;
      *fetched = 1;
      return S_OK;
    }
    *item = endItem ? new FakeItem : nullptr;
    *fetched = endFetched;
    return endResult;
  }
};

// A catalogue whose enumeration text calls answer as configured.
class FakeCatalog : public Fake<IGeoCatalog> {
public:
  HRESULT lengthResult = S_OK;
  long length = 0;
  HRESULT textResult = S_OK;
  std::string text;           // written into the buffer without regard to its size
  long lastBufferSize = -1;

  RESERVED(3) RESERVED(4) RESERVED(5) RESERVED(6) RESERVED(7)
  STDMETHODIMP GetClassFlags(long, long*) override { return E_NOTIMPL; }
  RESERVED(9) RESERVED(10)
  STDMETHODIMP GetClassNameLength(long, long*) override { return E_NOTIMPL; }
  STDMETHODIMP GetClassNameText(long, long, char*) override { return E_NOTIMPL; }
  RESERVED(13) RESERVED(14) RESERVED(15) RESERVED(16) RESERVED(17) RESERVED(18)
  RESERVED(19) RESERVED(20) RESERVED(21) RESERVED(22) RESERVED(23)
  STDMETHODIMP GetAttributeCode(const char* acronym, long* code) override {
    if (std::string(acronym) == "VERDAT") {
      *code = 185;
      return S_OK;
    }
    *code = 17005;  // a code with a success that is not S_OK does not count
    return S_FALSE;
  }
  STDMETHODIMP GetAttributeFlags(long, long*) override { return E_NOTIMPL; }
  RESERVED(26) RESERVED(27)
  STDMETHODIMP GetAttributeNameLength(long, long*) override { return E_NOTIMPL; }
  STDMETHODIMP GetAttributeNameText(long, long, char*) override { return E_NOTIMPL; }
  RESERVED(30)
  STDMETHODIMP GetEnumTextLength(long, ULONG, long* out) override {
    *out = length;
    return lengthResult;
  }
  STDMETHODIMP GetEnumText(long, ULONG, long size, char* buffer) override {
    lastBufferSize = size;
    std::memcpy(buffer, text.data(), text.size());
    return textResult;
  }
};

// A database that only has a name.
class FakeDatabase : public Fake<IGeoDatabase> {
public:
  HRESULT nameResult = S_OK;
  const wchar_t* name = nullptr;  // null: a null BSTR

  RESERVED(3)
  STDMETHODIMP GetKindId(GUID*) override { return E_NOTIMPL; }
  RESERVED(5) RESERVED(6)
  STDMETHODIMP GetDataSetById(REFGUID, IGeoDataSet**) override { return E_NOTIMPL; }
  STDMETHODIMP GetDataSetHeader(REFGUID, SAFEARRAY**) override { return E_NOTIMPL; }
  STDMETHODIMP GetGeoObject(REFGUID, IGeoObject**) override { return E_NOTIMPL; }
  RESERVED(10) RESERVED(11)
  STDMETHODIMP CreateSelection(long, const GEO_SELECTION_RECORD*, long*) override { return E_NOTIMPL; }
  STDMETHODIMP ReleaseSelection(long) override { return E_NOTIMPL; }
  RESERVED(14) RESERVED(15) RESERVED(16)
  STDMETHODIMP GetName(BSTR* out) override {
    *out = name ? SysAllocString(name) : nullptr;
    return nameResult;
  }
};

SAFEARRAY* Bytes(VARTYPE type, ULONG count, unsigned char fill = 0) {
  SAFEARRAY* array = SafeArrayCreateVector(type, 0, count);
  void* data = nullptr;
  SafeArrayAccessData(array, &data);
  std::memset(data, fill, count * SafeArrayGetElemsize(array));
  SafeArrayUnaccessData(array);
  return array;
}

SAFEARRAY* Variants(ULONG count) {
  SAFEARRAY* array = SafeArrayCreateVector(VT_VARIANT, 0, count);
  for (LONG i = 0; i < static_cast<LONG>(count); ++i) {
    VARIANT element;
    VariantInit(&element);
    element.vt = VT_I4;
    element.lVal = 100 + i;
    SafeArrayPutElement(array, &i, &element);
  }
  return array;
}

}  // namespace

TEST_CASE("header arrays: only one-dimensional arrays of bytes are read, as far as the record goes") {
  auto* dataSet = new FakeDataSet;
  DataSetHeader header;

  dataSet->header = Bytes(VT_UI1, 4000, 0x01);  // longer than the record: its first 592 bytes
  REQUIRE(ReadDataSetHeader(dataSet, header) == S_OK);
  CHECK(*header.scale == 0x01010101u);
  CHECK(header.identity.has_value());

  dataSet->header = Bytes(VT_UI1, 30, 0x02);  // short: the fields it holds
  REQUIRE(ReadDataSetHeader(dataSet, header) == S_OK);
  CHECK(*header.edition == 0x0202);
  CHECK_FALSE(header.updateDate.has_value());

  dataSet->header = Bytes(VT_I4, 200);  // 4-byte elements
  CHECK(ReadDataSetHeader(dataSet, header) == E_INVALIDARG);
  dataSet->header = Bytes(VT_I1, 600);  // bytes, but not of the agreed type
  CHECK(ReadDataSetHeader(dataSet, header) == E_INVALIDARG);
  SAFEARRAYBOUND bounds[2] = {{300, 0}, {2, 0}};
  dataSet->header = SafeArrayCreate(VT_UI1, 2, bounds);
  CHECK(ReadDataSetHeader(dataSet, header) == E_INVALIDARG);
  dataSet->header = nullptr;
  CHECK(ReadDataSetHeader(dataSet, header) == E_INVALIDARG);

  // A failing host keeps its own result, and an array it handed out anyway is freed.
  dataSet->header = Bytes(VT_UI1, 600);
  dataSet->headerResult = E_ACCESSDENIED;
  CHECK(ReadDataSetHeader(dataSet, header) == E_ACCESSDENIED);
  CHECK(dataSet->header == nullptr);
  dataSet->Release();
  CHECK(Fake<IGeoDataSet>::live == 0);
}

TEST_CASE("parameter arrays: direct, by reference, inside a VARIANT by reference; elements of sizeof(VARIANT)") {
  SAFEARRAY* array = Variants(40);
  ParameterList list;

  VARIANT direct;
  VariantInit(&direct);
  direct.vt = VT_ARRAY | VT_VARIANT;
  direct.parray = array;
  REQUIRE(list.Assign(direct));
  CHECK(list.Size() == 40);
  CHECK(*list.Integer(33) == 133);

  VARIANT byRef;
  VariantInit(&byRef);
  byRef.vt = VT_BYREF | VT_ARRAY | VT_VARIANT;
  byRef.pparray = &array;
  REQUIRE(list.Assign(byRef));
  CHECK(*list.Integer(0) == 100);

  VARIANT outer;
  VariantInit(&outer);
  outer.vt = VT_BYREF | VT_VARIANT;
  outer.pvarVal = &byRef;
  REQUIRE(list.Assign(outer));
  CHECK(*list.Integer(39) == 139);
  outer.pvarVal = &direct;
  REQUIRE(list.Assign(outer));
  CHECK(list.Size() == 40);

  // Refused: a chain of references, null references, other element types and sizes.
  VARIANT chain;
  VariantInit(&chain);
  chain.vt = VT_BYREF | VT_VARIANT;
  chain.pvarVal = &outer;
  CHECK_FALSE(list.Assign(chain));
  CHECK(list.Size() == 0);
  outer.pvarVal = nullptr;
  CHECK_FALSE(list.Assign(outer));
  byRef.pparray = nullptr;
  CHECK_FALSE(list.Assign(byRef));
  VARIANT ints;
  VariantInit(&ints);
  ints.vt = VT_ARRAY | VT_I4;
  ints.parray = Bytes(VT_I4, 40);
  CHECK_FALSE(list.Assign(ints));
  ints.vt = VT_ARRAY | VT_VARIANT;  // tagged as variants, holding 4-byte elements
  CHECK_FALSE(list.Assign(ints));
  SafeArrayDestroy(ints.parray);
  // 16-byte elements are VARIANTs on 32-bit Windows only.
  SAFEARRAY* narrow = nullptr;
  REQUIRE(SafeArrayAllocDescriptor(1, &narrow) == S_OK);
  narrow->cbElements = 16;
  narrow->rgsabound[0].cElements = 40;
  REQUIRE(SafeArrayAllocData(narrow) == S_OK);
  direct.parray = narrow;
  CHECK(list.Assign(direct) == (sizeof(VARIANT) == 16));
  SafeArrayDestroy(narrow);
  SAFEARRAYBOUND bounds[2] = {{20, 0}, {2, 0}};
  direct.parray = SafeArrayCreate(VT_VARIANT, 2, bounds);
  CHECK_FALSE(list.Assign(direct));
  SafeArrayDestroy(direct.parray);

  // Only the elements anything reads are copied, however many the host has.
  SAFEARRAY* large = Variants(1000);
  direct.parray = large;
  REQUIRE(list.Assign(direct));
  CHECK(list.Size() == ParameterList::kMaxElements);
  SafeArrayDestroy(large);
  SafeArrayDestroy(array);
}

TEST_CASE("parameter elements keep their types: texts, dates and integers read as what they are") {
  auto* dataSet = new FakeDataSet;
  SAFEARRAY* array = SafeArrayCreateVector(VT_VARIANT, 0, 34);
  VARIANT element;
  VariantInit(&element);
  LONG index = 2;
  element.vt = VT_BSTR;
  element.bstrVal = SysAllocString(L"FR5BR010.000");
  SafeArrayPutElement(array, &index, &element);
  VariantClear(&element);
  index = 5;
  element.vt = VT_DATE;
  element.date = 45000.5;
  SafeArrayPutElement(array, &index, &element);
  index = 23;
  element.vt = VT_I2;
  element.iVal = -2;
  SafeArrayPutElement(array, &index, &element);
  index = 27;
  element.vt = VT_UI1;
  element.bVal = 24;
  SafeArrayPutElement(array, &index, &element);
  dataSet->parameters.vt = VT_ARRAY | VT_VARIANT;
  dataSet->parameters.parray = array;

  ParameterList list;
  REQUIRE(list.Read(dataSet) == S_OK);
  CHECK(*list.Text(2) == "FR5BR010.000");
  CHECK(*list.Date(5) == 45000.5);
  CHECK(*list.Integer(23) == -2);
  CHECK(*list.Integer(27) == 24);
  CHECK_FALSE(list.Integer(2).has_value());  // a text is not a number
  CHECK_FALSE(list.Text(27).has_value());
  CHECK_FALSE(list.Integer(0).has_value());  // VT_EMPTY
  CHECK(list.At(34) == nullptr);

  dataSet->parametersResult = E_UNEXPECTED;
  CHECK(list.Read(dataSet) == E_UNEXPECTED);
  CHECK(list.Size() == 0);
  dataSet->parametersResult = S_OK;
  VariantClear(&dataSet->parameters);
  dataSet->parameters.vt = VT_I4;
  CHECK(list.Read(dataSet) == E_INVALIDARG);
  dataSet->Release();
}

TEST_CASE("catalogue texts: bounded lengths, a buffer of length + 1, always terminated, failures keep the field") {
  auto* catalogue = new FakeCatalog;
  std::string field = "before";

  catalogue->length = 6;
  catalogue->text = "Mean sea level";  // the host writes more than it said: cut at its length
  REQUIRE(ReadEnumText(catalogue, 185, 3, field));
  CHECK(catalogue->lastBufferSize == 7);
  CHECK(field == "Mean s");

  catalogue->length = 0;
  catalogue->text = "";
  REQUIRE(ReadEnumText(catalogue, 185, 3, field));
  CHECK(field.empty());

  field = "kept";
  catalogue->lastBufferSize = -1;
  const struct {
    HRESULT lengthResult;
    long length;
  } refused[] = {{S_FALSE, 4}, {E_FAIL, 4}, {S_OK, -1}, {S_OK, 0x7FFFFFFF}, {S_OK, kMaxCatalogueText + 1}};
  for (const auto& row : refused) {
    catalogue->lengthResult = row.lengthResult;
    catalogue->length = row.length;
    CHECK_FALSE(ReadEnumText(catalogue, 185, 3, field));
  }
  CHECK(catalogue->lastBufferSize == -1);  // no text call after a refused length
  catalogue->lengthResult = S_OK;
  catalogue->length = 4;
  catalogue->text = "gone";
  catalogue->textResult = E_FAIL;
  CHECK_FALSE(ReadEnumText(catalogue, 185, 3, field));
  CHECK(field == "kept");

  CHECK(*FindAttributeCode(catalogue, "VERDAT") == 185);
  CHECK_FALSE(FindAttributeCode(catalogue, "verdat").has_value());
  CHECK_FALSE(FindAttributeCode(nullptr, "VERDAT").has_value());
  catalogue->Release();
}

TEST_CASE("enumerators: every item is released, odd ends stop the walk, endless ones are cut off") {
  struct Row {
    const char* what;
    long count;
    HRESULT endResult;
    bool endItem;
    ULONG endFetched;
    std::size_t seen;
  };
  const Row rows[] = {
      {"S_FALSE at the end", 3, S_FALSE, false, 0, 3},
      {"S_OK with a count of 0", 2, S_OK, false, 0, 2},
      {"S_OK with a null item", 2, S_OK, false, 1, 2},
      {"an item with a count of 0", 1, S_OK, true, 0, 1},
      {"an item with S_FALSE", 1, S_FALSE, true, 1, 1},
      {"a failure with an item", 4, E_FAIL, true, 1, 4},
  };
  for (const Row& row : rows) {
    INFO(row.what);
    auto* items = new FakeEnum;
    items->count = row.count;
    items->endResult = row.endResult;
    items->endItem = row.endItem;
    items->endFetched = row.endFetched;
    std::size_t visited = 0;
    CHECK(ForEachItem(items, [&](IUnknown*) { return ++visited, true; }) == row.seen);
    CHECK(visited == row.seen);
    items->Release();
    CHECK(Fake<IUnknown>::live == 0);
  }

  auto* endless = new FakeEnum;
  endless->count = -1;
  CHECK(ForEachItem(endless, [](IUnknown*) { return true; }, 5000) == 5000);
  CHECK(ForEachItem(endless, [](IUnknown*) { return true; }) == kMaxItems);
  CHECK(Fake<IUnknown>::live == 0);
  // A visitor that has seen enough ends the walk after the item it was given.
  const long callsBefore = endless->calls;
  CHECK(ForEachItem(endless, [](IUnknown*) { return false; }) == 1);
  CHECK(endless->calls == callsBefore + 1);
  endless->Release();
  CHECK(Fake<IUnknown>::live == 0);
  CHECK(Fake<IGeoObjectEnum>::live == 0);
  CHECK(ForEachItem(nullptr, [](IUnknown*) { return true; }) == 0);
}

TEST_CASE("volume files by database: its name as it answers, failures as they are, odd names read nothing") {
  ScratchFolder volume;
  WriteTextFile(volume / "shoal.txt", "text");
  REQUIRE(SetFileAttributesA((volume / "shoal.txt").c_str(), FILE_ATTRIBUTE_ARCHIVE));
  const std::string database = "BrGeoDb" + std::to_string(GetCurrentProcessId());
  const std::string enumKey = br::cRegSettings::FullPath(br::SETTINGS_ENUM_KEY);
  SavedRegistryValue folder(HKEY_LOCAL_MACHINE, enumKey + "\\" + database + "\\Volumes\\00", "");
  folder.SetString(volume.Path() + "\\");
  const std::wstring wideName(database.begin(), database.end());

  auto* host = new FakeDatabase;
  host->name = wideName.c_str();
  std::string path;
  REQUIRE(FindVolumeFile(host, "SHOAL.TXT", path) == S_OK);
  CHECK(path == volume / "shoal.txt");
  CHECK(FindVolumeFile(host, "absent.txt", path) == E_FAIL);
  host->nameResult = E_ACCESSDENIED;
  CHECK(FindVolumeFile(host, "shoal.txt", path) == E_ACCESSDENIED);
  host->nameResult = S_OK;
  host->name = nullptr;
  CHECK(FindVolumeFile(host, "shoal.txt", path) == REGDB_E_READREGDB);
  host->name = L"..\\..";
  CHECK(FindVolumeFile(host, "shoal.txt", path) == REGDB_E_READREGDB);
  CHECK(FindVolumeFile(nullptr, "shoal.txt", path) == E_POINTER);
  host->Release();
  CHECK(Fake<IGeoDatabase>::live == 0);
  folder.Delete();
  RegDeleteTreeA(HKEY_LOCAL_MACHINE, (enumKey + "\\" + database).c_str());
}

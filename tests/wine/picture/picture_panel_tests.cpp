// The picture panel over the stand-in host's sample scene: the list from attribute 120
// (stored pictures copied to the panel's own temporary folder, others found in the volume
// folder, a missing one stopping the fill), the folder's life, browsing and zooming the
// hosted view, and the picture window with its stored placement.
#include "picture/cXPictDescr.h"

#include "tests/wine/common/image_files.h"
#include "tests/wine/common/registry_test_support.h"
#include "tests/wine/common/widget_test_support.h"

#include "frame/com/ComRef.h"
#include "frame/settings/cRegSettings.h"
#include "frame/settings/settings.h"
#include "toolkit/base/class_records.h"

#include "BR_Private.h"

#include <doctest/doctest.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <string>

using namespace br::test;
using br::com::ComRef;
using br::picture::AXPictDescr;
using br::picture::cXPictDescr;

namespace {

std::string SourceFolder() {
  const char* root = getenv("BR_SOURCE_DIR");
  REQUIRE(root != nullptr);
  std::string path = "Z:";
  for (const char* c = root; *c; ++c) path += *c == '/' ? '\\' : *c;
  return path;
}

std::wstring Wide(const std::string& text) { return std::wstring(text.begin(), text.end()); }

// COM for the test, the sample scene loaded, and the chart database's volume folder set.
class Harbour {
public:
  Harbour()
      : volume_(HKEY_LOCAL_MACHINE, br::cRegSettings::FullPath(br::SETTINGS_ENUM_KEY) + "\\BREST\\Volumes\\00", "") {
    REQUIRE(SUCCEEDED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED)));
    volume_.SetString(SourceFolder() + "\\data\\harbour\\volume\\");
    CLSID clsid{};
    REQUIRE(CLSIDFromProgID(L"ChartScene.Scene", &clsid) == S_OK);
    REQUIRE(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, scene_.OutVoid()) == S_OK);
    VARIANT result = Call(L"Load", Wide(SourceFolder() + "\\data\\harbour\\harbour.json"));
    VariantClear(&result);
  }
  ~Harbour() {
    scene_.Reset();
    CoUninitialize();
  }
  ComRef<IGeoObject> Object(const wchar_t* name) {
    VARIANT result = Call(L"Object", name);
    REQUIRE(result.vt == VT_UNKNOWN);
    ComRef<IGeoObject> object;
    REQUIRE(result.punkVal->QueryInterface(IID_IGeoObject, object.OutVoid()) == S_OK);
    VariantClear(&result);
    return object;
  }

private:
  VARIANT Call(const wchar_t* method, const std::wstring& text) {
    DISPID id = 0;
    LPOLESTR names[] = {const_cast<LPOLESTR>(method)};
    REQUIRE(scene_->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
    VARIANT argument;
    argument.vt = VT_BSTR;
    argument.bstrVal = SysAllocString(text.c_str());
    DISPPARAMS parameters{&argument, nullptr, 1, 0};
    VARIANT result;
    VariantInit(&result);
    const HRESULT hr =
        scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, &result, nullptr, nullptr);
    VariantClear(&argument);
    REQUIRE(hr == S_OK);
    return result;
  }
  SavedRegistryValue volume_;
  ComRef<IDispatch> scene_;
};

std::string Bytes(const std::wstring& path) { return ReadWholeFile(std::string(path.begin(), path.end())); }

bool Exists(const std::wstring& path) { return GetFileAttributesW(path.c_str()) != INVALID_FILE_ATTRIBUTES; }

std::wstring ShownFile(AXPictDescr& pictures) {
  const auto view = ComRef<IXPICREPView>::Adopt(pictures.View());
  REQUIRE(view);
  VARIANT name;
  VariantInit(&name);
  REQUIRE(view->get_Property(PRV_PICFILENAME, &name) == S_OK);
  std::wstring text(name.bstrVal, SysStringLen(name.bstrVal));
  VariantClear(&name);
  return text;
}

long ShownZoom(AXPictDescr& pictures) {
  const auto view = ComRef<IXPICREPView>::Adopt(pictures.View());
  REQUIRE(view);
  VARIANT zoom;
  VariantInit(&zoom);
  REQUIRE(view->get_Property(PRV_ZOOMPERCENT, &zoom) == S_OK);
  return zoom.lVal;
}

// The panel made inside a host window, its view hosted.
struct MountedPanel {
  wtest::HostWindow host{400, 300};
  cXPictDescr panel;
  MountedPanel() {
    REQUIRE(panel.create(host.hwnd()));
    panel.setBounds(0, 0, 400, 300, true, true);
    panel.doLayout();
    REQUIRE(panel.pictures().isHosting());
  }
};

// A stored picture of `size` bytes whose reads fail once `failAt` bytes were read (never
// when negative); Stat tells `statSize` (fails when negative).
class FakeStream : public IStream {
public:
  long long size = 10000, failAt = -1, statSize = 10000, position = 0;
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    *out = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IStream) ? this : nullptr;
    return *out ? S_OK : E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP Read(void* buffer, ULONG wanted, ULONG* read) override {
    if (failAt >= 0 && position >= failAt) return STG_E_READFAULT;
    const ULONG n = static_cast<ULONG>(std::min<long long>(wanted, size - position));
    memset(buffer, 'p', n);
    position += n;
    *read = n;
    return S_OK;
  }
  STDMETHODIMP Write(const void*, ULONG, ULONG*) override { return E_NOTIMPL; }
  STDMETHODIMP Seek(LARGE_INTEGER, DWORD, ULARGE_INTEGER*) override { return E_NOTIMPL; }
  STDMETHODIMP SetSize(ULARGE_INTEGER) override { return E_NOTIMPL; }
  STDMETHODIMP CopyTo(IStream*, ULARGE_INTEGER, ULARGE_INTEGER*, ULARGE_INTEGER*) override { return E_NOTIMPL; }
  STDMETHODIMP Commit(DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Revert() override { return E_NOTIMPL; }
  STDMETHODIMP LockRegion(ULARGE_INTEGER, ULARGE_INTEGER, DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP UnlockRegion(ULARGE_INTEGER, ULARGE_INTEGER, DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Stat(STATSTG* status, DWORD) override {
    if (statSize < 0) return E_NOTIMPL;
    *status = STATSTG{};
    status->cbSize.QuadPart = static_cast<ULONGLONG>(statSize);
    return S_OK;
  }
  STDMETHODIMP Clone(IStream**) override { return E_NOTIMPL; }
};

// Holds one stream, "pic.bin", and opens it only as compound files do: read access with an
// exclusive share mode.
class FakeStorage : public IStorage {
public:
  FakeStream stream;
  DWORD mode = 0;
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    *out = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IStorage) ? this : nullptr;
    return *out ? S_OK : E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP CreateStream(LPCOLESTR, DWORD, DWORD, DWORD, IStream**) override { return E_NOTIMPL; }
  STDMETHODIMP OpenStream(LPCOLESTR name, void*, DWORD grfMode, DWORD, IStream** out) override {
    *out = nullptr;
    mode = grfMode;
    if (std::wstring(name) != L"pic.bin") return STG_E_FILENOTFOUND;
    if (grfMode != (STGM_READ | STGM_SHARE_EXCLUSIVE)) return STG_E_INVALIDFLAG;
    *out = &stream;
    return S_OK;
  }
  STDMETHODIMP CreateStorage(LPCOLESTR, DWORD, DWORD, DWORD, IStorage**) override { return E_NOTIMPL; }
  STDMETHODIMP OpenStorage(LPCOLESTR, IStorage*, DWORD, SNB, DWORD, IStorage**) override { return E_NOTIMPL; }
  STDMETHODIMP CopyTo(DWORD, const IID*, SNB, IStorage*) override { return E_NOTIMPL; }
  STDMETHODIMP MoveElementTo(LPCOLESTR, IStorage*, LPCOLESTR, DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Commit(DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Revert() override { return E_NOTIMPL; }
  STDMETHODIMP EnumElements(DWORD, void*, DWORD, IEnumSTATSTG**) override { return E_NOTIMPL; }
  STDMETHODIMP DestroyElement(LPCOLESTR) override { return E_NOTIMPL; }
  STDMETHODIMP RenameElement(LPCOLESTR, LPCOLESTR) override { return E_NOTIMPL; }
  STDMETHODIMP SetElementTimes(LPCOLESTR, const FILETIME*, const FILETIME*, const FILETIME*) override {
    return E_NOTIMPL;
  }
  STDMETHODIMP SetClass(REFCLSID) override { return E_NOTIMPL; }
  STDMETHODIMP SetStateBits(DWORD, DWORD) override { return E_NOTIMPL; }
  STDMETHODIMP Stat(STATSTG*, DWORD) override { return E_NOTIMPL; }
};

// An object with nothing but its storage.
class StoringObject : public IGeoObject {
public:
  FakeStorage storage;
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    *out = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IGeoObject) ? this : nullptr;
    return *out ? S_OK : E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP GetDataSet(IGeoDataSet** out) override { return *out = nullptr, E_FAIL; }
  STDMETHODIMP GetKindId(GUID*) override { return E_NOTIMPL; }
  STDMETHODIMP GetId(GUID*) override { return E_NOTIMPL; }
  STDMETHODIMP Reserved6() override { return E_NOTIMPL; }
  STDMETHODIMP GetClassCode(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP GetPrimitive(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP Reserved9() override { return E_NOTIMPL; }
  STDMETHODIMP GetAttribute(LONG, IGeoAttribute** out) override { return *out = nullptr, S_FALSE; }
  STDMETHODIMP GetAttributes(IGeoObjectEnum**) override { return E_NOTIMPL; }
  STDMETHODIMP GetRelated(IGeoObjectEnum**) override { return E_NOTIMPL; }
  STDMETHODIMP GetMembers(IGeoObjectEnum**) override { return E_NOTIMPL; }
  STDMETHODIMP Reserved14() override { return E_NOTIMPL; }
  STDMETHODIMP HitTest(IGeoProjection*, const RECT*, GEO_MAP_METRICS*) override { return E_NOTIMPL; }
  STDMETHODIMP Reserved16() override { return E_NOTIMPL; }
  STDMETHODIMP GetText(BSTR*) override { return E_NOTIMPL; }
  STDMETHODIMP Reserved18() override { return E_NOTIMPL; }
  STDMETHODIMP GetProperty(LONG, VARIANT*) override { return E_NOTIMPL; }
  STDMETHODIMP GetStorage(IStorage** out) override {
    *out = &storage;
    return S_OK;
  }
};

// The TIF*.tmp files in a folder.
int TemporaryFiles(const std::wstring& folder) {
  int count = 0;
  WIN32_FIND_DATAW entry;
  const HANDLE find = FindFirstFileW((folder + L"TIF*").c_str(), &entry);
  if (find == INVALID_HANDLE_VALUE) return 0;
  do ++count;
  while (FindNextFileW(find, &entry));
  FindClose(find);
  return count;
}

long long FileSize(const std::wstring& path) {
  WIN32_FILE_ATTRIBUTE_DATA data{};
  if (!GetFileAttributesExW(path.c_str(), GetFileExInfoStandard, &data)) return -1;
  return (static_cast<long long>(data.nFileSizeHigh) << 32) | data.nFileSizeLow;
}

}  // namespace

TEST_CASE("the list: stored pictures copied, volume pictures found, a missing one stops the fill") {
  Harbour harbour;
  const std::string files = SourceFolder() + "\\data\\harbour\\files\\";
  AXPictDescr pictures;  // no window: the list alone
  CHECK(toolkit::isKindOf(&pictures, &toolkit::records::AXComponent));
  const std::wstring folder = pictures.TemporaryFolder();
  REQUIRE_FALSE(folder.empty());
  wchar_t temp[MAX_PATH];
  GetTempPathW(MAX_PATH, temp);
  CHECK(folder.rfind(std::wstring(temp) + L"PICREP\\" + std::to_wstring(GetCurrentProcessId()) + L"_", 0) == 0);

  SUBCASE("two stored pictures: two temporary copies in the own folder, byte for byte") {
    REQUIRE(pictures.Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
    REQUIRE(pictures.Count() == 2);
    CHECK(pictures.Current() == -1);
    for (int i = 0; i < 2; ++i) {
      CHECK(pictures.PathAt(i).rfind(folder + L"TIF", 0) == 0);
    }
    CHECK(Bytes(pictures.PathAt(0)) == ReadWholeFile(files + "beacon.png"));
    CHECK(Bytes(pictures.PathAt(1)) == ReadWholeFile(files + "tower.jpg"));
    CHECK_FALSE(Bytes(pictures.PathAt(0)).empty());
  }
  SUBCASE("stored, then the volume folder, then a name found nowhere") {
    CHECK(pictures.Fill(harbour.Object(L"mengam-cardinal").Get()) == br::picture::kPictureNotFound);
    REQUIRE(pictures.Count() == 2);
    CHECK(Bytes(pictures.PathAt(0)) == ReadWholeFile(files + "cardinal.png"));
    CHECK(_wcsicmp(pictures.PathAt(1).c_str(), Wide(SourceFolder() + "\\data\\harbour\\volume\\lighthouse.tif").c_str()) == 0);
  }
  SUBCASE("a volume picture in a subfolder") {
    REQUIRE(pictures.Fill(harbour.Object(L"kerviniou-buoy").Get()) == S_OK);
    REQUIRE(pictures.Count() == 1);
    CHECK(_wcsicmp(pictures.PathAt(0).c_str(), Wide(SourceFolder() + "\\data\\harbour\\volume\\PICS\\buoy.bmp").c_str()) == 0);
  }
  SUBCASE("no attribute: an empty list; a new fill drops the last fill's copies") {
    REQUIRE(pictures.Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
    const std::wstring copy = pictures.PathAt(0);
    REQUIRE(pictures.Fill(harbour.Object(L"portzic-tower").Get()) == S_OK);
    CHECK_FALSE(pictures.HasContent());
    CHECK_FALSE(Exists(copy));
    CHECK(Exists(folder));
  }
  SUBCASE("empty names between separators are skipped") {
    REQUIRE(pictures.FillNames(harbour.Object(L"fillettes-beacon").Get(), ";;beacon.png,,|") == S_OK);
    CHECK(pictures.Count() == 1);
  }
  SUBCASE("a copy that cannot be written: 0x80040322, and no partial file") {
    // The own folder replaced by a plain file: no temporary file can be made in it.
    REQUIRE(pictures.Fill(harbour.Object(L"portzic-tower").Get()) == S_OK);
    REQUIRE(RemoveDirectoryW(folder.c_str()));
    const std::wstring blocker = folder.substr(0, folder.size() - 1);
    REQUIRE(WriteBroken(blocker));
    CHECK(pictures.FillNames(harbour.Object(L"fillettes-beacon").Get(), "beacon.png") == br::picture::kPictureNotCopied);
    CHECK(pictures.Count() == 0);
    DeleteFileW(blocker.c_str());
    CreateDirectoryW(folder.c_str(), nullptr);
  }
  SUBCASE("without a hosted view there is nothing to show") {
    REQUIRE(pictures.Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
    CHECK(pictures.Next() == E_NOTIMPL);
    CHECK(pictures.Previous() == E_NOTIMPL);
  }
}

TEST_CASE("copying a stored picture: exclusive read access, the stream's size, failed reads") {
  REQUIRE(SUCCEEDED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED)));
  {
    AXPictDescr pictures;
    StoringObject object;
    SUBCASE("the whole stream, opened the way compound files allow") {
      REQUIRE(pictures.FillNames(&object, "pic.bin") == S_OK);
      CHECK(object.storage.mode == (STGM_READ | STGM_SHARE_EXCLUSIVE));
      REQUIRE(pictures.Count() == 1);
      CHECK(FileSize(pictures.PathAt(0)) == 10000);
    }
    SUBCASE("the copy stops at the size the stream tells") {
      object.storage.stream.statSize = 2500;
      REQUIRE(pictures.FillNames(&object, "pic.bin") == S_OK);
      CHECK(FileSize(pictures.PathAt(0)) == 2500);
    }
    SUBCASE("a stream that ends before the size it tells: 0x80040322 and no partial file") {
      object.storage.stream.statSize = 20000;
      CHECK(pictures.FillNames(&object, "pic.bin") == br::picture::kPictureNotCopied);
      CHECK(pictures.Count() == 0);
      CHECK(TemporaryFiles(pictures.TemporaryFolder()) == 0);
    }
    SUBCASE("without a size, up to the first empty read") {
      object.storage.stream.statSize = -1;
      REQUIRE(pictures.FillNames(&object, "pic.bin") == S_OK);
      CHECK(FileSize(pictures.PathAt(0)) == 10000);
    }
    SUBCASE("a read failing halfway: 0x80040322 and no partial file") {
      object.storage.stream.failAt = 3072;
      CHECK(pictures.FillNames(&object, "pic.bin") == br::picture::kPictureNotCopied);
      CHECK(pictures.Count() == 0);
      CHECK(TemporaryFiles(pictures.TemporaryFolder()) == 0);
    }
  }
  CoUninitialize();
}

TEST_CASE("each panel has its own folder; one going leaves the other's files and links' targets alone") {
  Harbour harbour;
  auto first = std::make_unique<AXPictDescr>();
  auto second = std::make_unique<AXPictDescr>();
  REQUIRE(first->TemporaryFolder() != second->TemporaryFolder());
  REQUIRE(first->Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
  REQUIRE(second->Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
  const std::wstring firstFolder = first->TemporaryFolder(), secondFolder = second->TemporaryFolder();
  const std::wstring firstCopy = first->PathAt(0);
  // A link inside the first folder to a folder with a file of its own.
  ScratchFolder outside;
  WriteTextFile(outside / "keep.txt", "keep");
  const std::string link = std::string(firstFolder.begin(), firstFolder.end()) + "elsewhere";
  const bool linked = MakeFolderLink(link, outside.Path());
  // A read-only copy goes too.
  SetFileAttributesW(firstCopy.c_str(), FILE_ATTRIBUTE_READONLY);

  first.reset();
  CHECK_FALSE(Exists(firstCopy));
  CHECK(Exists(second->PathAt(0)));
  CHECK(Exists(second->PathAt(1)));
  // The link's target is never entered. (Wine cannot remove a folder link through the
  // platform's calls, so there the link and its folder stay behind.)
  CHECK(ReadWholeFile(outside / "keep.txt") == "keep");
  if (!linked) CHECK_FALSE(Exists(firstFolder));
  if (linked) RemoveTreeWithLinks(std::string(firstFolder.begin(), firstFolder.end() - 1));

  second.reset();
  CHECK_FALSE(Exists(secondFolder));
}

TEST_CASE("browsing and zooming the hosted view") {
  Harbour harbour;
  MountedPanel m;
  cXPictDescr& panel = m.panel;
  CHECK(toolkit::isKindOf(&panel, &toolkit::records::cXPictDescr));
  CHECK_FALSE(panel.previousButton().isEnabled());
  CHECK_FALSE(panel.nextButton().isEnabled());
  // The tool bar's images: 16 pixels wide, from the module's strip.
  REQUIRE(panel.nextButton().imageList() != nullptr);
  CHECK(panel.nextButton().imageSize().cx == 16);

  SUBCASE("an empty list: next, previous and the window toggle do nothing") {
    REQUIRE(panel.Fill(harbour.Object(L"portzic-tower").Get()) == S_OK);
    CHECK_FALSE(panel.HasContent());
    CHECK(panel.ShowNext() == S_FALSE);
    CHECK(panel.ShowPrevious() == S_FALSE);
    CHECK(panel.pictures().Current() == -1);
    panel.TogglePictureBox(true);
    CHECK(panel.pictureBox() == nullptr);
    CHECK_FALSE(panel.boxButton().isChecked());
  }
  SUBCASE("fill shows the first; next wraps, previous stops at the first") {
    REQUIRE(panel.Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
    CHECK(panel.HasContent());
    CHECK(panel.previousButton().isEnabled());
    CHECK(panel.pictures().Current() == 0);
    CHECK(panel.pictures().Shown());
    CHECK(ShownFile(panel.pictures()) == panel.pictures().PathAt(0));
    CHECK(panel.ShowNext() == S_OK);
    CHECK(ShownFile(panel.pictures()) == panel.pictures().PathAt(1));
    CHECK(panel.ShowNext() == S_OK);
    CHECK(panel.pictures().Current() == 0);
    CHECK(panel.ShowPrevious() == S_OK);
    CHECK(panel.pictures().Current() == 0);
  }
  SUBCASE("zoom steps: the choice, the buttons' states and the view") {
    REQUIRE(panel.Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
    REQUIRE(panel.zoomChoice().getItemCount() == 7);
    CHECK(panel.zoomChoice().getItem(0) == "200%");
    CHECK(panel.zoomChoice().getItem(6) == "20%");
    CHECK(panel.zoomChoice().getSelectedIndex() == 3);
    panel.ZoomIn();
    CHECK(ShownZoom(panel.pictures()) == 125);
    panel.ZoomIn();
    panel.ZoomIn();
    CHECK(ShownZoom(panel.pictures()) == 200);
    CHECK_FALSE(panel.zoomInButton().isEnabled());
    panel.ZoomIn();  // at 200%: nothing changes
    CHECK(panel.zoomChoice().getSelectedIndex() == 0);
    for (int i = 0; i < 10; ++i) panel.ZoomOut();
    CHECK(ShownZoom(panel.pictures()) == 20);
    CHECK_FALSE(panel.zoomOutButton().isEnabled());
    CHECK(panel.zoomInButton().isEnabled());
    // The user's own choice in the list arrives as a selection change from the combo box.
    const HWND combo = panel.zoomChoice().getHandle();
    const HWND own = GetParent(combo);
    REQUIRE(own);
    SendMessageW(combo, CB_SETCURSEL, 1, 0);
    SendMessageW(own, WM_COMMAND, MAKEWPARAM(GetDlgCtrlID(combo), CBN_SELCHANGE), reinterpret_cast<LPARAM>(combo));
    CHECK(ShownZoom(panel.pictures()) == 150);
  }
  SUBCASE("the view draws with the default shading of each palette") {
    PictureFolder folder(L"picpanel_shade");
    Pixels grey{8, 8, std::vector<std::uint32_t>(64, Argb(255, 200, 200, 200))};
    REQUIRE(WriteBmp24(folder.File(L"grey.bmp"), grey));
    const std::string store = br::cRegSettings::FullPath(br::SETTINGS_ENUM_KEY);
    SavedRegistryValue bases(HKEY_LOCAL_MACHINE, store, br::SETTING_BASES_STORE);
    bases.SetString(std::string(folder.Path().begin(), folder.Path().end() - 1) + "\\");
    REQUIRE(panel.FillNames(nullptr, "grey.bmp") == S_OK);
    const auto view = ComRef<IXPICREPView>::Adopt(panel.pictures().View());
    const int expected[5] = {200, 180, 150, 50, 20};
    for (int palette = 0; palette < 5; ++palette) {
      panel.SetPaletteNumber(palette);
      wtest::Canvas canvas(8, 8, RGB(0, 0, 0));
      ComRef<IViewObject> drawing;
      REQUIRE(view->QueryInterface(IID_IViewObject, drawing.OutVoid()) == S_OK);
      const RECTL box{0, 0, 8, 8};
      REQUIRE(drawing->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, canvas.dc(), &box, nullptr, nullptr, 0) ==
              S_OK);
      INFO("palette ", palette);
      CHECK(std::abs(static_cast<int>(GetGValue(canvas.at(4, 4))) - expected[palette]) <= 1);
    }
  }
}

TEST_CASE("the picture window: shown centred, placement stored, kept, and never past the work area") {
  Harbour harbour;
  const std::string key = br::cRegSettings::FullPath(br::SETTINGS_PICTURE_BOX_KEY);
  SavedRegistryValue left(HKEY_CURRENT_USER, key, "left"), top(HKEY_CURRENT_USER, key, "top"),
      right(HKEY_CURRENT_USER, key, "right"), bottom(HKEY_CURRENT_USER, key, "bottom");
  left.Delete();
  top.Delete();
  right.Delete();
  bottom.Delete();
  const br::cRegSettings user = br::cRegSettings::User();
  const auto stored = [&](const char* name) {
    return static_cast<long>(user.ReadDword(br::SETTINGS_PICTURE_BOX_KEY, name, 0x7FFFFFFF));
  };

  // A picture larger than the smallest window the platform allows.
  PictureFolder pictures(L"picpanel_box");
  REQUIRE(WriteBmp24(pictures.File(L"box.bmp"), CornerPattern(240, 160)));
  SavedRegistryValue bases(HKEY_LOCAL_MACHINE, br::cRegSettings::FullPath(br::SETTINGS_ENUM_KEY),
                           br::SETTING_BASES_STORE);
  bases.SetString(std::string(pictures.Path().begin(), pictures.Path().end()));

  MountedPanel m;
  cXPictDescr& panel = m.panel;
  REQUIRE(panel.FillNames(nullptr, "box.bmp") == S_OK);
  SetActiveWindow(m.host.hwnd());
  panel.TogglePictureBox(true);
  REQUIRE(panel.pictureBox() != nullptr);
  CHECK(panel.boxButton().isChecked());
  const HWND box = panel.pictureBox()->Window();
  REQUIRE(IsWindowVisible(box));
  // Made from the dialog template, with the Close button's default text.
  wchar_t className[16] = {};
  GetClassNameW(box, className, 16);
  CHECK(std::wstring(className) == L"#32770");
  CHECK(toolkit::isKindOf(&panel, &toolkit::records::Container));

  // Centred on the active window (the host at 100, 100, 400 x 300), as large as it wants.
  RECT window{}, client{};
  GetWindowRect(box, &window);
  GetClientRect(box, &client);
  const SIZE wanted = panel.pictureBox()->PreferredClientSize();
  CHECK(wanted.cx >= 240 + 2 * GetSystemMetrics(SM_CXVSCROLL));
  CHECK(client.right == wanted.cx);
  CHECK(client.bottom == wanted.cy);
  CHECK(std::abs((window.left + window.right) / 2 - 300) <= 1);
  CHECK(std::abs((window.top + window.bottom) / 2 - 250) <= 1);
  CHECK(stored("left") == 0x7FFFFFFF);  // nothing written by showing

  // Moved: the client rectangle in screen coordinates is written.
  SetWindowPos(box, nullptr, 37, 41, 0, 0, SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
  POINT corner{0, 0};
  ClientToScreen(box, &corner);
  CHECK(stored("left") == corner.x);
  CHECK(stored("top") == corner.y);
  CHECK(stored("right") == corner.x + client.right);
  CHECK(stored("bottom") == corner.y + client.bottom);

  // Closed by the user: hidden, the toggle comes up.
  SendMessageW(box, WM_CLOSE, 0, 0);
  CHECK_FALSE(IsWindowVisible(box));
  CHECK(IsWindow(box));
  CHECK_FALSE(panel.boxButton().isChecked());

  // Shown again: its own position, its size from its contents.
  panel.TogglePictureBox(true);
  RECT again{};
  GetWindowRect(box, &again);
  CHECK(again.left == 37);
  CHECK(again.top == 41);

  SUBCASE("a new fill: the window follows, and the last fill's copies can go") {
    REQUIRE(panel.Fill(harbour.Object(L"fillettes-beacon").Get()) == S_OK);
    const std::wstring copy = panel.pictures().PathAt(0);
    CHECK(IsWindowVisible(box));
    const auto view = ComRef<IXPICREPView>::Adopt(panel.pictureBox()->View());
    VARIANT name;
    VariantInit(&name);
    REQUIRE(view->get_Property(PRV_PICFILENAME, &name) == S_OK);
    CHECK(std::wstring(name.bstrVal) == copy);
    VariantClear(&name);
    REQUIRE(panel.Fill(harbour.Object(L"portzic-tower").Get()) == S_OK);
    CHECK_FALSE(Exists(copy));
    CHECK_FALSE(IsWindowVisible(box));
    CHECK_FALSE(panel.boxButton().isChecked());
  }
  SUBCASE("a picture larger than the screen: the window stays inside the work area") {
    PictureFolder folder(L"picpanel_large");
    REQUIRE(WriteBmp24(folder.File(L"large.bmp"), CornerPattern(3000, 2400)));
    REQUIRE(panel.pictureBox()->ShowPicture(folder.File(L"large.bmp")));
    RECT work{};
    SystemParametersInfoW(SPI_GETWORKAREA, 0, &work, 0);
    RECT large{};
    GetWindowRect(box, &large);
    CHECK(large.right - large.left <= work.right - work.left);
    CHECK(large.bottom - large.top <= work.bottom - work.top);
    CHECK(large.left >= work.left);
    CHECK(large.top >= work.top);
    panel.TogglePictureBox(false);
    CHECK_FALSE(IsWindowVisible(box));
  }
}

TEST_CASE("picture names that climb out, are absolute, shares, subfolder paths or patterns find nothing") {
  Harbour harbour;
  const std::string volume = SourceFolder() + "\\data\\harbour\\volume\\";
  REQUIRE(Exists(Wide(volume + "lighthouse.tif")));
  REQUIRE(Exists(Wide(volume + "PICS\\buoy.bmp")));
  // Without its drive: a ":" parts names, so a drive path never arrives whole.
  const std::string rooted = volume.substr(2) + "lighthouse.tif";
  const std::string names[] = {"..\\volume\\lighthouse.tif", "../volume/lighthouse.tif", "PICS\\buoy.bmp",
                               "PICS/buoy.bmp", ".\\lighthouse.tif", rooted, "\\\\localhost\\Z$" + rooted,
                               "\\\\?\\UNC\\localhost\\Z$" + rooted, "..\\files\\beacon.png", "lighthouse.tif\\",
                               "lighthouse.t?f", "*.tif", "..", "PICS"};
  AXPictDescr pictures;
  const ComRef<IGeoObject> object = harbour.Object(L"fillettes-beacon");
  for (const std::string& name : names) {
    INFO(name);
    CHECK(pictures.FillNames(object.Get(), name) == br::picture::kPictureNotFound);
    CHECK(pictures.Count() == 0);
    CHECK(TemporaryFiles(pictures.TemporaryFolder()) == 0);
  }
  // The same files by their plain names: stored, in the volume folder, in its subfolder.
  REQUIRE(pictures.FillNames(object.Get(), "beacon.png;lighthouse.tif;buoy.bmp") == S_OK);
  CHECK(pictures.Count() == 3);
}

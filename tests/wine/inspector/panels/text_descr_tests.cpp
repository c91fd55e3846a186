// The text description panel standing alone in a host window, over a scene written here:
// the stored stream before the folders, the volume folder before the store folder, what is
// not found, attributes of the wrong kind, empty files, names that try to leave a folder,
// and the text read back from the rich edit control as a client reads it.
#include <doctest/doctest.h>

#include <richedit.h>

#include <string>

#include "frame/settings/cRegSettings.h"
#include "frame/settings/settings.h"
#include "inspector/panels/cXTextDescr.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/common/registry_test_support.h"
#include "tests/wine/common/widget_test_support.h"
#include "tests/wine/inspector/panels/panel_test_support.h"

using br::inspector::cXTextDescr;
using br::test::ScratchScene;

namespace {

std::string Slashed(std::string path) {
  for (char& c : path)
    if (c == '\\') c = '/';
  return path;
}

// The scene's chart database "TEXTDB<pid>" names its volume folder in the registry; the
// store folder is the registry's BasesStore. Texts of the same name lie in several places
// so the order of the search shows.
struct TextScene {
  br::test::Apartment apartment;
  ScratchFolder stored, volume, store;
  const std::string database = "TEXTDB" + std::to_string(GetCurrentProcessId());
  const std::string enumKey = br::cRegSettings::FullPath(br::SETTINGS_ENUM_KEY);
  SavedRegistryValue volumeFolder{HKEY_LOCAL_MACHINE, enumKey + "\\" + database + "\\Volumes\\00", ""};
  SavedRegistryValue storeFolder{HKEY_LOCAL_MACHINE, enumKey, br::SETTING_BASES_STORE};
  std::unique_ptr<ScratchScene> scene;

  TextScene() {
    WriteTextFile(stored / "note.txt", "Stored with the buoy");
    WriteTextFile(stored / "empty.txt", "");
    WriteTextFile(volume / "NOTE.TXT", "From the volume folder");
    WriteTextFile(volume / "harbour.txt", "Harbour rules\r\nSecond line");
    WriteTextFile(volume / "both.txt", "Volume wins");
    WriteTextFile(volume / "blank.txt", "");
    WriteTextFile(store / "both.txt", "Store loses");
    WriteTextFile(store / "national.txt", "Texte en langue nationale");
    WriteTextFile(store / "secret.txt", "outside");
    REQUIRE(SetFileAttributesA((volume / "harbour.txt").c_str(), FILE_ATTRIBUTE_ARCHIVE));
    volumeFolder.SetString(volume.Path() + "\\");
    storeFolder.SetString(store.Path() + "\\");
    const std::string s = Slashed(stored.Path());
    scene = std::make_unique<ScratchScene>(R"({"format":"chartscene 1","databases":[
      {"name":")" + database + R"(","kind":"chart","datasets":[{"id":"TEXTS001","objects":[
        {"name":"stored","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"NOTE.TXT"},
         "files":{"NOTE.TXT":")" + s + R"(/note.txt"}},
        {"name":"volume","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"harbour.txt","NTXTDS":"national.txt"}},
        {"name":"both","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"both.txt"}},
        {"name":"missing","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"nowhere.txt"}},
        {"name":"number","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":{"I4":5}}},
        {"name":"empty-stored","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"EMPTY.TXT"},
         "files":{"EMPTY.TXT":")" + s + R"(/empty.txt"}},
        {"name":"empty-file","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"blank.txt"}},
        {"name":"climber","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"..\\secret.txt","NTXTDS":")" +
                                          Slashed(store / "secret.txt") + R"("}},
        {"name":"plain","class":"BOYLAT","point":[0,0],"attributes":{"OBJNAM":"No text"}}]}]},
      {"name":"USERTEXT","kind":"user","datasets":[{"id":"USER0001","objects":[
        {"name":"user","class":"BOYLAT","point":[0,0],"attributes":{"TXTDSC":"harbour.txt"}}]}]}]})");
  }
  ~TextScene() {
    scene.reset();
    volumeFolder.Delete();
    RegDeleteTreeA(HKEY_LOCAL_MACHINE, (enumKey + "\\" + database).c_str());
  }
  Microsoft::WRL::ComPtr<IGeoObject> Object(const wchar_t* name) const { return scene->Object(name); }
};

struct MountedText {
  wtest::HostWindow host{420, 300};
  cXTextDescr panel;
  MountedText() {
    REQUIRE(panel.create(host.hwnd()));
    panel.setBounds(0, 0, 400, 280, true, true);
  }
  // The text as a client reads it from the rich edit window.
  std::string Shown() const {
    HWND edit = panel.nativeWindow();
    REQUIRE(edit != nullptr);
    char text[512] = {};
    const LRESULT length = SendMessageA(edit, WM_GETTEXT, sizeof(text), reinterpret_cast<LPARAM>(text));
    return std::string(text, static_cast<std::size_t>(length > 0 ? length : 0));
  }
};

// Rich edit controls may hand line ends back as a lone CR.
std::string Lines(std::string text) {
  std::string out;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '\r') {
      out += '\n';
      if (i + 1 < text.size() && text[i + 1] == '\n') ++i;
    } else {
      out += text[i];
    }
  }
  return out;
}

}  // namespace

TEST_CASE("text description: the rich edit window, and its text read back") {
  TextScene texts;
  MountedText mounted;
  HWND edit = mounted.panel.nativeWindow();
  REQUIRE(edit != nullptr);
  CHECK(mounted.panel.hasHandle(GetParent(edit)));
  char windowClass[32] = {};
  GetClassNameA(edit, windowClass, sizeof(windowClass));
  CHECK(std::string(windowClass) == mounted.panel.RichEditClass());
  CHECK(mounted.panel.RichEditClass() == "RICHEDIT");
  // The control drops WS_VSCROLL itself while the text needs no scrolling.
  CHECK((static_cast<DWORD>(GetWindowLongA(edit, GWL_STYLE)) | WS_VSCROLL) == cXTextDescr::kRichEditStyle);
  CHECK((GetWindowLongA(edit, GWL_EXSTYLE) & WS_EX_CLIENTEDGE) != 0);
  RECT outer{}, own{};
  GetWindowRect(edit, &outer);
  GetClientRect(GetParent(edit), &own);
  CHECK(own.right == 400);  // the rich edit covers the panel's window, border included
  CHECK(outer.right - outer.left == own.right);
  CHECK(outer.bottom - outer.top == own.bottom);
  CHECK(mounted.panel.getText().empty());
  CHECK_FALSE(mounted.panel.HasContent());

  CHECK(mounted.panel.Fill(texts.Object(L"volume").Get(), cXTextDescr::kDescription) == S_OK);
  CHECK(mounted.panel.HasContent());
  CHECK(Lines(mounted.Shown()) == "Harbour rules\nSecond line");
  CHECK(mounted.panel.Buffer() == "Harbour rules\r\nSecond line");

  // Gone with the panel's window, and made again with the kept text.
  mounted.panel.destroyWindow();
  CHECK(mounted.panel.nativeWindow() == nullptr);
  CHECK_FALSE(IsWindow(edit));
  REQUIRE(mounted.panel.create(mounted.host.hwnd()));
  CHECK(Lines(mounted.Shown()) == "Harbour rules\nSecond line");
}

TEST_CASE("text description: stored stream first, then the volume folder, then the store folder") {
  TextScene texts;
  MountedText mounted;
  cXTextDescr& panel = mounted.panel;

  // The stored stream wins over the volume folder's NOTE.TXT.
  CHECK(panel.Fill(texts.Object(L"stored").Get(), cXTextDescr::kDescription) == S_OK);
  CHECK(mounted.Shown() == "Stored with the buoy");
  // Found in the volume folder under any case, with its archive attribute set.
  CHECK(panel.Fill(texts.Object(L"volume").Get(), cXTextDescr::kDescription) == S_OK);
  CHECK(Lines(mounted.Shown()) == "Harbour rules\nSecond line");
  // Only in the store folder.
  CHECK(panel.Fill(texts.Object(L"volume").Get(), cXTextDescr::kNationalDescription) == S_OK);
  CHECK(mounted.Shown() == "Texte en langue nationale");
  // In both folders: the volume folder's.
  CHECK(panel.Fill(texts.Object(L"both").Get(), cXTextDescr::kDescription) == S_OK);
  CHECK(mounted.Shown() == "Volume wins");
}

TEST_CASE("text description: what is not found, not text or not of a chart, and empty files") {
  TextScene texts;
  MountedText mounted;
  cXTextDescr& panel = mounted.panel;
  REQUIRE(panel.Fill(texts.Object(L"both").Get(), cXTextDescr::kDescription) == S_OK);

  // No such attribute: the panel stays as it was.
  CHECK(panel.Fill(texts.Object(L"plain").Get(), cXTextDescr::kDescription) == S_FALSE);
  CHECK(panel.HasContent());
  CHECK(mounted.Shown() == "Volume wins");

  // Not found anywhere: no content, the old text stays in the buffer.
  CHECK(panel.Fill(texts.Object(L"missing").Get(), cXTextDescr::kDescription) == static_cast<HRESULT>(0x80040321));
  CHECK_FALSE(panel.HasContent());
  CHECK(panel.Buffer() == "Volume wins");

  // Names are matched against folder entries, never made into paths.
  CHECK(panel.Fill(texts.Object(L"climber").Get(), cXTextDescr::kDescription) == cXTextDescr::kFileNotFound);
  CHECK(panel.Fill(texts.Object(L"climber").Get(), cXTextDescr::kNationalDescription) == cXTextDescr::kFileNotFound);
  CHECK(panel.Buffer() == "Volume wins");

  CHECK(panel.Fill(texts.Object(L"number").Get(), cXTextDescr::kDescription) == E_NOINTERFACE);
  CHECK(panel.Fill(nullptr, cXTextDescr::kDescription) == E_NOINTERFACE);
  CHECK(panel.Fill(texts.Object(L"user").Get(), cXTextDescr::kDescription) == E_INVALIDARG);

  // An empty file, stored or in a folder, is a text all the same.
  CHECK(panel.Fill(texts.Object(L"empty-stored").Get(), cXTextDescr::kDescription) == S_OK);
  CHECK(panel.HasContent());
  CHECK(mounted.Shown().empty());
  REQUIRE(panel.Fill(texts.Object(L"both").Get(), cXTextDescr::kDescription) == S_OK);
  CHECK(panel.Fill(texts.Object(L"empty-file").Get(), cXTextDescr::kDescription) == S_OK);
  CHECK(panel.HasContent());
  CHECK(mounted.Shown().empty());

  panel.Clear();
  CHECK_FALSE(panel.HasContent());
  CHECK(panel.Buffer().empty());
}

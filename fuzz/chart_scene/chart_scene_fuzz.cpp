// The stand-in host's scene files: the JSON reader and the scene loader over gdal-data's
// S-57 catalogue (BR_S57_FOLDER, default /usr/share/gdal), and the scene dates.
//
// One input: u8 choice, then the text. Choice 0 (and any other): the text as a scene file,
// loaded over a scratch folder holding "files/note.txt". Choice 1: the text as a scene
// date. Stored file paths that leave the scratch folder (absolute, or with "..") skip the
// input, so a run never reads the machine's own files. Checked beyond "no crash": a
// refused scene names a line and column inside the text and leaves the scene it was given
// as it was; a loaded scene's relations point at objects that exist and go both ways, its
// datasets and databases name each other; a date is finite.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "fuzz/common/fuzz_check.h"
#include "host/chartscene/model/S57Catalogue.h"
#include "host/chartscene/model/json_reader.h"
#include "host/chartscene/model/scene_loader.h"

using namespace br::chartscene;

namespace {

const S57Catalogue* catalogue = nullptr;

bool LeavesFolder(const std::string& path) {
  return path.empty() || path[0] == '/' || path[0] == '\\' || path.find(':') != std::string::npos ||
         path.find("..") != std::string::npos;
}

// True when some "files" member anywhere names a path outside the scene's folder.
bool NamesOutsideFile(const JsonValue& value) {
  for (const JsonMember& member : value.members) {
    if (member.key == "files" && member.value.kind == JsonValue::Kind::Object) {
      for (const JsonMember& file : member.value.members) {
        if (file.value.kind == JsonValue::Kind::String && LeavesFolder(file.value.text)) return true;
      }
    }
    if (NamesOutsideFile(member.value)) return true;
  }
  for (const JsonValue& item : value.items) {
    if (NamesOutsideFile(item)) return true;
  }
  return false;
}

bool Holds(const std::vector<std::size_t>& list, std::size_t index) {
  for (std::size_t i : list) {
    if (i == index) return true;
  }
  return false;
}

void CheckScene(const SceneModel& scene) {
  for (std::size_t d = 0; d < scene.databases.size(); ++d) {
    for (std::size_t s : scene.databases[d].dataSets) {
      FUZZ_CHECK(s < scene.dataSets.size() && scene.dataSets[s].database == d);
    }
  }
  for (std::size_t s = 0; s < scene.dataSets.size(); ++s) {
    FUZZ_CHECK(scene.dataSets[s].database < scene.databases.size());
    for (std::size_t o : scene.dataSets[s].objects) {
      FUZZ_CHECK(o < scene.objects.size() && scene.objects[o].dataSet == s);
    }
  }
  for (std::size_t o = 0; o < scene.objects.size(); ++o) {
    const SceneObjectModel& object = scene.objects[o];
    for (std::size_t m : object.members) {
      FUZZ_CHECK(m < scene.objects.size() && m != o && Holds(scene.objects[m].holders, o));
    }
    for (std::size_t h : object.holders) {
      FUZZ_CHECK(h < scene.objects.size() && Holds(scene.objects[h].members, o));
    }
    for (const StoredFile& file : object.files) FUZZ_CHECK(!file.name.empty() && file.name.size() <= 31);
  }
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  static S57Catalogue loaded;
  std::string error;
  const char* folder = std::getenv("BR_S57_FOLDER");
  if (!loaded.LoadFolder(folder && *folder ? folder : "/usr/share/gdal", error)) {
    std::fprintf(stderr, "chart_scene: no S-57 catalogue: %s\n", error.c_str());
    std::abort();
  }
  catalogue = &loaded;
  br::fuzz::WriteScratchFile("note.txt", "Leading lights 043\xC2\xB0");
  std::filesystem::create_directories(br::fuzz::ScratchFolder() / "files");
  std::filesystem::rename(br::fuzz::ScratchFolder() / "note.txt", br::fuzz::ScratchFolder() / "files" / "note.txt");
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);

  if (data[0] % 2 == 1) {
    double days = 0;
    if (ParseSceneDate(text, days)) FUZZ_CHECK(std::isfinite(days));
    return 0;
  }

  JsonValue root;
  JsonError jsonError;
  if (ParseJson(text, root, jsonError) && NamesOutsideFile(root)) return 0;

  SceneModel scene;
  scene.faults["sentinel"] = 1;
  SceneError error;
  if (!LoadScene(text, br::fuzz::ScratchFolder().string(), *catalogue, scene, error)) {
    std::size_t lines = 1;
    for (char c : text) lines += c == '\n';
    FUZZ_CHECK(error.line >= 1 && static_cast<std::size_t>(error.line) <= lines);
    FUZZ_CHECK(error.column >= 1 && static_cast<std::size_t>(error.column) <= text.size() + 1);
    FUZZ_CHECK(!error.message.empty());
    FUZZ_CHECK(scene.faults.size() == 1 && scene.faults.count("sentinel") == 1 && scene.objects.empty());
    return 0;
  }
  FUZZ_CHECK(scene.faults.count("sentinel") == 0);
  CheckScene(scene);
  return 0;
}

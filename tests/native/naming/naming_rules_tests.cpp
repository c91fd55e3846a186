// The naming rules of docs/architecture.md, checked over every source file of the tree, so a
// file named in another dialect fails the suite instead of waiting for a reviewer.

#include <doctest/doctest.h>

#include <cctype>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

namespace fs = std::filesystem;

namespace {

const char* const kSourceFolders[] = {"frame", "tides", "toolkit", "host", "tools", "tests", "bench",
                                      "fuzz", "inspector", "legend", "contours", "picture"};

fs::path Root() {
  const char* dir = std::getenv("BR_SOURCE_DIR");
  REQUIRE_MESSAGE(dir != nullptr, "BR_SOURCE_DIR names the source tree");
  return dir;
}

std::vector<fs::path> Sources(const fs::path& root) {
  std::vector<fs::path> files;
  for (const char* folder : kSourceFolders) {
    const fs::path top = root / folder;
    if (!fs::exists(top)) continue;
    for (auto it = fs::recursive_directory_iterator(top); it != fs::recursive_directory_iterator(); ++it) {
      const std::string name = it->path().filename().string();
      if (it->is_directory() && (name == "corpus" || name == "regressions" || name == "node_modules")) {
        it.disable_recursion_pending();
        continue;
      }
      const std::string ext = it->path().extension().string();
      if (it->is_regular_file() && (ext == ".h" || ext == ".cpp")) files.push_back(it->path());
    }
  }
  return files;
}

std::string Read(const fs::path& file) {
  std::ifstream in(file, std::ios::binary);
  std::ostringstream text;
  text << in.rdbuf();
  return text.str();
}

bool IsSnakeCase(const std::string& stem) {
  for (char c : stem)
    if (!(std::islower(static_cast<unsigned char>(c)) || std::isdigit(static_cast<unsigned char>(c)) || c == '_'))
      return false;
  return true;
}

std::string CamelFromSnake(const std::string& stem) {
  std::string camel;
  bool upper = true;
  for (char c : stem) {
    if (c == '_') {
      upper = true;
    } else {
      camel += upper ? static_cast<char>(std::toupper(static_cast<unsigned char>(c))) : c;
      upper = false;
    }
  }
  return camel;
}

// Names of the classes (and, with structs, the plain records) a header defines.
std::set<std::string> DeclaredTypes(const std::string& text, bool withStructs) {
  static const std::regex declaration(R"((?:^|\n)\s*(?:template\s*<[^>]*>\s*)?(class|struct)\s+(\w+)(?:\s+final)?\s*[:{])");
  std::set<std::string> names;
  for (std::sregex_iterator it(text.begin(), text.end(), declaration), end; it != end; ++it)
    if (withStructs || (*it)[1].str() == "class") names.insert((*it)[2].str());
  return names;
}

std::string Relative(const fs::path& root, const fs::path& file) { return fs::relative(file, root).generic_string(); }

bool InTests(const std::string& relative) {
  return relative.rfind("tests/", 0) == 0 || relative.find("/tests/") != std::string::npos;
}

}  // namespace

TEST_CASE("a file is named after the class it holds, free-function files in snake_case") {
  const fs::path root = Root();
  std::vector<std::string> wrong;
  for (const fs::path& file : Sources(root)) {
    if (file.extension() != ".h") continue;
    const std::string stem = file.stem().string();
    const std::string text = Read(file);
    if (IsSnakeCase(stem)) {
      // The dialect this rule ended: tides_port.h holding class TidesPort. A free-function
      // file may hold the plain record its functions fill (day_report.h: struct DayReport).
      if (DeclaredTypes(text, false).count(CamelFromSnake(stem)))
        wrong.push_back(Relative(root, file) + " holds class " + CamelFromSnake(stem));
    } else if (!DeclaredTypes(text, true).count(stem)) {
      wrong.push_back(Relative(root, file) + " holds no class " + stem);
    }
  }
  CHECK_MESSAGE(wrong.empty(), [&] {
    std::string all;
    for (const auto& w : wrong) all += "\n  " + w;
    return all;
  }());
}

TEST_CASE("a class's sources sit beside its header; test sources end in _tests.cpp") {
  const fs::path root = Root();
  std::vector<std::string> wrong;
  for (const fs::path& file : Sources(root)) {
    if (file.extension() != ".cpp") continue;
    const std::string stem = file.stem().string();
    const std::string relative = Relative(root, file);
    const bool hasHeader = fs::exists(fs::path(file).replace_extension(".h"));
    if (!IsSnakeCase(stem)) {
      // Table.cpp, TableInput.cpp and TableView.cpp all belong to Table.h.
      bool owner = hasHeader;
      for (std::size_t n = stem.size(); !owner && n > 0; --n)
        owner = std::isupper(static_cast<unsigned char>(stem[n - 1])) &&
                fs::exists(file.parent_path() / (stem.substr(0, n - 1) + ".h"));
      if (!owner) wrong.push_back(relative + " has no class header beside it");
    } else if (InTests(relative) && !hasHeader) {
      const bool suite = stem.size() > 6 && stem.compare(stem.size() - 6, 6, "_tests") == 0;
      const bool main = stem.size() >= 4 && stem.compare(stem.size() - 4, 4, "main") == 0;
      if (!suite && !main) wrong.push_back(relative + " is a test source without the _tests suffix");
    }
  }
  CHECK_MESSAGE(wrong.empty(), [&] {
    std::string all;
    for (const auto& w : wrong) all += "\n  " + w;
    return all;
  }());
}

TEST_CASE("one namespace per layer and one member spelling") {
  const fs::path root = Root();
  static const std::regex hungarianMember(R"((^|[^.>\w])m_[A-Za-z]\w*)");
  std::vector<std::string> wrong;
  for (const fs::path& file : Sources(root)) {
    const std::string relative = Relative(root, file);
    const std::string text = Read(file);
    if (std::regex_search(text, hungarianMember)) wrong.push_back(relative + " has an m_ member");
    if (file.extension() != ".h" || InTests(relative)) continue;
    const bool toolkit = relative.rfind("toolkit/", 0) == 0;
    const bool library = toolkit || relative.rfind("frame/", 0) == 0 || relative.rfind("tides/", 0) == 0 ||
                         relative.rfind("inspector/", 0) == 0 || relative.rfind("legend/", 0) == 0 ||
                         relative.rfind("contours/", 0) == 0 || relative.rfind("picture/", 0) == 0;
    if (!library) continue;
    const std::string expected = toolkit ? "\nnamespace toolkit" : "\nnamespace br";
    if (("\n" + text).find(expected) == std::string::npos) wrong.push_back(relative + " is outside " + expected.substr(1));
  }
  CHECK_MESSAGE(wrong.empty(), [&] {
    std::string all;
    for (const auto& w : wrong) all += "\n  " + w;
    return all;
  }());
}

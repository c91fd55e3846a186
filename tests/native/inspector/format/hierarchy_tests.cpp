// The hierarchy's rules: value texts by type, the levels a node takes, the buttons'
// request text read back strictly, and the tree over hosts that relate nodes both ways,
// in circles, or not at all.
#include <doctest/doctest.h>

#include <algorithm>
#include <cfloat>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "inspector/format/hierarchy_request.h"
#include "inspector/format/hierarchy_tree.h"
#include "inspector/format/hierarchy_values.h"

using namespace br::inspector;

namespace {

HierarchyValue Whole(HierarchyValueType type, std::int64_t value) {
  HierarchyValue v;
  v.type = type;
  v.whole = value;
  return v;
}

HierarchyValue Real(HierarchyValueType type, double value) {
  HierarchyValue v;
  v.type = type;
  v.real = value;
  return v;
}

// A host in memory: objects by handle, each with its class, level and related handles.
struct FakeObject {
  long classCode = kClassHierarchyNode;
  std::optional<unsigned> level;
  std::vector<std::size_t> related;
};

class FakeSource : public HierarchySource {
public:
  std::vector<FakeObject> objects;
  std::size_t relatedCalls = 0;
  std::size_t failingRelated = SIZE_MAX;

  std::size_t Add(long classCode, std::optional<unsigned> level) {
    objects.push_back({classCode, level, {}});
    return objects.size() - 1;
  }
  // Relates both ways, the holder first in the member's list, as the hosts do.
  void Hold(std::size_t holder, std::size_t member) {
    objects[holder].related.push_back(member);
    auto& back = objects[member].related;
    back.insert(back.begin(), holder);
  }

  bool Related(std::size_t handle, std::vector<std::size_t>& related) override {
    ++relatedCalls;
    if (handle == failingRelated) return false;
    related = objects.at(handle).related;
    return true;
  }
  std::optional<HierarchyItem> Describe(std::size_t handle) override {
    if (handle >= objects.size()) return std::nullopt;
    HierarchyItem item;
    item.id[0] = static_cast<unsigned char>(handle + 1);
    item.id[1] = static_cast<unsigned char>((handle + 1) >> 8);
    item.classCode = objects[handle].classCode;
    if (item.classCode == kClassHierarchyNode) item.level = objects[handle].level;
    return item;
  }
};

// The tree as "handle@depth" in the order built.
std::vector<std::string> Shape(const HierarchyTree& tree) {
  std::vector<std::string> shape;
  for (const HierarchyNode& node : tree.nodes) {
    shape.push_back(std::to_string(node.handle) + "@" + std::to_string(node.depth));
  }
  return shape;
}

}  // namespace

TEST_CASE("value texts: each type's own no-value marker, unsigned numbers without a letter") {
  CHECK(HierarchyValueText(Whole(HierarchyValueType::I1, 127)) == "<unknown>");
  CHECK(HierarchyValueText(Whole(HierarchyValueType::I2, 127)) == "127");  // a byte's marker, not a short's
  CHECK(HierarchyValueText(Whole(HierarchyValueType::I4, 32767)) == "32767");
  CHECK(HierarchyValueText(Whole(HierarchyValueType::I4, -2147483647 - 1)) == "-2147483648");
  CHECK(HierarchyValueText(Whole(HierarchyValueType::UI4, 4294967295)) == "4294967295");
  HierarchyValue enumerated = Whole(HierarchyValueType::UI2, 0);
  enumerated.enumText = "green";
  CHECK(HierarchyValueText(enumerated) == "<unknown>");  // 0 before the catalogue's text
  CHECK(HierarchyValueText(Real(HierarchyValueType::R4, DBL_MAX)) != "<unknown>");
  CHECK(HierarchyValueText(Real(HierarchyValueType::R8, FLT_MAX)).size() > 30);  // printed in full
  CHECK(HierarchyValueText(Real(HierarchyValueType::R8, -DBL_MAX)).size() > 300);
}

TEST_CASE("a node of a level takes the nodes below it, and leaves only from levels 5 to 7") {
  CHECK(TakesChildNode(7, 7));
  CHECK(TakesChildNode(7, 5));
  CHECK_FALSE(TakesChildNode(6, 7));
  CHECK(TakesChildNode(6, 6));
  CHECK(TakesChildNode(6, 5));
  CHECK_FALSE(TakesChildNode(5, 6));
  CHECK(TakesChildNode(5, 5));
  CHECK(TakesChildNode(5, 4));
  CHECK_FALSE(TakesChildNode(4, 3));
  CHECK_FALSE(TakesChildNode(8, 5));
  CHECK(TakesLeaves(5));
  CHECK(TakesLeaves(7));
  CHECK_FALSE(TakesLeaves(4));
  CHECK_FALSE(TakesLeaves(8));
  CHECK(IsHierarchyLeafClass(57001));
  CHECK(IsHierarchyLeafClass(57003));
  CHECK_FALSE(IsHierarchyLeafClass(57005));
  CHECK_FALSE(IsHierarchyLeafClass(57004));
}

TEST_CASE("identity texts: the platform's byte order, 8-bit text beyond ASCII refused") {
  const auto id = ParseHierarchyIdText("{0A0B0C0D-0E0F-1011-4353-49a0b0c0d0e0}");
  REQUIRE(id);
  const HierarchyId expected = {0x0D, 0x0C, 0x0B, 0x0A, 0x0F, 0x0E, 0x11, 0x10,
                                0x43, 0x53, 0x49, 0xA0, 0xB0, 0xC0, 0xD0, 0xE0};
  CHECK(*id == expected);
  CHECK(HierarchyIdText(*id) == "{0A0B0C0D-0E0F-1011-4353-49A0B0C0D0E0}");
  CHECK_FALSE(ParseHierarchyIdText("{0A0B0C0D-0E0F-1011-4353-49A0B0C0D0E\xC5}"));
  CHECK_FALSE(ParseHierarchyIdText("ChartScene.Scene"));
}

TEST_CASE("a request is acted on only with the title, two strict identities and a hierarchy kind") {
  HierarchyId object{};
  object[0] = 7;
  object[8] = 'C';
  const std::string sent = HierarchyRequestText(kHierarchyTitle, object, kHierarchyKindId);
  CHECK(sent ==
        "CHART SUPPLEMENTARY INFORMATION|{00000007-0000-0000-4300-000000000000}|"
        "{00000000-0000-0000-4353-490000000000}");
  const auto request = ParseHierarchyRequest(sent);
  REQUIRE(request);
  CHECK(request->object == object);
  CHECK(request->kind == kHierarchyKindId);

  // A kind above the hierarchy kind counts, one below does not.
  HierarchyId above = kHierarchyKindId;
  above[11] = 1;
  CHECK(ParseHierarchyRequest(HierarchyRequestText(kHierarchyTitle, object, above)));
  HierarchyId below = kHierarchyKindId;
  below[10] = 'H';
  CHECK_FALSE(IsHierarchyKind(below));
  CHECK_FALSE(ParseHierarchyRequest(HierarchyRequestText(kHierarchyTitle, object, below)));
  HierarchyId chart = {0xDF, 0xBC, 0xA9, 0xC3};  // a chart kind starts above every hierarchy kind byte
  CHECK(IsHierarchyKind(chart));

  // Other titles, a title with a bar in it, and broken identities send nothing.
  CHECK_FALSE(ParseHierarchyRequest(HierarchyRequestText("Buoyage", object, kHierarchyKindId)));
  CHECK_FALSE(ParseHierarchyRequest(HierarchyRequestText("chart supplementary information", object, kHierarchyKindId)));
  CHECK_FALSE(ParseHierarchyRequest(HierarchyRequestText("CHART SUPPLEMENTARY INFORMATION|x", object, kHierarchyKindId)));
  CHECK_FALSE(ParseHierarchyRequest(sent + "|"));
  CHECK_FALSE(ParseHierarchyRequest(sent.substr(0, sent.size() - 1)));
  CHECK_FALSE(ParseHierarchyRequest("CHART SUPPLEMENTARY INFORMATION|ChartScene.Scene|{00000000-0000-0000-4353-490000000000}"));
  CHECK_FALSE(ParseHierarchyRequest("CHART SUPPLEMENTARY INFORMATION"));
  CHECK_FALSE(ParseHierarchyRequest(""));

  // A long text from the host is carried whole, and a format sequence in it is a text.
  const std::string longText(5000, 'x');
  CHECK(HierarchyRequestText(longText, object, kHierarchyKindId).size() == 5000 + 2 + 2 * 38);
  CHECK(HierarchyRequestText("%s%n%d", object, kHierarchyKindId).rfind("%s%n%d|", 0) == 0);
}

TEST_CASE("the tree: root found upwards, levels pick the children, leaves are read without levels") {
  FakeSource host;
  const std::size_t root = host.Add(kClassHierarchyNode, 7);
  const std::size_t chapter = host.Add(kClassHierarchyNode, 6);
  const std::size_t section = host.Add(kClassHierarchyNode, 5);
  const std::size_t note = host.Add(kClassHierarchyNote, std::nullopt);
  const std::size_t diagram = host.Add(kClassHierarchyDiagram, std::nullopt);
  const std::size_t other = host.Add(kClassHierarchyNode, 6);
  host.Hold(root, chapter);
  host.Hold(chapter, section);
  host.Hold(section, note);
  host.Hold(section, diagram);
  host.Hold(root, other);

  for (std::size_t start : {root, chapter, section, note, diagram}) {
    CAPTURE(start);
    const auto tree = BuildHierarchyTree(host, start);
    REQUIRE(tree);
    CHECK(Shape(*tree) == std::vector<std::string>{"0@0", "1@1", "2@2", "3@3", "4@3", "5@1"});
    REQUIRE(tree->start >= 0);
    CHECK(tree->nodes[tree->start].handle == start);
    CHECK(tree->nodes[3].parent == 2);
    CHECK_FALSE(tree->cut);
  }

  // A leaf's first related object must be a node.
  const std::size_t stray = host.Add(kClassHierarchySource, std::nullopt);
  host.Hold(stray, note);  // the source's only related object is a note
  std::string why;
  CHECK_FALSE(BuildHierarchyTree(host, stray, &why));
  CHECK(why == "the first related object is not a node");
  CHECK_FALSE(BuildHierarchyTree(host, host.Add(kClassHierarchyNote, std::nullopt), &why));
  CHECK(why == "the object has no node");
  CHECK_FALSE(BuildHierarchyTree(host, host.Add(42, std::nullopt), &why));
  CHECK(why == "the object is not of the hierarchy");
}

TEST_CASE("the tree: a top node below level 7 is the root; an unreadable child level fails the build") {
  FakeSource host;
  const std::size_t top = host.Add(kClassHierarchyNode, 6);
  const std::size_t child = host.Add(kClassHierarchyNode, 5);
  const std::size_t leaf = host.Add(kClassHierarchySource, std::nullopt);
  host.Hold(top, child);
  host.Hold(child, leaf);
  const auto tree = BuildHierarchyTree(host, leaf);
  REQUIRE(tree);
  CHECK(Shape(*tree) == std::vector<std::string>{"0@0", "1@1", "2@2"});
  CHECK(tree->start == 2);

  // A level 4 node takes nothing.
  FakeSource other;
  const std::size_t low = other.Add(kClassHierarchyNode, 4);
  other.Hold(low, other.Add(kClassHierarchyNote, std::nullopt));
  const auto lowTree = BuildHierarchyTree(other, low);
  REQUIRE(lowTree);
  CHECK(Shape(*lowTree) == std::vector<std::string>{"0@0"});

  const std::size_t broken = host.Add(kClassHierarchyNode, std::nullopt);
  host.Hold(child, broken);
  std::string why;
  CHECK_FALSE(BuildHierarchyTree(host, top, &why));
  CHECK(why == "a child node's level cannot be read");

  host.objects[broken].level = 5;
  host.failingRelated = broken;
  CHECK_FALSE(BuildHierarchyTree(host, top, &why));
  CHECK(why == "the related objects cannot be read");
}

TEST_CASE("the tree: nodes of one level related in a circle end, each shown once per path") {
  FakeSource host;
  const std::size_t root = host.Add(kClassHierarchyNode, 7);
  const std::size_t chapter = host.Add(kClassHierarchyNode, 6);
  const std::size_t a = host.Add(kClassHierarchyNode, 5);
  const std::size_t b = host.Add(kClassHierarchyNode, 5);
  host.Hold(root, chapter);
  host.Hold(chapter, a);
  host.Hold(chapter, b);
  host.objects[a].related.push_back(b);  // a and b hold each other
  host.objects[b].related.push_back(a);
  host.objects[b].related.push_back(a);  // listed again, as a member after a holder
  const auto tree = BuildHierarchyTree(host, a);
  REQUIRE(tree);
  CHECK(Shape(*tree) == std::vector<std::string>{"0@0", "1@1", "2@2", "3@3", "3@2", "2@3"});
  CHECK(tree->start == 2);
  CHECK_FALSE(tree->cut);

  // Every level-5 node holding every other: the limits end the build.
  FakeSource dense;
  const std::size_t top = dense.Add(kClassHierarchyNode, 7);
  std::vector<std::size_t> ring;
  for (int i = 0; i < 12; ++i) ring.push_back(dense.Add(kClassHierarchyNode, 5));
  for (std::size_t x : ring) {
    dense.Hold(top, x);
    for (std::size_t y : ring) {
      if (x != y) dense.objects[x].related.push_back(y);
    }
  }
  const auto big = BuildHierarchyTree(dense, ring[3]);
  REQUIRE(big);
  CHECK(big->cut);
  CHECK(big->nodes.size() == kMaxHierarchyNodes);
  CHECK(big->nodes[big->start].handle == ring[3]);
  CHECK(big->nodes[big->start].depth == 1);  // its place under the top, not deep in a circle
  // Built level by level: the cut leaves the upper levels whole.
  CHECK(std::count_if(big->nodes.begin(), big->nodes.end(), [](const HierarchyNode& n) { return n.depth == 1; }) == 12);
  CHECK(std::count_if(big->nodes.begin(), big->nodes.end(), [](const HierarchyNode& n) { return n.depth == 2; }) ==
        12 * 11);
  int deepest = 0;
  for (const HierarchyNode& node : big->nodes) deepest = std::max(deepest, node.depth);
  CHECK(deepest < kMaxHierarchyDepth);
  CHECK(dense.relatedCalls < 2 * kMaxHierarchyNodes);
}

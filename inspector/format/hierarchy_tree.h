#pragma once
// The tree of a chart supplementary information hierarchy, built over whatever answers
// HierarchySource (the host's objects in the panel, plain records in the tests).
//
// 1. The root: a note, diagram or source goes to its first related object, which must be
//    a node; from a node the walk goes up to the first related node of a higher level
//    until a node of level 7, or one without a higher related node, is reached.
// 2. From the root, level by level: a node takes its related objects as children by the
//    level rules of hierarchy_values.h; leaves and objects of other classes take none.
//    Only nodes' levels are read: a child node whose level cannot be read fails the build.
// Hosts may relate nodes both ways and in circles: an object already on the path from the
// root is not taken again, nor one already among the node's children; the depth stops at
// kMaxHierarchyDepth and the tree at kMaxHierarchyNodes nodes (the tree is then marked cut;
// being built level by level, it keeps its upper levels whole).

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "inspector/format/hierarchy_request.h"

namespace br::inspector {

inline constexpr int kMaxHierarchyDepth = 32;
inline constexpr std::size_t kMaxHierarchyNodes = 4096;

// What the tree needs of one object: its identity, class and, for a node, its level.
struct HierarchyItem {
  HierarchyId id{};
  long classCode = 0;
  std::optional<unsigned> level;  // read only for nodes; none when it could not be read
};

// Objects are named by handles the source hands out.
class HierarchySource {
public:
  virtual ~HierarchySource() = default;
  // Appends handles of the objects related to `handle`, in the host's order (those
  // holding it first); false when the host fails.
  virtual bool Related(std::size_t handle, std::vector<std::size_t>& related) = 0;
  // None when the object's identity or class cannot be read.
  virtual std::optional<HierarchyItem> Describe(std::size_t handle) = 0;
};

struct HierarchyNode {
  std::size_t handle = 0;
  HierarchyItem item;
  int parent = -1;  // index in the tree, -1 for the root
  int depth = 0;
};

struct HierarchyTree {
  std::vector<HierarchyNode> nodes;  // depth first: the root, then each child's subtree in the host's order
  int start = -1;                    // the object's node nearest the root (the first shown of those)
  bool cut = false;                  // a limit was reached
};

// The tree of the object `start`; none when the root cannot be found or the build fails
// (`why` then says which step failed).
std::optional<HierarchyTree> BuildHierarchyTree(HierarchySource& source, std::size_t start,
                                                std::string* why = nullptr);

}  // namespace br::inspector

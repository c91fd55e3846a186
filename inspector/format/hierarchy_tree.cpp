#include "inspector/format/hierarchy_tree.h"

#include <algorithm>

#include "inspector/format/hierarchy_values.h"

namespace br::inspector {

namespace {

struct Located {
  std::size_t handle;
  HierarchyItem item;
};

class Builder {
public:
  Builder(HierarchySource& source, std::string* why) : source_(source), why_(why) {}

  std::optional<Located> FindRoot(std::size_t start) {
    std::optional<HierarchyItem> item = source_.Describe(start);
    if (!item) return Fail("the object cannot be read");
    Located at{start, *item};
    if (IsHierarchyLeafClass(at.item.classCode)) {
      std::vector<std::size_t> related;
      if (!source_.Related(start, related) || related.empty()) return Fail("the object has no node");
      std::optional<HierarchyItem> first = source_.Describe(related.front());
      if (!first || first->classCode != kClassHierarchyNode) return Fail("the first related object is not a node");
      at = {related.front(), *first};
    } else if (at.item.classCode != kClassHierarchyNode) {
      return Fail("the object is not of the hierarchy");
    }
    // Up through higher levels; the visited identities keep a circle of nodes from
    // walking for ever.
    std::vector<HierarchyId> visited{at.item.id};
    for (int step = 0; step < kMaxHierarchyDepth; ++step) {
      if (!at.item.level) return Fail("a node's level cannot be read");
      if (*at.item.level >= 7) break;
      std::vector<std::size_t> related;
      if (!source_.Related(at.handle, related)) return Fail("the related objects cannot be read");
      std::optional<Located> up;
      for (std::size_t handle : related) {
        std::optional<HierarchyItem> other = source_.Describe(handle);
        if (!other || other->classCode != kClassHierarchyNode || !other->level) continue;
        if (*other->level > *at.item.level && std::find(visited.begin(), visited.end(), other->id) == visited.end()) {
          up = Located{handle, *other};
          break;
        }
      }
      if (!up) break;
      at = *up;
      visited.push_back(at.item.id);
    }
    return at;
  }

  bool Build(const Located& root) {
    std::vector<HierarchyId> path;
    return Add(root, -1, 0, path);
  }

  HierarchyTree tree;

private:
  std::nullopt_t Fail(const char* reason) {
    if (why_ != nullptr) *why_ = reason;
    return std::nullopt;
  }

  bool Add(const Located& object, int parent, int depth, std::vector<HierarchyId>& path) {
    if (tree.nodes.size() >= kMaxHierarchyNodes) {
      tree.cut = true;
      return true;
    }
    const int index = static_cast<int>(tree.nodes.size());
    tree.nodes.push_back({object.handle, object.item, parent, depth});
    if (object.item.classCode != kClassHierarchyNode || !object.item.level) return true;
    const unsigned level = *object.item.level;
    if (!TakesLeaves(level)) return true;
    if (depth + 1 >= kMaxHierarchyDepth) {
      tree.cut = true;
      return true;
    }
    std::vector<std::size_t> related;
    if (!source_.Related(object.handle, related)) {
      Fail("the related objects cannot be read");
      return false;
    }
    path.push_back(object.item.id);
    // An object related both ways (held and holding) is listed twice: one child.
    std::vector<HierarchyId> taken;
    for (std::size_t handle : related) {
      std::optional<HierarchyItem> child = source_.Describe(handle);
      if (!child) {
        Fail("a related object cannot be read");
        return false;
      }
      if (std::find(path.begin(), path.end(), child->id) != path.end() ||
          std::find(taken.begin(), taken.end(), child->id) != taken.end()) {
        continue;
      }
      taken.push_back(child->id);
      if (child->classCode == kClassHierarchyNode) {
        if (!child->level) {
          Fail("a child node's level cannot be read");
          return false;
        }
        if (!TakesChildNode(level, *child->level)) continue;
      }
      if (!Add({handle, *child}, index, depth + 1, path)) return false;
    }
    path.pop_back();
    return true;
  }

  HierarchySource& source_;
  std::string* why_;
};

}  // namespace

std::optional<HierarchyTree> BuildHierarchyTree(HierarchySource& source, std::size_t start, std::string* why) {
  Builder builder(source, why);
  const std::optional<HierarchyItem> first = source.Describe(start);
  const std::optional<Located> root = builder.FindRoot(start);
  if (!root || !builder.Build(*root)) return std::nullopt;
  for (std::size_t i = 0; i < builder.tree.nodes.size() && first; ++i) {
    if (builder.tree.nodes[i].item.id == first->id) {
      builder.tree.start = static_cast<int>(i);
      break;
    }
  }
  return std::move(builder.tree);
}

}  // namespace br::inspector

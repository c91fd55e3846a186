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

  // Breadth first, so that a tree cut at the node limit keeps its upper levels whole;
  // then put in depth-first order for showing.
  bool Build(const Located& root) {
    std::vector<HierarchyNode> found{{root.handle, root.item, -1, 0}};
    std::vector<std::vector<int>> children(1);
    for (std::size_t at = 0; at < found.size() && !tree.cut; ++at) {
      const HierarchyNode node = found[at];  // `found` grows below
      if (node.item.classCode != kClassHierarchyNode || !node.item.level || !TakesLeaves(*node.item.level)) continue;
      if (node.depth + 1 >= kMaxHierarchyDepth) {
        tree.cut = true;
        continue;
      }
      std::vector<std::size_t> related;
      if (!source_.Related(node.handle, related)) {
        Fail("the related objects cannot be read");
        return false;
      }
      // An object related both ways (held and holding) is listed twice: one child.
      std::vector<HierarchyId> taken;
      for (std::size_t handle : related) {
        std::optional<HierarchyItem> child = source_.Describe(handle);
        if (!child) {
          Fail("a related object cannot be read");
          return false;
        }
        if (OnPath(found, static_cast<int>(at), child->id) ||
            std::find(taken.begin(), taken.end(), child->id) != taken.end()) {
          continue;
        }
        taken.push_back(child->id);
        if (child->classCode == kClassHierarchyNode) {
          if (!child->level) {
            Fail("a child node's level cannot be read");
            return false;
          }
          if (!TakesChildNode(*node.item.level, *child->level)) continue;
        }
        if (found.size() >= kMaxHierarchyNodes) {
          tree.cut = true;
          break;
        }
        children[at].push_back(static_cast<int>(found.size()));
        found.push_back({handle, *child, static_cast<int>(at), node.depth + 1});
        children.emplace_back();
      }
    }
    // Depth first: a node, then each child's subtree in the host's order.
    std::vector<std::pair<int, int>> stack{{0, -1}};  // found index, parent in the tree
    while (!stack.empty()) {
      const auto [index, parent] = stack.back();
      stack.pop_back();
      HierarchyNode node = found[index];
      node.parent = parent;
      const int placed = static_cast<int>(tree.nodes.size());
      tree.nodes.push_back(node);
      for (auto child = children[index].rbegin(); child != children[index].rend(); ++child) {
        stack.push_back({*child, placed});
      }
    }
    return true;
  }

  HierarchyTree tree;

private:
  std::nullopt_t Fail(const char* reason) {
    if (why_ != nullptr) *why_ = reason;
    return std::nullopt;
  }

  // Whether the identity is the node's own or one of its ancestors'.
  static bool OnPath(const std::vector<HierarchyNode>& found, int node, const HierarchyId& id) {
    for (; node >= 0; node = found[node].parent) {
      if (found[node].item.id == id) return true;
    }
    return false;
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
  // The object's place nearest the root, the first of those in the order shown.
  for (std::size_t i = 0; i < builder.tree.nodes.size() && first; ++i) {
    const HierarchyNode& node = builder.tree.nodes[i];
    if (node.item.id == first->id &&
        (builder.tree.start < 0 || node.depth < builder.tree.nodes[builder.tree.start].depth)) {
      builder.tree.start = static_cast<int>(i);
    }
  }
  return std::move(builder.tree);
}

}  // namespace br::inspector

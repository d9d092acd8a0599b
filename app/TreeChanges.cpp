#include "app/TreeChanges.h"

#include <unordered_map>
#include <utility>

namespace varnel {

namespace {

using ByName = std::unordered_map<std::string_view, const VarnelModelNode*>;

}  // namespace

void TreeChanges::follow(Node root) {
  const Node former = std::exchange(_root, std::move(root));
  _changed.clear();
  if (former && _root && former != _root) compare(*former, *_root);
}

// Whether the node differs. Children mostly stand at the same place as before, which is looked at first.
bool TreeChanges::compare(const VarnelModelNode& former, const VarnelModelNode& now) {
  bool isChanged = false;
  if (now.value() || former.value()) {
    isChanged = !now.value() || !former.value() || *now.value() != *former.value();
  } else {
    const auto& before = *former.childNodes();
    const auto& after = *now.childNodes();
    isChanged = before.size() != after.size();
    ByName byName;
    for (std::size_t i = 0; i < after.size(); ++i) {
      const VarnelModelNode* counterpart = nullptr;
      if (i < before.size() && before[i]->displayName() == after[i]->displayName()) {
        counterpart = before[i].get();
      } else {
        if (byName.empty()) {
          for (const auto& child : before) byName.emplace(child->displayName(), child.get());
        }
        const auto found = byName.find(after[i]->displayName());
        if (found != byName.end()) counterpart = found->second;
      }
      if (counterpart) {
        isChanged |= compare(*counterpart, *after[i]);
      } else {
        isChanged = true;
        _changed.insert(after[i].get());
      }
    }
  }
  if (isChanged) _changed.insert(&now);
  return isChanged;
}

}  // namespace varnel

#pragma once

#include <memory>
#include <unordered_set>

#include "model/VarnelModelNode.h"

namespace varnel {

/// What the last refresh changed in the display tree.
class TreeChanges {
 public:
  using Node = std::shared_ptr<const VarnelModelNode>;

  /// This tree follows the one of the call before. Nothing of the first tree has changed. Null forgets the
  /// tree before.
  void follow(Node root);
  /// True for a leaf of the current tree that is new or has another value than before, and for a node above
  /// such a leaf or above one that is gone.
  bool contains(const VarnelModelNode& node) const { return _changed.contains(&node); }

 private:
  bool compare(const VarnelModelNode& former, const VarnelModelNode& now);

  Node _root;
  std::unordered_set<const VarnelModelNode*> _changed;
};

}  // namespace varnel

#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "model/VarnelModelNode.h"

namespace varnel {

/// The names from the top of the tree to a node, without the root's.
using NamePath = std::vector<std::string>;

/// A node that a search found.
struct FoundNode {
  NamePath path{};
  std::string value{};  ///< empty for an inner node
};

/// The nodes below the root with all of these words, in the order of the tree. A word may stand in the name
/// or the value of the node, or in the name of one above it, in any case of the letters A to Z; at least one
/// must stand in the name or the value of the node itself. Without words, every node.
std::vector<FoundNode> findNodes(const VarnelModelNode& root, std::string_view words);

/// The node at the end of these names; null when there is none.
const VarnelModelNode* nodeUnderNames(const VarnelModelNode& root, const NamePath& path);

}  // namespace varnel

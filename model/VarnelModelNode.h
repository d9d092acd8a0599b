#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/WriteTimes.h"
#include "base/Time.h"
#include "base/Value.h"

namespace varnel {

class VarnelModelNode;

/// Path → the last node that was built under it. It shares every node with the tree.
using PathDictionary = std::unordered_map<std::string, std::shared_ptr<const VarnelModelNode>>;

/// A node of the display tree. A tree does not change after it was built.
class VarnelModelNode {
 public:
  using Children = std::vector<std::shared_ptr<const VarnelModelNode>>;

  explicit VarnelModelNode(std::string_view name) : _name(name) {}
  virtual ~VarnelModelNode() = default;

  const std::string& displayName() const { return _name; }
  /// Null for a leaf; empty for an inner node without children.
  virtual const Children* childNodes() const { return nullptr; }
  /// The text of a leaf; null for an inner node.
  virtual const std::string* value() const { return nullptr; }

  /// Builds the tree of a display object, which may be absent. The root is named "Varnel" and has the path
  /// "/". Records every node in the path dictionary; of two nodes with the same path, the later one.
  static std::shared_ptr<const VarnelModelNode> makeTreeFromObject_withPathDictionary(const Value& object,
                                                                                      PathDictionary& paths);
  /// The same. The leaves get the times when packets last wrote them.
  static std::shared_ptr<const VarnelModelNode> makeTreeFromObject_withPathDictionary(
      const Value& object, PathDictionary& paths, const WriteTimes& times);

 private:
  std::string _name;
};

/// A leaf: a name and its value.
class VarnelModelLeafNode final : public VarnelModelNode {
 public:
  VarnelModelLeafNode(std::string_view name, std::string_view value,
                      const std::optional<Time>& writtenAt = {})
      : VarnelModelNode(name), _string(value), _writtenAt(writtenAt) {}
  const std::string* value() const override { return &_string; }
  /// When a packet last wrote the value; absent when that is not known.
  const std::optional<Time>& writtenAt() const { return _writtenAt; }

 private:
  std::string _string;
  std::optional<Time> _writtenAt;
};

/// An inner node and its children, in order.
class VarnelModelTreeNode final : public VarnelModelNode {
 public:
  /// What the node was made from.
  enum class Origin { Dictionary, Array };

  VarnelModelTreeNode(std::string_view name, Children children, Origin origin)
      : VarnelModelNode(name), _childNodes(std::move(children)), _origin(origin) {}
  const Children* childNodes() const override { return &_childNodes; }
  Origin origin() const { return _origin; }

 private:
  Children _childNodes;
  Origin _origin;
};

/// The value of the leaf that the display object's tree would have under the path. It builds no tree. Nothing
/// when the path leads to an inner node or nowhere. Valid until the object changes.
///
/// Where no node has exactly this path, `[name=value]` after the path of a list selects the first record that
/// has a leaf with this name and value: "/Cells[ID=16]/RSRP". Several selections one after the other select
/// the first record that meets all of them.
std::optional<std::string_view> leafValueUnderPath(const Value& object, std::string_view path);

/// The path of a child: the parent's path, a "/" unless it ends in one, and the name unchanged. Names may
/// hold "/".
std::string childPath(std::string_view parentPath, std::string_view name);

}  // namespace varnel

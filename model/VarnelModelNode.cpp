#include "model/VarnelModelNode.h"

#include <algorithm>

#include "LogGenerator/ArrayLock.h"
#include "platform/Dictionary.h"

namespace varnel {

namespace {

constexpr std::string_view sortMark = "_sorted";
constexpr std::string_view unknownValue = "(unknown)";

using Node = std::shared_ptr<const VarnelModelNode>;
using Children = VarnelModelNode::Children;

// In a sorted dictionary "order;name" is shown as the name; a key with no ";" or with several is shown whole.
std::string_view displayNameOfSortedKey(std::string_view key) {
  const std::size_t semicolon = key.find(';');
  const bool hasTwoParts = semicolon != std::string_view::npos && semicolon == key.rfind(';');
  return hasTwoParts ? key.substr(semicolon + 1) : key;
}

class TreeBuilder {
 public:
  explicit TreeBuilder(PathDictionary& paths) : _paths(paths) {}

  Node build(std::string_view name, const Value& object, const std::string& path) {
    Node node = make(name, object, path);
    _paths.insert_or_assign(path, node);
    return node;
  }

 private:
  Node make(std::string_view name, const Value& object, const std::string& path) {
    if (const std::string* text = object.string()) return std::make_shared<VarnelModelLeafNode>(name, *text);
    if (const Dictionary* entries = object.dictionary()) {
      return std::make_shared<VarnelModelTreeNode>(name, childrenOf(*entries, path),
                                                   VarnelModelTreeNode::Origin::Dictionary);
    }
    if (const Array* elements = object.array()) {
      return std::make_shared<VarnelModelTreeNode>(name, childrenOf(*elements, path),
                                                   VarnelModelTreeNode::Origin::Array);
    }
    return std::make_shared<VarnelModelLeafNode>(name, unknownValue);
  }

  Children childrenOf(const Dictionary& entries, const std::string& path) {
    std::vector<const Dictionary::Entry*> rows;
    rows.reserve(entries.size());
    for (const Dictionary::Entry& entry : entries) rows.push_back(&entry);
    const bool isSorted = entries.has(sortMark);
    if (isSorted)
      std::ranges::sort(rows, {},
                        [](const Dictionary::Entry* entry) { return std::string_view(entry->key); });

    Children children;
    children.reserve(rows.size());
    for (const Dictionary::Entry* row : rows) {
      if (row->key == sortMark) continue;
      const std::string_view name = isSorted ? displayNameOfSortedKey(row->key) : row->key;
      children.push_back(build(name, row->value, childPath(path, name)));
    }
    return children;
  }

  Children childrenOf(const Array& elements, const std::string& path) {
    const ArrayLock::Scope lock;
    Children children;
    children.reserve(elements.size());
    for (const Value& element : elements) {
      const std::string name = std::to_string(children.size());
      children.push_back(build(name, element, childPath(path, name)));
    }
    return children;
  }

  PathDictionary& _paths;
};

}  // namespace

std::shared_ptr<const VarnelModelNode> VarnelModelNode::makeTreeFromObject_withPathDictionary(
    const Value& object, PathDictionary& paths) {
  return TreeBuilder(paths).build("Varnel", object, "/");
}

std::string childPath(std::string_view parentPath, std::string_view name) {
  std::string path;
  path.reserve(parentPath.size() + 1 + name.size());
  path.append(parentPath);
  if (!path.ends_with('/')) path.push_back('/');
  path.append(name);
  return path;
}

}  // namespace varnel

#include "model/VarnelModelNode.h"

#include <algorithm>
#include <cstddef>
#include <set>
#include <utility>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/SortedKey.h"
#include "base/Dictionary.h"

namespace varnel {

namespace {

constexpr std::string_view unknownValue = "(unknown)";

using Node = std::shared_ptr<const VarnelModelNode>;
using Children = VarnelModelNode::Children;

// A row of a dictionary as the tree shows it.
struct Row {
  std::string_view name;
  const Value* value;
};

// The rows of a dictionary in the tree's order.
std::vector<Row> rowsOf(const Dictionary& entries) {
  std::vector<const Dictionary::Entry*> inOrder;
  inOrder.reserve(entries.size());
  for (const Dictionary::Entry& entry : entries) inOrder.push_back(&entry);
  const bool isSorted = entries.has(sortMark);
  if (isSorted)
    std::ranges::sort(inOrder, {},
                      [](const Dictionary::Entry* entry) { return std::string_view(entry->key); });

  std::vector<Row> rows;
  rows.reserve(inOrder.size());
  for (const Dictionary::Entry* entry : inOrder) {
    if (entry->key == sortMark) continue;
    rows.push_back({isSorted ? displayNameOfSortedKey(entry->key) : entry->key, &entry->value});
  }
  return rows;
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
    const std::vector<Row> rows = rowsOf(entries);
    Children children;
    children.reserve(rows.size());
    for (const auto& [name, value] : rows) children.push_back(build(name, *value, childPath(path, name)));
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

// Finds what the tree would have under a path. A node is recorded after all below it, and of two with the
// same path the later one counts: so the walk begins with the node itself and goes on with its last child. It
// enters nothing but what may lead to the path.
class ObjectFinder {
 public:
  explicit ObjectFinder(std::string_view path) : _path(path) {}

  // The first so many characters of the path are the object's own. Null when nothing has the path.
  const Value* findFrom(const Value& object, std::size_t length) {
    if (length == _path.size()) return &object;
    if (_path[length - 1] != '/') {
      if (_path[length] != '/') return nullptr;
      ++length;
    }
    if (const Dictionary* entries = object.dictionary()) return findIn(*entries, length);
    if (const Array* elements = object.array()) return findIn(*elements, length);
    return nullptr;
  }

 private:
  // Rows of one name that share what is below them would have it searched over and over.
  template <class Container>
  const Value* findIn(const Container& container, std::size_t length) {
    const std::pair<const void*, std::size_t> search(&container, length);
    if (_failedSearches.contains(search)) return nullptr;
    const Value* found = findAmong(container, length);
    if (!found) _failedSearches.insert(search);
    return found;
  }

  const Value* findAmong(const Dictionary& entries, std::size_t length) {
    const std::vector<Row> rows = rowsOf(entries);
    for (auto row = rows.rbegin(); row != rows.rend(); ++row)
      if (const Value* found = findNamed(row->name, *row->value, length)) return found;
    return nullptr;
  }

  const Value* findAmong(const Array& elements, std::size_t length) {
    const ArrayLock::Scope lock;
    for (std::size_t i = elements.size(); i-- > 0;)
      if (const Value* found = findNamed(std::to_string(i), elements[i], length)) return found;
    return nullptr;
  }

  const Value* findNamed(std::string_view name, const Value& object, std::size_t length) {
    return _path.substr(length).starts_with(name) ? findFrom(object, length + name.size()) : nullptr;
  }

  const std::string_view _path;
  std::set<std::pair<const void*, std::size_t>> _failedSearches;
};

}  // namespace

std::shared_ptr<const VarnelModelNode> VarnelModelNode::makeTreeFromObject_withPathDictionary(
    const Value& object, PathDictionary& paths) {
  return TreeBuilder(paths).build("Varnel", object, "/");
}

std::optional<std::string_view> leafValueUnderPath(const Value& object, std::string_view path) {
  if (!path.starts_with('/')) return std::nullopt;
  const Value* found = ObjectFinder(path).findFrom(object, 1);
  if (!found || found->dictionary() || found->array()) return std::nullopt;
  const std::string* text = found->string();
  return text ? std::string_view(*text) : unknownValue;
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

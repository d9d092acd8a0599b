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

// An entry of a dictionary as a child in the tree.
struct TreeEntry {
  std::string_view name;
  std::string_view key;
  const Value* value;
};

// The entries of a dictionary in the tree's order.
std::vector<TreeEntry> treeEntries(const Dictionary& entries) {
  std::vector<const Dictionary::Entry*> inOrder;
  inOrder.reserve(entries.size());
  for (const Dictionary::Entry& entry : entries) inOrder.push_back(&entry);
  const bool isSorted = entries.has(sortMark);
  if (isSorted)
    std::ranges::sort(inOrder, {},
                      [](const Dictionary::Entry* entry) { return std::string_view(entry->key); });

  std::vector<TreeEntry> found;
  found.reserve(inOrder.size());
  for (const Dictionary::Entry* entry : inOrder) {
    if (entry->key == sortMark) continue;
    found.push_back({isSorted ? displayNameOfSortedKey(entry->key) : entry->key, entry->key, &entry->value});
  }
  return found;
}

class TreeBuilder {
 public:
  TreeBuilder(PathDictionary& paths, const WriteTimes& times) : _paths(paths), _times(times) {}

  // An object without a time of its own has the time of its container.
  Node build(std::string_view name, const Value& object, const std::string& path,
             const std::optional<Time>& writtenAt = {}) {
    Node node = make(name, object, path, writtenAt);
    _paths.insert_or_assign(path, node);
    return node;
  }

 private:
  Node make(std::string_view name, const Value& object, const std::string& path,
            const std::optional<Time>& writtenAt) {
    if (const std::string* text = object.string())
      return std::make_shared<VarnelModelLeafNode>(name, *text, writtenAt);
    if (const Dictionary* entries = object.dictionary()) {
      return std::make_shared<VarnelModelTreeNode>(name, childrenOf(*entries, path, writtenAt),
                                                   VarnelModelTreeNode::Origin::Dictionary);
    }
    if (const Array* elements = object.array()) {
      return std::make_shared<VarnelModelTreeNode>(name, childrenOf(*elements, path, writtenAt),
                                                   VarnelModelTreeNode::Origin::Array);
    }
    return std::make_shared<VarnelModelLeafNode>(name, unknownValue, writtenAt);
  }

  Children childrenOf(const Dictionary& entries, const std::string& path,
                      const std::optional<Time>& writtenAt) {
    const std::vector<TreeEntry> inOrder = treeEntries(entries);
    Children children;
    children.reserve(inOrder.size());
    for (const auto& [name, key, value] : inOrder) {
      const auto itsTime = _times.writtenAt(entries, key);
      children.push_back(build(name, *value, childPath(path, name), itsTime ? itsTime : writtenAt));
    }
    return children;
  }

  Children childrenOf(const Array& elements, const std::string& path, const std::optional<Time>& writtenAt) {
    const auto itsTime = _times.refilledAt(elements);
    const ArrayLock::Scope lock;
    Children children;
    children.reserve(elements.size());
    for (const Value& element : elements) {
      const std::string name = std::to_string(children.size());
      children.push_back(build(name, element, childPath(path, name), itsTime ? itsTime : writtenAt));
    }
    return children;
  }

  PathDictionary& _paths;
  const WriteTimes& _times;
};

// The text of an object that the tree shows as a leaf; nothing for an object with children.
std::optional<std::string_view> leafText(const Value& object) {
  if (object.dictionary() || object.array()) return std::nullopt;
  const std::string* text = object.string();
  return text ? std::string_view(*text) : unknownValue;
}

// The first child, in the order of the tree, for which the predicate is true; null when there is none.
template <class Predicate>
const Value* firstChild(const Value& object, const Predicate& isWanted) {
  if (const Dictionary* entries = object.dictionary()) {
    for (const auto& [name, key, value] : treeEntries(*entries))
      if (isWanted(name, *value)) return value;
  } else if (const Array* elements = object.array()) {
    const ArrayLock::Scope lock;
    for (std::size_t i = 0; i < elements->size(); ++i)
      if (isWanted(std::to_string(i), (*elements)[i])) return &(*elements)[i];
  }
  return nullptr;
}

// Finds what the tree would have under a path. The tree records a node after all nodes below it, and of two
// nodes with the same path the later one counts. So the search checks the node itself first, and then its
// children from the last to the first. It enters only containers that may lead to the path.
class ObjectFinder {
 public:
  enum class Brackets { BelongToNames, MaySelect };

  ObjectFinder(std::string_view path, Brackets brackets) : _path(path), _brackets(brackets) {}

  // The object's own path is the first `length` characters. Null when nothing has the path.
  const Value* findFrom(const Value& object, std::size_t length) {
    if (length == _path.size()) return &object;
    if (const Selection selection = select(object, length); selection.record)
      return findFrom(*selection.record, selection.length);
    if (_path[length - 1] != '/') {
      if (_path[length] != '/') return nullptr;
      ++length;
      if (const Selection selection = select(object, length); selection.record)
        return findFrom(*selection.record, selection.length);
    }
    if (const Dictionary* entries = object.dictionary()) return findIn(*entries, length);
    if (const Array* elements = object.array()) return findIn(*elements, length);
    return nullptr;
  }

 private:
  struct Selection {
    const Value* record;
    std::size_t length;  // of the path up to the end of the selections
  };

  // The first record that meets all selections at this place of the path.
  Selection select(const Value& list, std::size_t length) {
    if (_brackets != Brackets::MaySelect || length == _path.size() || _path[length] != '[')
      return {nullptr, length};
    const std::pair<const Value*, std::size_t> search(&list, length);
    if (_failedSelections.contains(search)) return {nullptr, length};
    std::size_t end = length;
    const Value* record = firstChild(list, [&](std::string_view /*name*/, const Value& candidate) {
      end = endOfBrackets(candidate, length);
      return end != length;
    });
    if (!record) _failedSelections.insert(search);
    return {record, end};
  }

  // The end of the selections; `length` itself when the record does not meet one of them. The function
  // compares the text in the brackets with the record's entries instead of parsing it: names and values may
  // hold any character.
  std::size_t endOfBrackets(const Value& record, std::size_t length) const {
    std::size_t end = length;
    while (end < _path.size() && _path[end] == '[') {
      std::string_view rest = _path.substr(end + 1);
      const Value* entry = firstChild(record, [&](std::string_view name, const Value& value) {
        rest = _path.substr(end + 1);
        const auto text = leafText(value);
        return text && skip(rest, name) && skip(rest, "=") && skip(rest, *text) && skip(rest, "]");
      });
      if (!entry) return length;
      end = _path.size() - rest.size();
    }
    return end;
  }

  static bool skip(std::string_view& text, std::string_view beginning) {
    if (!text.starts_with(beginning)) return false;
    text.remove_prefix(beginning.size());
    return true;
  }

  // Entries of the same name can share what is below them. Without this, the shared part would be searched
  // again and again.
  template <class Container>
  const Value* findIn(const Container& container, std::size_t length) {
    const std::pair<const void*, std::size_t> search(&container, length);
    if (_failedSearches.contains(search)) return nullptr;
    const Value* found = findAmong(container, length);
    if (!found) _failedSearches.insert(search);
    return found;
  }

  const Value* findAmong(const Dictionary& entries, std::size_t length) {
    const std::vector<TreeEntry> inOrder = treeEntries(entries);
    for (auto entry = inOrder.rbegin(); entry != inOrder.rend(); ++entry)
      if (const Value* found = findNamed(entry->name, *entry->value, length)) return found;
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
  const Brackets _brackets;
  std::set<std::pair<const void*, std::size_t>> _failedSearches;
  std::set<std::pair<const Value*, std::size_t>> _failedSelections;
};

}  // namespace

std::shared_ptr<const VarnelModelNode> VarnelModelNode::makeTreeFromObject_withPathDictionary(
    const Value& object, PathDictionary& paths) {
  return makeTreeFromObject_withPathDictionary(object, paths, WriteTimes());
}

std::shared_ptr<const VarnelModelNode> VarnelModelNode::makeTreeFromObject_withPathDictionary(
    const Value& object, PathDictionary& paths, const WriteTimes& times) {
  return TreeBuilder(paths, times).build("Varnel", object, "/");
}

std::optional<std::string_view> leafValueUnderPath(const Value& object, std::string_view path) {
  using Brackets = ObjectFinder::Brackets;
  if (!path.starts_with('/')) return std::nullopt;
  const Value* found = ObjectFinder(path, Brackets::BelongToNames).findFrom(object, 1);
  if (!found && path.find('[') != std::string_view::npos)
    found = ObjectFinder(path, Brackets::MaySelect).findFrom(object, 1);
  return found ? leafText(*found) : std::nullopt;
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

#include "app/TreeSearch.h"

#include <algorithm>

namespace varnel {

namespace {

std::string inSmallLetters(std::string_view text) {
  std::string small(text);
  for (char& letter : small) {
    if (letter >= 'A' && letter <= 'Z') letter = static_cast<char>(letter - 'A' + 'a');
  }
  return small;
}

std::vector<std::string> wordsOf(std::string_view text) {
  std::vector<std::string> words;
  const std::string small = inSmallLetters(text);
  for (std::size_t at = 0; (at = small.find_first_not_of(' ', at)) != std::string::npos;) {
    const std::size_t end = std::min(small.find(' ', at), small.size());
    words.push_back(small.substr(at, end - at));
    at = end;
  }
  return words;
}

class Search {
 public:
  explicit Search(std::string_view words) : _words(wordsOf(words)) {}

  void look(const VarnelModelNode& node) {
    if (!node.childNodes()) return;
    for (const auto& child : *node.childNodes()) {
      _path.push_back(child->displayName());
      _smallNames.push_back(inSmallLetters(child->displayName()));
      _smallValue = child->value() ? inSmallLetters(*child->value()) : std::string();
      if (matches()) _found.push_back({_path, child->value() ? *child->value() : std::string()});
      look(*child);
      _path.pop_back();
      _smallNames.pop_back();
    }
  }
  std::vector<FoundNode> found() { return std::move(_found); }

 private:
  bool matches() const {
    const auto isIn = [](const std::string& text, const std::string& word) {
      return text.find(word) != std::string::npos;
    };
    const auto isOwn = [&](const std::string& word) {
      return isIn(_smallNames.back(), word) || isIn(_smallValue, word);
    };
    const auto isAnywhere = [&](const std::string& word) {
      return isOwn(word) ||
             std::ranges::any_of(_smallNames, [&](const std::string& name) { return isIn(name, word); });
    };
    return _words.empty() || (std::ranges::any_of(_words, isOwn) && std::ranges::all_of(_words, isAnywhere));
  }

  const std::vector<std::string> _words;
  NamePath _path;
  std::vector<std::string> _smallNames;
  std::string _smallValue;  // of the last name
  std::vector<FoundNode> _found;
};

}  // namespace

std::vector<FoundNode> findNodes(const VarnelModelNode& root, std::string_view words) {
  Search search(words);
  search.look(root);
  return search.found();
}

const VarnelModelNode* nodeUnderNames(const VarnelModelNode& root, const NamePath& path) {
  const VarnelModelNode* node = &root;
  for (const std::string& name : path) {
    if (!node->childNodes()) return nullptr;
    const auto found = std::ranges::find_if(*node->childNodes(),
                                            [&](const auto& child) { return child->displayName() == name; });
    if (found == node->childNodes()->end()) return nullptr;
    node = found->get();
  }
  return node;
}

}  // namespace varnel

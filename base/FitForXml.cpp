#include "base/FitForXml.h"

#include <memory>
#include <string>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "base/PropertyListText.h"

namespace varnel {

namespace {

class Replacement {
 public:
  // Containers may contain themselves, and one container may be in many places.
  Value of(const Value& value, std::size_t depth = 0) {
    if (depth > fileLimits.depth || ++_nodes > fileLimits.expandedNodes) return {};
    if (const std::string* text = value.string())
      return canHold(Encoding::Xml, *text) ? value : Value(replacedWhereUnfit(Encoding::Xml, *text));
    if (const Array* elements = value.array()) return ofElements(value, *elements, depth + 1);
    if (const Dictionary* entries = value.dictionary()) return ofEntries(value, *entries, depth + 1);
    return value;
  }

 private:
  Value ofElements(const Value& value, const Array& elements, std::size_t depth) {
    Array replaced;
    replaced.reserve(elements.size());
    bool isSame = true;
    for (const Value& element : elements) {
      replaced.push_back(of(element, depth));
      if (replaced.back().isAbsent()) return {};
      isSame &= isSameValue(replaced.back(), element);
    }
    return isSame ? value : Value::ofArray(std::move(replaced));
  }

  Value ofEntries(const Value& value, const Dictionary& entries, std::size_t depth) {
    const auto replaced = std::make_shared<Dictionary>();
    replaced->reserve(entries.size());
    bool isSame = true;
    for (const auto& [key, entry] : entries) {
      const bool isKeyFit = canHold(Encoding::Xml, key);
      std::string newKey = isKeyFit ? key : replacedWhereUnfit(Encoding::Xml, key);
      while (replaced->has(newKey)) newKey += " (" + std::to_string(replaced->size() + 1) + ")";
      Value newEntry = of(entry, depth);
      if (newEntry.isAbsent()) return {};
      isSame &= isKeyFit && isSameValue(newEntry, entry);
      replaced->set(newKey, std::move(newEntry));
    }
    return isSame ? value : Value(replaced);
  }

  // Whether nothing was replaced.
  static bool isSameValue(const Value& replaced, const Value& original) {
    if (original.array()) return replaced.array() == original.array();
    if (original.dictionary()) return replaced.dictionary() == original.dictionary();
    const std::string* text = original.string();
    return !text || *replaced.string() == *text;
  }

  std::size_t _nodes = 0;
};

}  // namespace

Value fitForXml(const Value& value) { return Replacement().of(value); }

}  // namespace varnel

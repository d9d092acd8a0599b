#include "programs/varnel-decode/DisplayJson.h"

#include <optional>
#include <string>
#include <vector>

#include "model/VarnelModelNode.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

constexpr std::string_view unknownValue = "(unknown)";  // as the tree shows it

class DisplayReader {
 public:
  DisplayReader(ValuesAs valuesAs, const NumberFormats& formats) : _valuesAs(valuesAs), _formats(formats) {}

  // Nothing for a value that is absent.
  std::optional<JsonValue> read(const VarnelModelNode& node) {
    const auto* tree = dynamic_cast<const VarnelModelTreeNode*>(&node);
    if (!tree) return readLeaf(*node.value());
    return tree->origin() == VarnelModelTreeNode::Origin::Array ? readList(*tree) : readSection(*tree);
  }

  JsonValue takeUnits() { return std::move(_units); }

 private:
  enum class Naming { ByUser, ByPosition };

  std::optional<JsonValue> readChild(const VarnelModelNode& child, Naming naming) {
    _path.push_back(child.displayName());
    _namings.push_back(naming);
    auto value = read(child);
    _path.pop_back();
    _namings.pop_back();
    return value;
  }

  JsonValue readSection(const VarnelModelTreeNode& section) {
    JsonValue object = JsonValue::ofObject();
    for (const auto& child : *section.childNodes()) {
      if (auto value = readChild(*child, Naming::ByUser))
        object.setMember(jsonString(child->displayName()), *std::move(value));
    }
    return object;
  }

  // An absent value keeps its place in the list.
  JsonValue readList(const VarnelModelTreeNode& list) {
    std::string json;
    for (const auto& child : *list.childNodes()) {
      json += json.empty() ? '[' : ',';
      if (const auto value = readChild(*child, Naming::ByPosition))
        value->appendTo(json);
      else
        json += "null";
    }
    return JsonValue::ofText(json.empty() ? "[]" : json + ']');
  }

  std::optional<JsonValue> readLeaf(const std::string& text) {
    if (_valuesAs == ValuesAs::Texts) return JsonValue::ofText(jsonString(text));
    if (isAbsent(text)) return std::nullopt;
    const EntryPlace place = _formats.at(_path);
    noteUnit(place);
    const std::string_view number = place.formats.number(text);
    return JsonValue::ofText(number.empty() ? jsonString(text) : std::string(number));
  }

  void noteUnit(const EntryPlace& place) {
    const std::string_view unit = place.formats.unit();
    if (unit.empty()) return;
    JsonValue* object = &_units;
    for (std::size_t i = 0; i + 1 < place.depth && object->isObject(); ++i)
      if (_namings[i] == Naming::ByUser) object = &object->objectAt(jsonString(_path[i]));
    if (object->isObject())
      object->setMember(jsonString(_path[place.depth - 1]), JsonValue::ofText(jsonString(std::string(unit))));
  }

  const ValuesAs _valuesAs;
  const NumberFormats& _formats;
  std::vector<std::string> _path;  // names from the display down to the current value
  std::vector<Naming> _namings;    // where each name on the path comes from
  JsonValue _units = JsonValue::ofObject();
};

}  // namespace

bool isAbsent(std::string_view text) { return text.empty() || text == unknownValue; }

DisplayJson displayJson(const Value& display, ValuesAs valuesAs, const NumberFormats& formats) {
  PathDictionary paths;
  const auto tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
  DisplayReader reader(valuesAs, formats);
  auto shown = reader.read(*tree);
  return {shown ? *std::move(shown) : JsonValue::ofObject(), reader.takeUnits()};
}

}  // namespace varnel

#include "LogGenerator/C2K/DisplayVariables.h"

namespace varnel::c2k {

namespace {

constexpr std::string_view keyEntry = "key";
constexpr std::string_view sectionEntry = "dict";

std::vector<Lookup::Place> placesIn(const Array& placements) {
  std::vector<Lookup::Place> places;
  for (const Value& placement : placements) {
    const Dictionary* entries = placement.dictionary();
    if (!entries) break;
    const std::string* key = entries->get(keyEntry).string();
    Dictionary* section = entries->get(sectionEntry).dictionary();
    if (!key || !section) break;
    places.push_back({section, BoundEntry(*key)});
  }
  return places;
}

}  // namespace

Lookup::Lookup(const Value& placements) : _placements(placements) {
  const Dictionary* variables = placements.dictionary();
  if (!variables) return;
  for (std::size_t i = 0; i < _places.size(); ++i) {
    if (const Array* array = variables->get(variableNames[i]).array()) _places[i] = placesIn(*array);
  }
}

std::optional<Time> Lookup::writtenAt(const Dictionary& section, std::string_view key) const {
  for (const std::vector<Place>& places : _places) {
    for (const Place& place : places) {
      if (place.section == &section && place.entry.key() == key) return place.entry.writtenAt;
    }
  }
  return std::nullopt;
}

Value Lookup::dictionaryFor(Variable variable) {
  if (const auto shownAt = places(variable); !shownAt.empty()) {
    const Value& shown = shownAt[0].entry.get(*shownAt[0].section);
    if (shown.dictionary() && !shown.sharesDictionary()) return shown;
  }
  return Value::ofDictionary();
}

void addPlacement(Dictionary& placements, std::string_view variable, std::string_view key,
                  const Value& section) {
  if (!placements.has(variable)) placements.set(variable, Value::ofArray());
  const Value placement = Value::ofDictionary();
  placement.dictionary()->set(keyEntry, key);
  placement.dictionary()->set(sectionEntry, section);
  placements.get(variable).array()->push_back(placement);
}

void storeDisplayValue(Variable variable, const Value& value, Lookup& lookup) {
  for (Lookup::Place& place : lookup.places(variable)) {
    place.entry.set(*place.section, Value(value));
    place.entry.writtenAt = lookup.time();
  }
}

void storeDisplayText(Variable variable, std::string_view text, Lookup& lookup) {
  for (Lookup::Place& place : lookup.places(variable)) {
    place.entry.setText(*place.section, text);
    place.entry.writtenAt = lookup.time();
  }
}

void storeDisplayNumber(Variable variable, const Format& format, double number, Lookup& lookup) {
  Formatter formatter;
  storeDisplayText(variable, formatter.text(format, number), lookup);
}

void storeDisplayFields(const Packet& packet, std::span<const VariableField> fields, Lookup& lookup) {
  Formatter formatter;
  for (const VariableField& field : fields)
    storeDisplayText(field.variable, formatter.text(packet, field.source, field.format), lookup);
}

}  // namespace varnel::c2k

#include "LogGenerator/C2K/DisplayVariables.h"

namespace varnel::c2k {

namespace {

constexpr std::string_view keyEntry = "key";
constexpr std::string_view sectionEntry = "dict";

// Calls store(section, key) for each place of the variable.
template <class Store>
void forEachPlace(std::string_view variable, const Dictionary& lookup, Store store) {
  const Array* placements = lookup.get(variable).array();
  if (!placements) return;
  for (const Value& placement : *placements) {
    const Dictionary* entries = placement.dictionary();
    if (!entries) return;
    const std::string* key = entries->get(keyEntry).string();
    Dictionary* section = entries->get(sectionEntry).dictionary();
    if (!key || !section) return;
    store(*section, *key);
  }
}

}  // namespace

void addPlacement(Dictionary& lookup, std::string_view variable, std::string_view key, const Value& section) {
  if (!lookup.has(variable)) lookup.set(variable, Value::ofArray());
  const Value placement = Value::ofDictionary();
  placement.dictionary()->set(keyEntry, key);
  placement.dictionary()->set(sectionEntry, section);
  lookup.get(variable).array()->push_back(placement);
}

void storeDisplayValue(std::string_view variable, const Value& value, const Dictionary& lookup) {
  forEachPlace(variable, lookup,
               [&](Dictionary& section, const std::string& key) { section.set(key, value); });
}

void storeDisplayText(std::string_view variable, std::string_view text, const Dictionary& lookup) {
  forEachPlace(variable, lookup,
               [&](Dictionary& section, const std::string& key) { section.setText(key, text); });
}

void storeDisplayNumber(std::string_view variable, const Format& format, double number,
                        const Dictionary& lookup) {
  Formatter formatter;
  storeDisplayText(variable, formatter.text(format, number), lookup);
}

void storeDisplayFields(const Packet& packet, std::span<const Field> fields, const Dictionary& lookup) {
  Formatter formatter;
  for (const Field& field : fields) storeDisplayText(field.label, formatter.text(packet, field), lookup);
}

}  // namespace varnel::c2k

#include "LogGenerator/Section.h"

#include <algorithm>

namespace varnel {

void Section::bind(const Value& container) {
  _container = container;
  _entries.clear();
  _tables.clear();
  _refilledAt.reset();
}

std::optional<Time> Section::writtenAt(std::string_view entry) const {
  const auto found = std::ranges::find(_entries, entry, &BoundEntry::key);
  return found == _entries.end() ? std::nullopt : found->writtenAt;
}

void Section::show(const Packet& packet, std::span<const Field> fields) {
  Dictionary* const entries = _container.dictionary();
  if (!entries) return;
  Formatter formatter;
  auto entry = entriesOf(fields).begin();
  for (const Field& field : fields) {
    writtenEntry(*entry++).setText(*entries, formatter.text(packet, field));
  }
}

void Section::setText(std::string_view entry, std::string_view text) {
  if (Dictionary* const entries = _container.dictionary())
    writtenEntry(indexOf(entry)).setText(*entries, text);
}

void Section::setInteger(std::string_view entry, const Format& format, std::int32_t number) {
  setText(entry, Formatter().text(format, number));
}

void Section::setReal(std::string_view entry, const Format& format, double number) {
  setText(entry, Formatter().text(format, number));
}

void Section::set(std::string_view entry, Value value) {
  Dictionary* const entries = _container.dictionary();
  if (entries && !value.isAbsent()) writtenEntry(indexOf(entry)).set(*entries, std::move(value));
}

void Section::remove(std::string_view entry) {
  if (Dictionary* const entries = _container.dictionary()) entries->remove(entry);
}

// Decoders write their entries in the same order each time, so the next one is tried first.
std::size_t Section::indexOf(std::string_view label) {
  if (_next < _entries.size() && _entries[_next].key() == label) return _next++;
  const auto found = std::ranges::find(_entries, label, &BoundEntry::key);
  _next = static_cast<std::size_t>(found - _entries.begin()) + 1;
  if (found == _entries.end()) _entries.emplace_back(label);
  return _next - 1;
}

const std::vector<std::size_t>& Section::entriesOf(std::span<const Field> fields) {
  const auto known = std::ranges::find_if(_tables, [&](const Table& table) {
    return table.fields == fields.data() && table.entries.size() == fields.size();
  });
  if (known != _tables.end()) return known->entries;
  Table table{fields.data(), {}};
  for (const Field& field : fields) table.entries.push_back(indexOf(field.label));
  return _tables.emplace_back(std::move(table)).entries;
}

}  // namespace varnel

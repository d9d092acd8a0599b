#include "LogGenerator/Radios/MessageCounts.h"

#include <array>
#include <charconv>
#include <cstdint>
#include <string>

#include "LogGenerator/Radios/ShownNumber.h"
#include "LogGenerator/SortedKey.h"

namespace varnel {

namespace {

std::uint64_t countIn(const Value& shown) { return shownNumber<std::uint64_t>(shown).value_or(0); }

// Adds 1 to a plain number whose last digit is not 9. False for any other text, which stays as it is.
bool addOne(Value& shown) {
  const std::string* const text = shown.string();
  std::array<char, 20> room;
  if (!text || text->empty() || text->size() > room.size() || text->back() == '9') return false;
  for (std::size_t i = 0; i < text->size(); ++i) {
    room.at(i) = (*text)[i];
    if (room.at(i) < '0' || room.at(i) > '9') return false;
  }
  ++room.at(text->size() - 1);
  shown.assignText({room.data(), text->size()});
  return true;
}

std::string keyOf(const AirMessage& message) {
  std::string key(nameOf(message.radio));
  for (const std::string_view part : {nameOf(message.protocol), message.name}) key.append(" ").append(part);
  return key;
}

}  // namespace

void MessageCounts::take(const AirMessageReading& reading) {
  Dictionary* const entries = sectionRef.container().dictionary();
  if (!reading.message || !entries) return;
  const AirMessage& message = *reading.message;
  const Kind kind{message.radio, message.protocol, message.name.data()};
  auto found = _counts.find(kind);
  if (found == _counts.end()) found = _counts.emplace(kind, Count{BoundEntry(keyOf(message))}).first;
  Count& count = found->second;
  if (entries->hasAt(count.position, count.entry.key()) && addOne(entries->at(count.position))) {
    count.isWritten = true;
    return;
  }
  const auto names = [&] {
    return entries->size() - (entries->has(_others.entry.key()) ? 1 : 0) - (entries->has(sortMark) ? 1 : 0);
  };
  const Value& shown = count.entry.get(*entries);
  if (!shown.isAbsent() || names() < greatestCount) return set(count, *entries, countIn(shown) + 1);
  set(_others, *entries, countIn(_others.entry.get(*entries)) + 1);
}

void MessageCounts::set(Count& count, Dictionary& entries, std::uint64_t number) {
  std::array<char, 20> room;
  const auto end = std::to_chars(room.data(), room.data() + room.size(), number).ptr;
  count.entry.setText(entries, std::string_view(room.data(), end));
  count.position = entries.find(count.entry.key());
  count.isWritten = true;
}

void MessageCounts::prepareDisplay(const Time& /*now*/) {
  const Dictionary* const entries = sectionRef.container().dictionary();
  if (!entries) return;
  const auto note = [&](Count& count) {
    if (!count.isWritten) return;
    count.isWritten = false;
    if (const std::string* text = count.entry.get(*entries).string())
      sectionRef.setText(count.entry.key(), std::string(*text));
  };
  for (auto& [kind, count] : _counts) note(count);
  note(_others);
}

}  // namespace varnel

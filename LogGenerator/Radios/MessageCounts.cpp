#include "LogGenerator/Radios/MessageCounts.h"

#include "LogGenerator/Radios/ShownNumber.h"
#include "LogGenerator/SortedKey.h"

namespace varnel {

namespace {

constexpr std::string_view otherEntry = "Other";

std::string keyOf(const AirMessage& message) {
  std::string key(nameOf(message.radio));
  for (const std::string_view part : {nameOf(message.protocol), message.name}) key.append(" ").append(part);
  return key;
}

}  // namespace

void MessageCounts::take(const AirMessageReading& reading) {
  if (!reading.message) return;
  const AirMessage& message = *reading.message;
  const auto [found, isNew] =
      _positions.try_emplace({message.radio, message.protocol, message.name.data()}, _counts.size());
  if (isNew) _counts.push_back({keyOf(message)});
  ++_counts[found->second].number;
}

void MessageCounts::prepareDisplay(const Time& /*now*/) {
  const Dictionary* const entries = sectionRef.container().dictionary();
  if (!entries) return;
  Count others{std::string(otherEntry)};
  for (Count& count : _counts) {
    if (count.number == 0) continue;
    const std::size_t names =
        entries->size() - (entries->has(otherEntry) ? 1 : 0) - (entries->has(sortMark) ? 1 : 0);
    if (names < greatestCount || entries->has(count.entry)) {
      add(count, *entries);
    } else {
      others.number += count.number;
    }
    count.number = 0;
  }
  if (others.number > 0) add(others, *entries);
}

void MessageCounts::add(const Count& count, const Dictionary& entries) {
  const std::uint64_t before = shownNumber<std::uint64_t>(entries.get(count.entry)).value_or(0);
  sectionRef.setText(count.entry, std::to_string(before + count.number));
}

}  // namespace varnel

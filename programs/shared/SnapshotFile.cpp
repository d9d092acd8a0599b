#include "programs/shared/SnapshotFile.h"

#include <algorithm>
#include <stdexcept>
#include <string_view>
#include <utility>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "programs/shared/Timestamps.h"

namespace varnel {

namespace {

constexpr std::string_view itemsKey = "Data";
constexpr std::string_view binaryLogKey = "DLF";
constexpr std::string_view rawMessagesKey = "DisplayState";
constexpr std::string_view displayKey = "Display";
constexpr std::string_view dateKey = "Date";
constexpr std::string_view descriptionKey = "Description";
constexpr std::string_view timestampKey = "Timestamp";

// One byte more than a property list may have, so that a longer one is refused.
Bytes contentsOf(ByteWindow& bytes) {
  bytes.holds(fileLimits.size + 1);
  const auto contents = bytes.unread();
  return {contents.begin(), contents.end()};
}

Value itemAsShown(const Value& item) {
  const Dictionary* entries = item.dictionary();
  if (!entries) return item;
  Value shown = Value::ofDictionary();
  // The date, then the description.
  for (const std::string_view key : {dateKey, descriptionKey})
    shown.dictionary()->set(key, entries->get(key));
  for (const auto& [key, value] : *entries) {
    if (key != binaryLogKey && key != rawMessagesKey) shown.dictionary()->set(key, value);
  }
  return shown;
}

std::optional<Time> timeIn(const Dictionary& entries, std::string_view key) {
  const std::string* text = entries.get(key).string();
  return text ? timeOfDescription(*text) : std::nullopt;
}

}  // namespace

// A record of 60 bytes begins with '<', and a frame can. But only in XML letters follow.
bool SnapshotFile::isPropertyList(ByteWindow& bytes) {
  constexpr std::string_view binary = "bplist";
  if (!bytes.holds(2)) return bytes.holds(1) && bytes.unread()[0] == '<';
  const std::uint8_t first = bytes.unread()[0], second = bytes.unread()[1];
  if (first == '<') return second >= ' ' && second < 0x7F;
  if (first != binary[0] || second != binary[1] || !bytes.holds(binary.size())) return false;
  const auto begin = bytes.unread().first(binary.size());
  return std::equal(begin.begin(), begin.end(), binary.begin());
}

SnapshotFile::SnapshotFile(ByteWindow& bytes, std::string name) : _name(std::move(name)) {
  auto contents = readPropertyList(contentsOf(bytes), fileLimits);
  if (!contents)
    throw std::runtime_error(_name +
                             " begins like a snapshot but is no property list; is it cut off or damaged?");
  if (!contents->dictionary() || !contents->dictionary()->get(itemsKey).array())
    throw std::runtime_error(_name + " is a property list but no snapshot, which has an array Data");
  _contents = std::move(*contents);
}

const Value& SnapshotFile::items() const { return _contents.dictionary()->get(itemsKey); }

Value SnapshotFile::shown() const {
  Value shown = _contents.shallowCopy();
  Value shownItems = Value::ofArray();
  for (const Value& item : *items().array()) shownItems.array()->push_back(itemAsShown(item));
  shown.dictionary()->set(itemsKey, std::move(shownItems));
  return shown;
}

std::vector<Generation> SnapshotFile::generations() const {
  const auto saved = timeIn(*_contents.dictionary(), timestampKey);
  std::vector<Generation> generations;
  for (const Value& item : *items().array()) {
    const Dictionary* entries = item.dictionary();
    if (!entries || !entries->has(displayKey)) continue;
    const auto date = timeIn(*entries, dateKey);
    if (!date && !saved)
      throw std::runtime_error(_name + " is damaged: neither a display nor the snapshot has a date");
    generations.push_back({date ? *date : *saved, entries->get(displayKey)});
  }
  return generations;
}

const Bytes* binaryLogOf(const Value& items) {
  const Array* elements = items.array();
  if (!elements) return nullptr;
  for (const Value& item : *elements) {
    const Bytes* log = item.dictionary() ? item.dictionary()->get(binaryLogKey).data() : nullptr;
    if (log) return log;
  }
  return nullptr;
}

}  // namespace varnel

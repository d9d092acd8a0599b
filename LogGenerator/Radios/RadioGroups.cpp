#include "LogGenerator/Radios/RadioGroups.h"

#include <algorithm>
#include <ostream>
#include <type_traits>

#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"
#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/SortedKey.h"

namespace varnel {

namespace {

constexpr std::string_view c2kGroup = "CDMA2000", c2kStateKey = "CDMA2000 State";

// The lines that class indexes write belong to their own technologies.
std::ostream& nowhere() {
  static std::ostream stream(nullptr);
  return stream;
}

template <class Index>
std::unique_ptr<ClassIndex> make(radios::Shared& shared) {
  if constexpr (std::is_constructible_v<Index, radios::Shared&>) {
    return std::make_unique<Index>(shared);
  } else if constexpr (std::is_constructible_v<Index, std::ostream&, CellMonitorReader&>) {
    return std::make_unique<Index>(shared.standardOutput, shared.cellMonitor);
  } else {
    return std::make_unique<Index>(shared.standardOutput);
  }
}

// A radio, or another source of sections, and the groups that its sections are in.
struct Child {
  std::unique_ptr<ClassIndex> (*make)(radios::Shared& shared);
  std::vector<std::string_view> groups;
};

// Adding a radio is adding a child. Where two have a section of one name in a group, the first one's counts.
const std::vector<Child>& children() {
  static const std::vector<Child> all = {
      {make<radios::ModemIndex>, {"Modem"}},
      {make<radios::LTEIndex>, {"LTE"}},
      {make<radios::NRIndex>, {"NR"}},
      {make<radios::CorrectedIndex>, {"UMTS", "GSM", "PLMN"}},
      {make<KLV_GSMClassIndex>, {"UMTS", "GSM", "Mobility Management", "PLMN"}},
      {make<UTRANClassIndex>, {"UMTS"}},
      {make<radios::SubscriberIndex>, {"Subscriber"}},
      {make<radios::MessagesIndex>, {"Messages"}},
  };
  return all;
}

bool hasContent(const Value& value) {
  if (const std::string* text = value.string()) return !text->empty();
  if (const Array* elements = value.array()) return !elements->empty();
  const Dictionary* entries = value.dictionary();
  return !entries || std::ranges::any_of(*entries, [](const Dictionary::Entry& entry) {
    return entry.key != sortMark && hasContent(entry.value);
  });
}

bool isDecoded(const Subscriber& subscriber, const Packet& packet, std::uint32_t logCode) {
  if (subscriber.handler) return packet.size() >= subscriber.handler->minimumLength;
  return subscriber.decoder->fateOf(packet, logCode).outcome == MessageFate::Outcome::Decoded;
}

}  // namespace

RadioGroups::RadioGroups(const Services& services, const Value& displayTemplate)
    : _services(services),
      _shared{nowhere(), services.identities, _messages, _cellMonitor, _modemReports},
      _c2k(services) {
  _c2k.keepNoRawBytes();
  const Dictionary* groups = displayTemplate.dictionary();
  if (!groups) return;
  for (const Child& child : children()) _indexes.push_back(child.make(_shared));
  for (const auto& [key, value] : *groups) {
    if (key != sortMark) addGroup(key, value);
  }
}

std::vector<ClassIndex*> RadioGroups::indexesOf(std::string_view group) const {
  std::vector<ClassIndex*> indexes;
  for (std::size_t i = 0; i < children().size(); ++i) {
    const auto& groups = children()[i].groups;
    if (std::ranges::find(groups, group) != groups.end()) indexes.push_back(_indexes[i].get());
  }
  return indexes;
}

void RadioGroups::addGroup(const std::string& key, const Value& sections) {
  Group group{key, sections.dictionary(), {}};
  if (!group.sections) return;
  const std::string_view name = displayNameOfSortedKey(key);
  const std::vector<ClassIndex*> indexes = indexesOf(name);
  for (const auto& [section, value] : *group.sections) {
    Base* decoder = nullptr;
    for (auto index = indexes.begin(); index != indexes.end() && !decoder; ++index)
      decoder = (*index)->getClass(section);
    group.decoders.push_back(decoder);
  }
  for (ClassIndex* index : indexes) {
    for (const std::uint32_t code : index->logCodes()) {
      for (const Subscriber& subscriber : index->subscription(code)->subscribers) {
        if (std::ranges::find(group.decoders, subscriber.decoder) != group.decoders.end())
          takersOf(code).deliveries.push_back(
              {_groups.size(), subscriber, dynamic_cast<const MessageSection*>(subscriber.decoder)});
      }
    }
  }
  if (name == c2kGroup) {
    // Its other lists of log codes need its template.
    const Value command = _c2k.getStartCommand();
    for (const Value& code : *command.dictionary()->get("SetKalviLogCodes").array())
      takersOf(static_cast<std::uint32_t>(code.int32().value_or(0))).isC2K = true;
  }
  _groups.push_back(std::move(group));
}

RadioGroups::Takers& RadioGroups::takersOf(std::uint32_t logCode) {
  const auto [takers, isNew] = _takers.try_emplace(logCode);
  if (isNew) _codes.push_back(logCode);
  return takers->second;
}

void RadioGroups::bind(const Value& memory, const Value& display) {
  _display = display;
  _sections.clear();
  Dictionary& kept = *memory.dictionary();
  display.dictionary()->set(sortMark, "");
  if (!kept.get(c2kStateKey).dictionary()) kept.set(c2kStateKey, Value::ofDictionary());
  _c2kState = kept.get(c2kStateKey);
  for (Group& group : _groups) {
    const bool isNew = !kept.get(group.key).dictionary();
    if (isNew) kept.set(group.key, Value::ofDictionary());
    group.shown = kept.get(group.key);
    group.isShown = display.dictionary()->has(group.key);
    group.isBound = false;
    if (!isNew) bindSections(group);
  }
}

void RadioGroups::bindSections(Group& group) {
  group.isBound = true;
  Dictionary& sections = *group.shown.dictionary();
  auto decoder = group.decoders.begin();
  for (const auto& [name, value] : *group.sections) {
    if (!sections.has(name)) sections.set(name, value.deepCopy());
    Base* const itsDecoder = *decoder++;
    if (!itsDecoder) continue;
    const Value& section = sections.get(name);
    itsDecoder->updateSectionRef(section);
    const void* const container =
        section.dictionary() ? static_cast<const void*>(section.dictionary()) : section.array();
    _sections[container] = &itsDecoder->section();
  }
}

bool RadioGroups::take(const LogMessage& message, ByteView bytes) {
  if (!message.isOfKnownType()) return false;
  const std::uint32_t logCode = message.logCode();
  const auto found = _takers.find(logCode);
  if (found == _takers.end()) return false;
  bool isTaken = false;
  const Time now = _services.clock.now();
  _lastTaken = now;
  for (const auto& [index, subscriber, messages] : found->second.deliveries) {
    Group& group = _groups[index];
    if (!group.isBound) bindSections(group);
    subscriber.decoder->section().setTime(now);
    subscriber.deliver(message.packet(), logCode);
    isTaken =
        isTaken || (messages ? messages->hasDecodedLast() : isDecoded(subscriber, message.packet(), logCode));
    if (!group.isShown) noteWhetherShown(group);
  }
  if (found->second.isC2K) {
    isTaken |= _c2k.fateOf(bytes).outcome == MessageFate::Outcome::Decoded;
    takeC2K(bytes);
  }
  return isTaken;
}

void RadioGroups::takeC2K(ByteView bytes) {
  _c2k.updateState_withData(*_c2kState.dictionary(), bytes);
  const auto group = std::ranges::find_if(
      _groups, [](const Group& candidate) { return displayNameOfSortedKey(candidate.key) == c2kGroup; });
  const Value& itsDisplay = _c2kState.dictionary()->get(stateKey::display);
  if (group == _groups.end() || group->isShown || itsDisplay.isAbsent()) return;
  group->shown = itsDisplay;
  noteWhetherShown(*group);
}

void RadioGroups::noteWhetherShown(Group& group) {
  group.isShown = hasContent(group.shown);
  if (group.isShown && _display.dictionary()) _display.dictionary()->set(group.key, group.shown);
}

// Of several decoders, the best that one of them makes of the packet.
MessageFate RadioGroups::fateOf(const LogMessage& message, ByteView bytes) const {
  using enum MessageFate::Outcome;
  if (!message.isOfKnownType()) return {Unknown};
  const std::uint32_t logCode = message.logCode();
  const auto found = _takers.find(logCode);
  if (found == _takers.end()) return {Unknown, logCode};
  if (found->second.isC2K) return _c2k.fateOf(bytes);
  MessageFate best{TooShort, logCode};
  for (const auto& [index, subscriber, messages] : found->second.deliveries) {
    if (isDecoded(subscriber, message.packet(), logCode)) return {Decoded, logCode};
    if (subscriber.handler) continue;
    const MessageFate fate = subscriber.decoder->fateOf(message.packet(), logCode);
    if (fate.outcome == UnknownVersion) best = fate;
  }
  return best;
}

void RadioGroups::prepareDisplay(const Time& now) {
  for (const auto& index : _indexes) index->prepareDisplay(now);
  for (Group& group : _groups) {
    if (group.isBound && !group.isShown) noteWhetherShown(group);
  }
}

std::vector<std::uint32_t> RadioGroups::logCodes() const { return _codes; }

std::vector<CodeSections> RadioGroups::codeSections() const {
  std::vector<CodeSections> list;
  for (const std::uint32_t code : _codes) {
    CodeSections& entry = list.emplace_back(CodeSections{code, {}});
    for (const auto& [index, subscriber, messages] : _takers.at(code).deliveries) {
      std::string name(subscriber.decoder->getSectionName());
      if (std::ranges::find(entry.sections, name) == entry.sections.end())
        entry.sections.push_back(std::move(name));
    }
  }
  for (const CodeSections& c2k : _c2k.codeSections()) {
    const auto entry = std::ranges::find(list, c2k.logCode, &CodeSections::logCode);
    if (entry == list.end()) continue;
    entry->sections.insert(entry->sections.end(), c2k.sections.begin(), c2k.sections.end());
  }
  return list;
}

NumberFormats RadioGroups::numberFormats() const {
  NumberFormats formats = _c2k.numberFormats();
  for (const Group& group : _groups) {
    auto decoder = group.decoders.begin();
    for (const auto& [name, value] : *group.sections) {
      SectionFormats section(formats, name);
      if (const Base* const itsDecoder = *decoder++) itsDecoder->listNumberFormats(section);
    }
  }
  return formats;
}

std::optional<Time> RadioGroups::writtenAt(const Dictionary& entries, std::string_view key) const {
  const auto found = _sections.find(&entries);
  return found == _sections.end() ? _c2k.writtenAt(entries, key) : found->second->writtenAt(key);
}

std::optional<Time> RadioGroups::refilledAt(const Array& list) const {
  const auto found = _sections.find(&list);
  return found == _sections.end() ? std::nullopt : found->second->refilledAt();
}

}  // namespace varnel

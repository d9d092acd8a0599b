#include "model/events/SubscriptionEvents.h"

#include <algorithm>
#include <iterator>
#include <span>
#include <utility>

#include "LogGenerator/PacketVersion.h"
#include "LogGenerator/SortedKey.h"
#include "base/Dictionary.h"

namespace varnel {

namespace {

// ---- What is watched ----

constexpr std::string_view lte = "LTE", nr = "NR", umts = "UMTS", gsm = "GSM",
                           mobility = "Mobility Management", plmn = "PLMN", modem = "Modem";

struct CellEntry {
  std::string_view name;
  // Whether another text means another cell. An entry that another kind of packet writes may be late.
  bool tellsCells = true;
};

// A section that shows the serving cell, and the entry that tells whether the phone is connected to it.
struct CellSource {
  std::string_view group, section;
  CellEntry entries[3];
  std::string_view connectionSection{}, connectionEntry{}, connected{};
};

constexpr CellSource cells[] = {
    {lte,
     "Serving Cell",
     {{"EARFCN"}, {"Physical Cell ID"}, {"Cell Identity"}},
     "Connection",
     "RRC State",
     "Connected"},
    {nr, "Serving Cell", {{"NR-ARFCN"}, {"Physical Cell ID"}, {"Cell Identity"}}},
    {umts,
     "UMTS RR Info",
     {{"Downlink Frequency", false}, {"Scrambling Code", false}, {"Cell ID"}},
     "UMTS RR Info",
     "RRC State",
     "CELL_DCH"},
    {umts,
     "Serving Cell Info",
     {{"Downlink UARFCN"}, {"Cell Scrambling Code"}, {"Cell ID"}},
     "RRC Info",
     "State",
     "Cell DCH"},
    {gsm, "GSM Serving Cell", {{"ARFCN"}, {"BSIC", false}, {"Cell ID"}}},
    // The cell monitor tells of the cells of the other radios.
    {modem, "NR Cell", {{"NR-ARFCN"}, {"Physical Cell ID"}, {"Cell Identity"}}},
};

enum class StateKind { Registration, Service, Connection };

struct StateSource {
  std::string_view group, section, entry;
  StateKind kind;
  std::string_view countEntry{};  // counts the connections
};

constexpr StateSource states[] = {
    {lte, "Connection", "RRC State", StateKind::Connection, "RRC Connections"},
    {umts, "UMTS RR Info", "RRC State", StateKind::Connection},
    {umts, "RRC Info", "State", StateKind::Connection},
    {lte, "Registration", "EMM State", StateKind::Registration},
    {nr, "Registration", "5GMM State", StateKind::Registration},
    {mobility, "Process CS", "MM State", StateKind::Registration},
    {mobility, "Process PS", "MM State", StateKind::Registration},
    {lte, "Registration", "EMM Substate", StateKind::Service},
    {nr, "Registration", "5GMM Substate", StateKind::Service},
    {mobility, "Process CS", "MM Sub State", StateKind::Service},
    {mobility, "Process PS", "MM Sub State", StateKind::Service},
    // All three processes show the same.
    {mobility, "Process PS", "MM Service State", StateKind::Service},
    {plmn, "Serving PLMN", "Service Type", StateKind::Service},
    {modem, "Registration", "State", StateKind::Registration},
    {modem, "Registration", "State", StateKind::Service},
};

constexpr std::string_view lostTexts[] = {
    "No Cell Available",
    "PLMN Search",
    "Limited Service",
    "MM_PLMN_SEARCH",
    "MM_LIMITED_SERVICE",
    "MM_NO_CELL_AVAILABLE",
    "GMM_PLMN_SEARCH",
    "GMM_LIMITED_SERVICE",
    "GMM_NO_CELL_AVAILABLE",
    "REG_STATE_OFFLINE",
    "REG_STATE_AUTOMATIC_SEARCH",
    "NO_SERVICE",
    "LIMITED_SERVICE",
    "Not Registered",
    "Searching",
    "Denied",
    "Emergency Only",
};
// Other texts belong to neither: the phone is on its way.
constexpr std::string_view servedTexts[] = {
    "Normal Service", "MM_NORMAL_SERVICE", "GMM_NORMAL_SERVICE", "REG_STATE_IDLE",
    "CS_ONLY",        "PS_ONLY",           "CS_PS_SERVICE",      "Home",
    "Roaming",
};

// NR packets have versions of 32 bits.
constexpr std::size_t mostVersionsTold = 32;

// ---- Finding it ----

// The section; the absent value when it is not there, or is a list.
Value sectionIn(const Dictionary& groups, std::string_view group, std::string_view section) {
  for (const auto& [key, value] : groups) {
    if (displayNameOfSortedKey(key) != group || !value.dictionary()) continue;
    const Value& found = value.dictionary()->get(section);
    return found.dictionary() ? found : Value();
  }
  return {};
}

bool isIn(std::span<const std::string_view> texts, std::string_view text) {
  return std::ranges::find(texts, text) != texts.end();
}

// "37" of "37 (not known)", and of "37".
std::string numberOfVersion(std::string_view text) {
  if (text.ends_with(unknownVersionMark)) text.remove_suffix(unknownVersionMark.size());
  return std::string(text);
}

std::string pathOf(std::string_view group, std::string_view section) {
  return std::string(group).append("/").append(section);
}

}  // namespace

const std::string& SubscriptionEvents::Entry::now(const Value& section) {
  static const std::string nothing;
  const std::string* const text = section.dictionary() ? bound.get(*section.dictionary()).string() : nullptr;
  return text ? *text : nothing;
}

SubscriptionEvents::SubscriptionEvents(std::string_view path) : _path(path) {
  for (std::size_t i = 0; i < std::size(cells); ++i) {
    CellWatch watch{.source = i, .entries = {}, .connectionState = Entry(cells[i].connectionEntry)};
    for (const CellEntry& entry : cells[i].entries) watch.entries.emplace_back(entry.name);
    _cells.push_back(std::move(watch));
  }
  for (std::size_t i = 0; i < std::size(states); ++i)
    _states.push_back({.source = i, .state = Entry(states[i].entry), .count = Entry(states[i].countEntry)});
}

void SubscriptionEvents::bind(const Dictionary& groups) {
  for (CellWatch& watch : _cells) {
    const CellSource& source = cells[watch.source];
    watch.section = sectionIn(groups, source.group, source.section);
    watch.connection = sectionIn(groups, source.group, source.connectionSection);
  }
  for (StateWatch& watch : _states) {
    const StateSource& source = states[watch.source];
    watch.section = sectionIn(groups, source.group, source.section);
  }
  bindVersions(groups);
}

void SubscriptionEvents::bindVersions(const Dictionary& groups) {
  for (const auto& [key, group] : groups) {
    if (!group.dictionary()) continue;
    for (const auto& [name, section] : *group.dictionary()) {
      if (!section.dictionary() || !section.dictionary()->has(versionEntry)) continue;
      const std::string path = pathOf(displayNameOfSortedKey(key), name);
      const auto known = std::ranges::find(_versions, path, &VersionWatch::path);
      if (known == _versions.end())
        _versions.push_back({.path = path, .section = section, .version = Entry(versionEntry)});
      else
        known->section = section;
    }
  }
}

// ---- Looking at it ----

void SubscriptionEvents::look(Time time, std::vector<DisplayEvent>& events) {
  _time = time;
  _events = &events;
  for (CellWatch& watch : _cells) lookAtCell(watch);
  for (StateWatch& watch : _states) lookAtState(watch);
  for (VersionWatch& watch : _versions) lookAtVersion(watch);
}

void SubscriptionEvents::add(EventKind kind, std::string_view section, std::string from, std::string to) {
  _events->push_back({_time, kind, _path + std::string(section), std::move(from), std::move(to)});
}

void SubscriptionEvents::lookAtCell(CellWatch& watch) {
  if (watch.section.isAbsent()) return;
  const CellSource& source = cells[watch.source];
  const bool isConnected =
      !watch.connection.isAbsent() && watch.connectionState.now(watch.connection) == source.connected;
  const bool staysConnected = std::exchange(watch.wasConnected, isConnected) && isConnected;

  bool isShown = false, wasShown = false, isOther = false, differs = false;
  std::string from, to;
  for (std::size_t i = 0; i < watch.entries.size(); ++i) {
    Entry& entry = watch.entries[i];
    const std::string& now = entry.now(watch.section);
    isShown |= !now.empty();
    wasShown |= !entry.before.empty();
    if (now == entry.before) continue;
    differs = true;
    isOther |= source.entries[i].tellsCells && !now.empty() && !entry.before.empty();
  }
  if (!differs || !isShown) return;
  const auto addText = [](std::string& text, std::string_view name, const std::string& value) {
    if (!value.empty()) text.append(text.empty() ? "" : ", ").append(name).append(" ").append(value);
  };
  for (Entry& entry : watch.entries) {
    const std::string& now = entry.now(watch.section);
    addText(from, entry.bound.key(), entry.before);
    addText(to, entry.bound.key(), now);
    entry.before = now;
  }
  if (!isOther && wasShown) return;
  add(staysConnected && wasShown ? EventKind::Handover : EventKind::CellChange,
      pathOf(source.group, source.section), std::move(from), std::move(to));
}

void SubscriptionEvents::lookAtState(StateWatch& watch) {
  if (watch.section.isAbsent()) return;
  const StateSource& source = states[watch.source];
  const std::string& now = watch.state.now(watch.section);
  const bool hasCount = !source.countEntry.empty();
  const std::string& count = hasCount ? watch.count.now(watch.section) : watch.count.before;
  if (now == watch.state.before && count == watch.count.before) return;
  const std::string path = pathOf(source.group, source.section);
  if (now == watch.state.before) {
    // It was released and set up again, and the release was not seen.
    const auto text = [&](const std::string& number) { return now + ", connection " + number; };
    if (!watch.count.before.empty() && !now.empty())
      add(EventKind::Connection, path, text(watch.count.before), text(count));
  } else if (!now.empty()) {
    if (source.kind == StateKind::Service)
      lookAtService(watch, now);
    else
      add(source.kind == StateKind::Connection ? EventKind::Connection : EventKind::Registration, path,
          watch.state.before, now);
  }
  // What is not shown any more says nothing.
  if (!now.empty()) watch.state.before = now;
  if (hasCount) watch.count.before = count;
}

void SubscriptionEvents::lookAtService(StateWatch& watch, const std::string& text) {
  const StateSource& source = states[watch.source];
  const auto tell = [&](EventKind kind) {
    add(kind, pathOf(source.group, source.section), watch.state.before, text);
  };
  if (isIn(lostTexts, text)) {
    // A phone that was just switched on, or a capture that begins in a search, has lost nothing.
    if (!std::exchange(watch.hasService, false)) return;
    watch.isLost = true;
    tell(EventKind::LossOfService);
  } else if (isIn(servedTexts, text)) {
    watch.hasService = true;
    if (std::exchange(watch.isLost, false)) tell(EventKind::ReturnOfService);
  }
}

void SubscriptionEvents::lookAtVersion(VersionWatch& watch) {
  const std::string& now = watch.version.now(watch.section);
  if (now == watch.version.before) return;
  if (now.ends_with(unknownVersionMark) && watch.told.size() < mostVersionsTold &&
      std::ranges::find(watch.told, now) == watch.told.end()) {
    watch.told.push_back(now);
    add(EventKind::UnknownVersion, watch.path, numberOfVersion(watch.version.before), numberOfVersion(now));
  }
  watch.version.before = now;
}

}  // namespace varnel

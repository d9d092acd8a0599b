#include "programs/varnel-decode/database/ValueChanges.h"

#include <algorithm>
#include <cerrno>
#include <span>
#include <system_error>
#include <unordered_map>
#include <utility>

#include "LogGenerator/SortedKey.h"
#include "base/Dictionary.h"
#include "programs/varnel-decode/DisplayJson.h"
#include "programs/varnel-decode/ProgramError.h"

namespace varnel {

namespace {

// A display is not deeper, and a node beyond it is left out.
constexpr std::size_t deepest = 64;
// Inner nodes and leaves without a value count too.
constexpr std::size_t mostNodes = 4 * ValueChanges::mostPaths;

// ---- What tells a cell ----

enum class Radio : std::size_t { None, LTE, NR, UMTS, GSM, CDMA, CDMAStation };
constexpr const char* radioNames[] = {"", "LTE", "NR", "UMTS", "GSM", "CDMA2000", "CDMA2000 base station"};
constexpr Radio radios[] = {Radio::LTE, Radio::NR, Radio::UMTS, Radio::GSM, Radio::CDMA, Radio::CDMAStation};

struct NamedEntry {
  std::string_view name;
  Radio radio;
};

// The decoders' names of a channel's number. A cell is in the section or record that has both its channel and
// its identity, or in a record of a section that has the channel.
constexpr NamedEntry channelEntries[] = {
    {"EARFCN", Radio::LTE},
    {"E-ARFCN", Radio::LTE},
    {"E ARFCN", Radio::LTE},
    {"Serving EARFCN", Radio::LTE},
    {"Download Frequency", Radio::LTE},
    {"NR-ARFCN", Radio::NR},
    {"UARFCN", Radio::UMTS},
    {"U ARFCN", Radio::UMTS},
    {"Downlink UARFCN", Radio::UMTS},
    {"Downlink Frequency", Radio::UMTS},
    {"ARFCN", Radio::GSM},
    {"Rx0 Channel", Radio::CDMA},
    {"Channel", Radio::CDMA},
};

// LTE and NR share the name of the identity, so the channel decides.
constexpr NamedEntry identityEntries[] = {
    {"Physical Cell ID", Radio::LTE},
    {"Serving Physical Cell ID", Radio::LTE},
    {"Physical Cell ID", Radio::NR},
    {"Scrambling Code", Radio::UMTS},
    {"Cell Scrambling Code", Radio::UMTS},
    {"PSC", Radio::UMTS},
    {"BSIC", Radio::GSM},
    {"BSIC ID", Radio::GSM},
    {"Pilot", Radio::CDMA},
    {"Serving Pilot PN Offset", Radio::CDMA},
    {"Base Station ID", Radio::CDMAStation},
};

// A set of pilots has an entry per pilot, whose name is the pilot's PN.
constexpr std::string_view pilotSet = "Active Set";
// The system information tells of a base station, but not of its channel. That is in the section of the
// radio.
constexpr std::string_view radioOfStations = "1x", channelOfStations = "Rx0 Channel";

// Some modems write the identity of a GSM cell as a number, and others its two parts: "2/5 (NCC/BCC)" is 21.
// A pilot's PN may have a unit.
std::string identityIn(const std::string& text, Radio radio) {
  if (radio == Radio::CDMA) return text.substr(0, text.find(' '));
  constexpr std::string_view parts = " (NCC/BCC)";
  if (radio != Radio::GSM || text.size() != 3 + parts.size() || !text.ends_with(parts) || text[1] != '/')
    return text;
  const int network = text[0] - '0', station = text[2] - '0';
  if (network < 0 || network > 7 || station < 0 || station > 7) return text;
  return std::to_string(8 * network + station);
}

bool names(std::span<const NamedEntry> entries, std::string_view name, Radio radio) {
  return std::ranges::any_of(
      entries, [&](const NamedEntry& entry) { return entry.name == name && entry.radio == radio; });
}

bool isNumber(std::string_view text) {
  return !text.empty() && std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

bool isNamed(std::span<const NamedEntry> entries, std::string_view name) {
  return std::ranges::find(entries, name, &NamedEntry::name) != std::end(entries);
}

[[noreturn]] void failWithFile(const char* what) {
  throw std::system_error(errno, std::generic_category(), what);
}

void writeTo(std::FILE* file, const void* bytes, std::size_t size) {
  if (size > 0 && std::fwrite(bytes, 1, size, file) != size) failWithFile("cannot write a temporary file");
}

void readFrom(std::FILE* file, void* bytes, std::size_t size) {
  if (size > 0 && std::fread(bytes, 1, size, file) != size) failWithFile("cannot read a temporary file");
}

}  // namespace

// A place in the display, which may be there in some displays only.
struct ValueChanges::Node {
  static constexpr std::size_t noPath = SIZE_MAX;

  std::string name;
  Node* parent = nullptr;
  std::vector<std::unique_ptr<Node>> children{};
  std::unordered_map<std::string_view, Node*> byName{};
  std::vector<Node*> channels{};  // children that tell the channel of a cell
  bool isPilot = false;           // its name tells which pilot of a channel it is

  const Node* childNamed(std::string_view child) const {
    const auto found = byName.find(child);
    return found == byName.end() ? nullptr : found->second;
  }

  // Of a leaf.
  std::optional<std::string> text{};
  std::size_t path = noPath;
  std::uint32_t seenAt = UINT32_MAX, changedAt = UINT32_MAX;
  std::optional<std::uint32_t> replacedAt{};  // when it last got a text after an earlier one
  bool isShown = false;
};

ValueChanges::ValueChanges(std::size_t largestChunk)
    : _largestChunk(largestChunk), _root(std::make_unique<Node>()) {}

ValueChanges::~ValueChanges() {
  if (_earlier) std::fclose(_earlier);
}

void ValueChanges::take(const Generation& generation) {
  if (_displays.size() >= mostDisplays) {
    _isTooMuch = true;
    return;
  }
  _hasChanged = false;
  walk(*_root, generation.display);
  for (Node* const leaf : _shown)
    if (leaf->seenAt != _now) addChange(*leaf, std::nullopt);
  std::erase_if(_shown, [this](Node* leaf) { return !(leaf->isShown = leaf->seenAt == _now); });
  for (const Node* const identity : _identities)
    if (identity->text) seeCell(*identity);
  if (_hasChanged) {
    const bool isDated = generation.dating == Dating::Known;
    _displays.push_back({isDated ? std::optional(generation.time) : std::nullopt, generation.elapsed});
  }
  ++_now;
  if (_chunkSize >= _largestChunk) spill();
}

void ValueChanges::finish(const std::string& inputName) {
  if (_isTooMuch)
    tell(inputName +
         " shows more than the database takes of one capture; some of its values or cells are "
         "left out");
}

// The order of the tree does not matter here. Of two values with the same path the first one counts.
void ValueChanges::walk(Node& node, const Value& object) {
  if (const Dictionary* entries = object.dictionary()) {
    if (_names.size() >= deepest) return;
    const bool isSorted = entries->has(sortMark);
    std::size_t position = 0;
    for (const auto& [key, value] : *entries) {
      if (key == sortMark) continue;
      const std::string_view name = isSorted ? displayNameOfSortedKey(key) : std::string_view(key);
      if (_nodes >= mostNodes && !node.byName.contains(name)) {
        _isTooMuch = true;
        continue;
      }
      walk(child(node, position++, name), value);
      _names.pop_back();
    }
  } else if (const Array* elements = object.array()) {
    if (_names.size() >= deepest) return;
    for (std::size_t i = 0; i < elements->size(); ++i) {
      if (_nodes >= mostNodes && i >= node.children.size()) {
        _isTooMuch = true;
        break;
      }
      walk(child(node, i, std::to_string(i)), (*elements)[i]);
      _names.pop_back();
    }
  } else if (const std::string* text = object.string(); text && !isAbsent(*text)) {
    see(node, *text);
  }
}

// Finds the child, or makes it, and puts its name on the path. In most displays it is where it was before.
ValueChanges::Node& ValueChanges::child(Node& node, std::size_t position, std::string_view name) {
  Node* found = nullptr;
  if (position < node.children.size() && node.children[position]->name == name) {
    found = node.children[position].get();
  } else if (const auto known = node.byName.find(name); known != node.byName.end()) {
    found = known->second;
  } else {
    ++_nodes;
    found =
        node.children.emplace_back(std::make_unique<Node>(Node{.name = std::string(name), .parent = &node}))
            .get();
    node.byName.emplace(found->name, found);
    if (isNamed(channelEntries, name)) node.channels.push_back(found);
    // A list of another radio has the same name. Its records have numbers too, but no texts.
    found->isPilot = node.name == pilotSet && isNumber(name);
    if (found->isPilot || isNamed(identityEntries, name)) _identities.push_back(found);
  }
  _names.push_back(found->name);
  return *found;
}

void ValueChanges::see(Node& leaf, std::string_view text) {
  if (leaf.seenAt == _now) return;
  leaf.seenAt = _now;
  if (!leaf.isShown) {
    leaf.isShown = true;
    _shown.push_back(&leaf);
  }
  if (leaf.text != text) addChange(leaf, text);
}

std::optional<std::size_t> ValueChanges::pathOf(Node& leaf) {
  if (leaf.path != Node::noPath) return leaf.path;
  if (_paths.size() >= mostPaths) return std::nullopt;
  const EntryPlace place = _formats.at(_names);
  std::string name;
  for (const std::string& part : _names) name.append(name.empty() ? "" : "/").append(part);
  leaf.path = _paths.size();
  _paths.push_back({std::move(name), std::string(place.formats.unit()), place.formats});
  _chunk.changes.emplace_back();
  return leaf.path;
}

void ValueChanges::addChange(Node& leaf, std::optional<std::string_view> text) {
  const bool isFirst = leaf.changedAt == UINT32_MAX;
  if (text && !isFirst) leaf.replacedAt = _now;
  if (text)
    leaf.text = *text;
  else
    leaf.text.reset();
  leaf.changedAt = _now;
  const auto path = pathOf(leaf);
  if (!path) {
    _isTooMuch = true;
    return;
  }
  _hasChanged = true;
  _chunk.changes[*path].push_back({.display = static_cast<std::uint32_t>(_displays.size()),
                                   .offset = static_cast<std::uint32_t>(_chunk.texts.size()),
                                   .size = text ? static_cast<std::uint32_t>(text->size()) : Change::noText});
  if (text) _chunk.texts.append(*text);
  _chunkSize += sizeof(Change) + (text ? text->size() : 0);
}

// The channel of a cell; null where none is shown.
const ValueChanges::Node* ValueChanges::channelOf(const Node& identity, std::size_t radio) {
  if (Radio(radio) == Radio::CDMAStation) {
    const Node* const group = identity.parent ? identity.parent->parent : nullptr;
    const Node* const section = group ? group->childNamed(radioOfStations) : nullptr;
    const Node* const channel = section ? section->childNamed(channelOfStations) : nullptr;
    return channel && channel->text ? channel : nullptr;
  }
  for (const Node* section = identity.parent; section; section = section->parent) {
    const auto found = std::ranges::find_if(section->channels, [&](const Node* entry) {
      // Some entries of these names show a frequency with its unit.
      return entry->text && names(channelEntries, entry->name, Radio(radio)) &&
             !EntryFormats().number(*entry->text).empty();
    });
    if (found != section->channels.end()) return *found;
  }
  return nullptr;
}

// Whether a cell is shown for the first time, or again.
bool ValueChanges::isSeenNow(const Node& identity, const Node& channel, std::size_t radio) const {
  const bool hasNewIdentity = identity.changedAt == _now, hasNewChannel = channel.changedAt == _now;
  // Pilots and system information come in packets of their own, later than a new channel. Until then, those
  // of the old one are still shown.
  if (identity.isPilot && channel.replacedAt) return hasNewIdentity && *channel.replacedAt < _now;
  if (Radio(radio) == Radio::CDMAStation) return hasNewIdentity;
  return hasNewIdentity || hasNewChannel;
}

void ValueChanges::seeCell(const Node& identity) {
  for (const Radio radio : radios) {
    const bool isOfRadio =
        identity.isPilot ? radio == Radio::CDMA : names(identityEntries, identity.name, radio);
    if (!isOfRadio) continue;
    const Node* const channel = channelOf(identity, static_cast<std::size_t>(radio));
    if (!channel || !isSeenNow(identity, *channel, static_cast<std::size_t>(radio))) continue;
    const auto number = EntryFormats().number(*channel->text);
    const std::string name = identityIn(identity.isPilot ? identity.name : *identity.text, radio);
    if (number.empty() || (radio == Radio::CDMA && !isNumber(name))) continue;
    if (_cells.size() >= mostCells) {
      _isTooMuch = true;
      return;
    }
    _cells.insert({radioNames[static_cast<std::size_t>(radio)], std::string(number), name});
  }
}

void ValueChanges::spill() {
  if (!_earlier && !(_earlier = std::tmpfile())) failWithFile("cannot make a temporary file");
  const auto writeNumber = [this](std::uint64_t number) { writeTo(_earlier, &number, sizeof number); };
  writeNumber(_chunk.changes.size());
  writeNumber(_chunk.texts.size());
  for (auto& changes : _chunk.changes) {
    writeNumber(changes.size());
    writeTo(_earlier, changes.data(), changes.size() * sizeof(Change));
    changes = {};
  }
  writeTo(_earlier, _chunk.texts.data(), _chunk.texts.size());
  _chunk.texts.clear();
  _chunkSize = 0;
}

void ValueChanges::visit(const std::function<void(const Chunk& chunk)>& visitor) {
  if (_earlier) {
    if (std::fflush(_earlier) != 0) failWithFile("cannot write a temporary file");
    const auto end = std::ftell(_earlier);
    std::rewind(_earlier);
    const auto readNumber = [this] {
      std::uint64_t number = 0;
      readFrom(_earlier, &number, sizeof number);
      return static_cast<std::size_t>(number);
    };
    while (std::ftell(_earlier) < end) {
      Chunk chunk;
      chunk.changes.resize(readNumber());
      chunk.texts.resize(readNumber());
      for (auto& changes : chunk.changes) {
        changes.resize(readNumber());
        readFrom(_earlier, changes.data(), changes.size() * sizeof(Change));
      }
      readFrom(_earlier, chunk.texts.data(), chunk.texts.size());
      visitor(chunk);
    }
  }
  visitor(_chunk);
}

}  // namespace varnel

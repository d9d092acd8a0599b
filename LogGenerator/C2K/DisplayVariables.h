#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/BoundEntry.h"
#include "LogGenerator/Field.h"
#include "LogGenerator/SortedKey.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel::c2k {

// Display variables are the names under which decoders publish texts. The lookup has an array for each
// variable that the template names. The array holds placements {"key": the entry, "dict": the dictionary with
// the entry}.

/// Marks, as a key and as a text, a dictionary whose entries are sorted by key.
inline constexpr std::string_view sortedMark = sortMark;

/// The variables that decoders publish, with their names in the template.
inline constexpr std::string_view variableNames[] = {
    "kChannel",         "k1xEVDODeviceState",
    "kBandClass",       "kRxAGC0",
    "kRxAGC1",          "kTxAGC",
    "kServingPNOffset", "kSessionState",
    "kUATI24",          "kColorCode",
    "kActiveSetPilots", "kFingerC2I",
    "k1xDeviceState",   "k1xRx0BandClass",
    "k1xRx0ChanNum",    "k1xRxAGC0",
    "k1xRx1BandClass",  "k1xRx1ChanNum",
    "k1xRxAGC1",        "k1xTxAGC",
    "k1xActiveSetInfo", "k1xTrafficFER",
    "k1xRoamingHome",   "kSystemId",
    "kNetworkId",       "kPacketZoneId",
    "kBaseId",          "kProtocolRevision",
    "kFLDataRate",      "kRLDataRate",
};

/// A display variable, written as its name. A wrong name does not compile.
class Variable {
 public:
  consteval Variable(const char* name) : _index(indexOf(name)) {}
  /// Its index among the names.
  constexpr std::size_t index() const { return _index; }
  constexpr std::string_view name() const { return variableNames[_index]; }

 private:
  static consteval std::uint8_t indexOf(std::string_view name) {
    const auto* const found = std::ranges::find(variableNames, name);
    if (found == std::end(variableNames)) throw "there is no such display variable";
    return static_cast<std::uint8_t>(found - variableNames);
  }

  std::uint8_t _index;
};

/// A field of a packet that is published under a variable.
struct VariableField {
  Source source;
  Variable variable;
  Format format = integer();
};

/// A variable, and one of its formats for numbers.
struct VariableFormat {
  Variable variable;
  Format format;
};

/// For static_assert: does not compile when a field reads past this many bytes.
consteval bool within(std::span<const VariableField> fields, std::size_t size) {
  for (const VariableField& field : fields)
    if (field.source.end() > size) throw "a field lies past the minimum length";
  return true;
}

/// The places of each variable, from a lookup. It finds them only once, since a lookup does not change after
/// the template has filled it.
class Lookup {
 public:
  struct Place {
    Dictionary* section;
    BoundEntry entry;
  };

  /// Without an argument, or with a value that is no dictionary, there are no places.
  Lookup() = default;
  explicit Lookup(const Value& placements);

  /// Whether it was made from this dictionary.
  bool isMadeFrom(const Value& placements) const {
    return _placements.dictionary() == placements.dictionary();
  }
  /// The places in their order, up to the first invalid placement.
  std::span<Place> places(Variable variable) { return _places[variable.index()]; }
  /// The time of the packets that are decoded from now on.
  void setTime(const Time& now) { _now = now; }
  const Time& time() const { return _now; }
  /// When a packet last wrote the entry; absent when none did.
  std::optional<Time> writtenAt(const Dictionary& section, std::string_view key) const;
  /// A dictionary to fill and to publish: the one that the variable shows, if nothing else refers to it, else
  /// a new one.
  Value dictionaryFor(Variable variable);

 private:
  Value _placements;  // keeps the sections alive
  Time _now;
  std::array<std::vector<Place>, std::size(variableNames)> _places;
};

/// Adds a placement of the variable: an entry of a section, which is a dictionary.
void addPlacement(Dictionary& placements, std::string_view variable, std::string_view key,
                  const Value& section);

/// Shows a value in every place of its variable. Does nothing when the lookup does not have the variable.
void storeDisplayValue(Variable variable, const Value& value, Lookup& lookup);
/// The same for a text, which reuses the memory of the old text.
void storeDisplayText(Variable variable, std::string_view text, Lookup& lookup);
/// The same for a computed number, in a format made by `real`.
void storeDisplayNumber(Variable variable, const Format& format, double number, Lookup& lookup);
/// Publishes the fields of a packet in the order of the table.
void storeDisplayFields(const Packet& packet, std::span<const VariableField> fields, Lookup& lookup);

}  // namespace varnel::c2k

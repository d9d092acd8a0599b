#include "app/RecordIdentity.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <optional>
#include <unordered_map>

namespace varnel {

namespace {

// In the order in which an identity names them.
enum class Part : std::size_t {
  Radio,
  Channel,
  FrequencyAsChannel,  // where a record has no channel
  Band,                // of a channel number that several bands have
  Cell,
  NetworkColor,
  StationColor,
  CellNumber,  // where a record has no other cell
  ServingCell,
  Other,
  Timeslot,
};
constexpr std::size_t partCount = 11;

struct Naming {
  Part part;
  std::string_view name;  // in identities
};

// The entries of all lists. Lists of one radio name an entry differently; an identity does not.
const std::unordered_map<std::string_view, Naming>& namings() {
  static const std::unordered_map<std::string_view, Naming> all = {
      {"Candidate RAT Type", {Part::Radio, ""}},
      {"EARFCN", {Part::Channel, "EARFCN"}},
      {"E-ARFCN", {Part::Channel, "EARFCN"}},
      {"E ARFCN", {Part::Channel, "EARFCN"}},
      {"NR-ARFCN", {Part::Channel, "NR-ARFCN"}},
      {"UARFCN", {Part::Channel, "UARFCN"}},
      {"U ARFCN", {Part::Channel, "UARFCN"}},
      {"ARFCN", {Part::Channel, "ARFCN"}},
      {"Channel", {Part::Channel, "Channel"}},
      {"Downlink Frequency", {Part::FrequencyAsChannel, "UARFCN"}},
      {"Band", {Part::Band, "Band"}},
      {"Band Indicator", {Part::Band, "Band"}},
      {"Physical Cell ID", {Part::Cell, "PCI"}},
      {"Scrambling Code", {Part::Cell, "PSC"}},
      {"PSC", {Part::Cell, "PSC"}},
      {"BSIC", {Part::Cell, "BSIC"}},
      {"BSIC ID", {Part::Cell, "BSIC"}},
      {"PN", {Part::Cell, "PN"}},
      {"Pilot", {Part::Cell, "PN"}},
      {"NCC", {Part::NetworkColor, "NCC"}},
      {"BCC", {Part::StationColor, "BCC"}},
      {"Cell ID", {Part::CellNumber, "Cell"}},
      {"Serving Cell", {Part::ServingCell, "Serving PCI"}},
      {"Bearer ID", {Part::Other, "Bearer"}},
      {"Context ID", {Part::Other, "Context"}},
      {"Transport Channel ID", {Part::Other, "Transport Channel"}},
      {"TRCH ID", {Part::Other, "TrCH"}},
      {"CCTRCH ID", {Part::Other, "CCTrCH"}},
      {"Process ID", {Part::Other, "Process"}},
      {"SSB", {Part::Other, "SSB"}},
      {"TSNUM", {Part::Timeslot, "Timeslot"}},
  };
  return all;
}

// Where the channel of a list's records stands that do not tell it themselves.
struct ChannelPlace {
  std::string_view list, section;
};
constexpr ChannelPlace channelPlaces[] = {
    {"Neighbor Cells List", "Neighbor Measurements"},
    {"Measured Neighbor Cells", "Connected mode LTE Intra-frequency Measurement"},
    {"Detected Cells", "Connected mode LTE Intra-frequency Measurement"},
    {"Active Set", "UMTS RR Info"},
};

// Many messages come from one cell, and a message has no course.
constexpr std::string_view listOfMessages = "Messages";
// The slots of a channel.
constexpr std::string_view listOfPlaces = "SIR";

constexpr std::string_view codeIsValidEntry = "BSIC Valid", no = "0";

struct Found {
  std::string_view name, value;
  bool isThere() const { return !value.empty(); }
};

class Parts {
 public:
  void readFrom(const VarnelModelNode& record) {
    if (!record.childNodes()) return;
    for (const auto& child : *record.childNodes()) {
      const std::string* const value = child->value();
      if (!value || value->empty()) continue;
      if (child->displayName() == codeIsValidEntry && *value == no) _hasNoCode = true;
      const auto naming = namings().find(child->displayName());
      if (naming == namings().end()) continue;
      Found& found = at(naming->second.part);
      if (!found.isThere()) found = {naming->second.name, *value};
    }
  }

  void leaveOutWhatIsNotNeeded() {
    if (_hasNoCode) at(Part::NetworkColor) = at(Part::StationColor) = {};
    if (!isNumber(at(Part::FrequencyAsChannel).value) || at(Part::Channel).isThere())
      at(Part::FrequencyAsChannel) = {};
    const std::string_view channel = at(Part::Channel).name;
    if (channel != "ARFCN" && channel != "Channel") at(Part::Band) = {};
    if (at(Part::Cell).isThere() || at(Part::NetworkColor).isThere()) at(Part::CellNumber) = {};
    // A cell has a number; the beam of a channel's serving cell is a value of the channel.
    if (at(Part::ServingCell).isThere() || at(Part::Channel).name == "NR-ARFCN") at(Part::Other) = {};
  }

  bool hasChannel() const { return at(Part::Channel).isThere() || at(Part::FrequencyAsChannel).isThere(); }
  void takeChannelOf(const Parts& others) {
    at(Part::Channel) = others.at(Part::Channel);
    at(Part::FrequencyAsChannel) = others.at(Part::FrequencyAsChannel);
  }

  enum class ServingCell { LeftOut, Named };
  std::string text(ServingCell servingCell) const {
    std::string text;
    for (std::size_t i = 0; i < partCount; ++i) {
      const Found& found = _found[i];
      if (!found.isThere()) continue;
      if (Part(i) == Part::ServingCell && servingCell == ServingCell::LeftOut) continue;
      if (!text.empty()) text += ", ";
      text += found.name;
      if (!found.name.empty()) text += ' ';
      text += found.value;
    }
    return text;
  }

 private:
  static bool isNumber(std::string_view text) {
    return std::ranges::all_of(text, [](char c) { return (c >= '0' && c <= '9') || c == '-'; });
  }
  Found& at(Part part) { return _found[static_cast<std::size_t>(part)]; }
  const Found& at(Part part) const { return _found[static_cast<std::size_t>(part)]; }

  std::array<Found, partCount> _found{};
  bool _hasNoCode = false;
};

std::optional<Parts> channelBeside(const VarnelModelNode& list, const VarnelModelNode& around) {
  const auto place = std::ranges::find(channelPlaces, list.displayName(), &ChannelPlace::list);
  if (place == std::end(channelPlaces) || !around.childNodes()) return std::nullopt;
  for (const auto& section : *around.childNodes()) {
    if (section->displayName() != place->section) continue;
    Parts parts;
    parts.readFrom(*section);
    parts.leaveOutWhatIsNotNeeded();
    return parts;
  }
  return std::nullopt;
}

}  // namespace

RecordIdentity identityOfRecord(const VarnelModelNode& record, const VarnelModelNode& list,
                                const VarnelModelNode& around) {
  if (list.displayName() == listOfMessages) return {};
  Parts parts;
  parts.readFrom(record);
  parts.leaveOutWhatIsNotNeeded();
  if (parts.text(Parts::ServingCell::LeftOut).empty()) return {};
  if (!parts.hasChannel()) {
    if (const auto beside = channelBeside(list, around)) parts.takeChannelOf(*beside);
  }
  return {parts.text(Parts::ServingCell::LeftOut), parts.text(Parts::ServingCell::Named)};
}

bool placesAreIdentities(std::string_view list) { return list == listOfPlaces; }

}  // namespace varnel

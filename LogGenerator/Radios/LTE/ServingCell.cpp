#include "LogGenerator/Radios/LTE/ServingCell.h"

#include <algorithm>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/PacketVersion.h"
#include "LogGenerator/Radios/ChannelText.h"
#include "LogGenerator/Radios/Plmn.h"
#include "LogGenerator/Radios/ShownNumber.h"
#include "base/Dictionary.h"
#include "platform/TelephonyService.h"

namespace varnel::lte {

namespace {

constexpr std::string_view physicalCellEntry = "Physical Cell ID", channelEntry = "EARFCN",
                           frequencyEntry = "Downlink Frequency", uplinkChannelEntry = "Uplink EARFCN",
                           uplinkFrequencyEntry = "Uplink Frequency", bandEntry = "Band",
                           bandwidthEntry = "Downlink Bandwidth", uplinkBandwidthEntry = "Uplink Bandwidth",
                           networkEntry = "PLMN", areaEntry = "Tracking Area Code",
                           identityEntry = "Cell Identity", basestationEntry = "eNB", sectorEntry = "Cell",
                           antennasEntry = "Antennas", frameEntry = "System Frame Number",
                           accessEntry = "Allowed Access", modeEntry = "Operation Mode",
                           rasterEntry = "Raster Offset", barringEntry = "Access Barring";
constexpr Format channelNumber = integer("%u");

// ---- The master information block ----

constexpr Field masterInformation1[] = {
    {u16(1), physicalCellEntry},
    {u16(3), channelEntry},
    {u16(5), frameEntry},
    {u8(7), antennasEntry},
    {u8(8), bandwidthEntry, channels::lteBandwidthFormat},
};
constexpr Field masterInformation2[] = {
    {u16(1), physicalCellEntry},
    {u32(3), channelEntry, channelNumber},
    {u16(7), frameEntry},
    {u8(9), antennasEntry},
    {u8(10), bandwidthEntry, channels::lteBandwidthFormat},
};
constexpr std::size_t masterInformation3Size = 12;  // as 2, then a schedule that is not shown

// Narrow-band IoT.
constexpr std::string_view operationModes[] = {"In-band, other PCI", "In-band, same PCI", "Guard band",
                                               "Stand-alone"};
constexpr std::string_view rasterOffsets[] = {"-7.5 kHz", "-2.5 kHz", "2.5 kHz", "7.5 kHz"};
constexpr Format rasterOffset = real("%.1f kHz");
constexpr Field masterInformation17[] = {
    {u16(1), physicalCellEntry},
    {u32(3), channelEntry, channelNumber},
    {u16(7), frameEntry},
    {u8(13), barringEntry},
    {u8(14), modeEntry, entry(operationModes)},
    {u16(15), rasterEntry, entry(rasterOffsets)},
    {u8(17), antennasEntry},
};

// ---- The serving cell ----

// Bits of the cell identity: the upper 20 of 28 are those of the base station.
constexpr Field servingCell2[] = {
    {u16(1), physicalCellEntry},
    {u16(3), channelEntry},
    {u16(5), uplinkChannelEntry},
    {u8(7), bandwidthEntry, channels::lteBandwidthFormat},
    {u8(8), uplinkBandwidthEntry, channels::lteBandwidthFormat},
    {bits(9, 0, 28), identityEntry},
    {bits(10, 0, 20), basestationEntry},
    {u8(9), sectorEntry},
    {u16(13), areaEntry},
    {u32(15), bandEntry, integer("%u")},
    {u8(24), accessEntry},
};
constexpr Field servingCell3[] = {
    {u16(1), physicalCellEntry},
    {u32(3), channelEntry, channelNumber},
    {u32(7), uplinkChannelEntry, channelNumber},
    {u8(11), bandwidthEntry, channels::lteBandwidthFormat},
    {u8(12), uplinkBandwidthEntry, channels::lteBandwidthFormat},
    {bits(13, 0, 28), identityEntry},
    {bits(14, 0, 20), basestationEntry},
    {u8(13), sectorEntry},
    {u16(17), areaEntry},
    {u32(19), bandEntry, integer("%u")},
    {u8(28), accessEntry},
};
// Country code (2), number of digits of the network code (1), network code (2).
constexpr std::size_t network2 = 19, network3 = 23;

// ---- Showing them ----

consteval Source sourceOf(std::span<const Field> fields, std::string_view label) {
  for (const Field& field : fields)
    if (field.label == label) return field.source;
  throw "the table has no such entry";
}
consteval bool tells(std::span<const Field> fields, std::string_view label) {
  return std::ranges::find(fields, label, &Field::label) != fields.end();
}

// What tells one cell from another. A channel can have several cells, and a base station may give all of its
// channels the same physical cell.
struct Identity {
  std::optional<std::uint32_t> physicalCell, earfcn, cell;
};

// Whether the section's rows are about this cell. Where nothing tells, they are not.
bool shows(const Section& section, const Identity& identity) {
  enum class Answer { Unknown, Same, Other };
  const auto compare = [&](std::string_view entry, std::optional<std::uint32_t> number) {
    const auto shown = numberShown(section, entry);
    if (!number || !shown) return Answer::Unknown;
    return *shown == *number ? Answer::Same : Answer::Other;
  };
  const Answer physicalCell = compare(physicalCellEntry, identity.physicalCell);
  const Answer channel = compare(channelEntry, identity.earfcn);
  const Answer cell = compare(identityEntry, identity.cell);
  if (physicalCell == Answer::Other || channel == Answer::Other || cell == Answer::Other) return false;
  return cell == Answer::Same || (physicalCell == Answer::Same && channel == Answer::Same);
}

// What is known of another cell says nothing about this one.
void forgetOtherCell(Section& section, const Identity& identity) {
  const Dictionary* const entries = section.container().dictionary();
  if (!entries || shows(section, identity)) return;
  for (const auto& [key, value] : *entries) {
    const std::string* const text = value.string();
    if (text && !text->empty() && key != versionEntry) section.setText(key, {});
  }
}

// The fields, and the frequency of their channel number. Returns this number.
template <const auto& fields>
std::uint32_t showFields(Section& section, const Packet& body) {
  constexpr Source physicalCell = sourceOf(fields, physicalCellEntry);
  constexpr Source channel = sourceOf(fields, channelEntry);
  const std::uint32_t earfcn = rawValue(body, channel);
  Identity identity{rawValue(body, physicalCell), earfcn, std::nullopt};
  if constexpr (tells(fields, identityEntry)) {
    constexpr Source cell = sourceOf(fields, identityEntry);
    identity.cell = rawValue(body, cell);
  }
  forgetOtherCell(section, identity);
  section.show(body, fields);
  section.setText(frequencyEntry, channels::lteDownlinkFrequency(earfcn));
  return earfcn;
}

template <const auto& fields>
void showMasterInformation(Section& section, const Packet& body) {
  const std::uint32_t earfcn = showFields<fields>(section, body);
  section.setText(bandEntry, channels::lteBand(earfcn));
}

template <const auto& fields, std::size_t network>
void showServingCell(Section& section, const Packet& body) {
  constexpr Source uplinkChannel = sourceOf(fields, uplinkChannelEntry);
  showFields<fields>(section, body);
  section.setText(uplinkFrequencyEntry, channels::lteUplinkFrequency(rawValue(body, uplinkChannel)));
  section.setText(networkEntry, plmnText(body.u16(network), body.u16(network + 3), body.u8(network + 2)));
}

constexpr PacketLayout layouts[] = {
    {0xB0C1, 1, extent(masterInformation1), showMasterInformation<masterInformation1>},
    {0xB0C1, 2, extent(masterInformation2), showMasterInformation<masterInformation2>},
    {0xB0C1, 3, masterInformation3Size, showMasterInformation<masterInformation2>},
    {0xB0C1, 17, extent(masterInformation17), showMasterInformation<masterInformation17>},
    {0xB0C2, 2, extent(servingCell2), showServingCell<servingCell2, network2>},
    {0xB0C2, 3, extent(servingCell3), showServingCell<servingCell3, network3>},
};

// ---- The cell monitor ----

std::optional<std::uint32_t> numberOf(const Dictionary& cell, std::string_view key) {
  const auto number = cell.get(key).int32();
  if (!number || *number < 0) return std::nullopt;
  return static_cast<std::uint32_t>(*number);
}

void showNumber(Section& section, std::string_view entry, std::optional<std::uint32_t> number) {
  if (number) section.setText(entry, std::to_string(*number));
}

// The cell monitor tells the network's code as a number, so a leading 0 of three digits is not in it. Another
// source may have told them.
void showNetwork(Section& section, const Dictionary& cell, const std::string& shownBefore) {
  const auto country = numberOf(cell, cellMonitor::mcc), network = numberOf(cell, cellMonitor::mnc);
  if (!country || !network) return;
  const std::string ofThreeDigits = plmnText(*country, *network, 3);
  const bool hasTwoDigits = *network < 100 && shownBefore != ofThreeDigits;
  section.setText(networkEntry, hasTwoDigits ? plmnText(*country, *network, 2) : ofThreeDigits);
}

void showMonitoredCell(Section& section, const Dictionary& cell) {
  const Identity identity{numberOf(cell, cellMonitor::physicalCellIdentity),
                          numberOf(cell, cellMonitor::uarfcn), numberOf(cell, cellMonitor::cellIdentity)};
  const std::string networkBefore(textShown(section, networkEntry));
  forgetOtherCell(section, identity);
  showNumber(section, physicalCellEntry, identity.physicalCell);
  showNumber(section, channelEntry, identity.earfcn);
  if (identity.earfcn) section.setText(frequencyEntry, channels::lteDownlinkFrequency(*identity.earfcn));
  showNumber(section, bandEntry, numberOf(cell, cellMonitor::bandInfo));
  showNumber(section, areaEntry, numberOf(cell, cellMonitor::trackingAreaCode));
  if (identity.cell) {
    showNumber(section, identityEntry, identity.cell);
    showNumber(section, basestationEntry, *identity.cell >> 8);
    showNumber(section, sectorEntry, *identity.cell & 0xFF);
  }
  showNetwork(section, cell, networkBefore);
}

// "310-012" of "310-12"; empty for a code of three digits.
std::string withThreeDigits(std::string_view network) {
  constexpr std::size_t sizeWithTwoDigits = std::string_view("310-12").size(), country = 3;
  if (network.size() != sizeWithTwoDigits) return {};
  return std::string(network.substr(0, country)) + "-0" + std::string(network.substr(country + 1));
}

}  // namespace

ServingCell::ServingCell() : VersionedDecoder("Serving Cell", layouts), _cellMonitor(_ownCellMonitor) {}

ServingCell::ServingCell(CellMonitorReader& cellMonitor, const modem::ReportReader& modemReports)
    : VersionedDecoder("Serving Cell", layouts), _cellMonitor(cellMonitor), _modemReports(&modemReports) {}

void ServingCell::listNumberFormats(SectionFormats& formats) const {
  formats.add(frequencyEntry, channels::frequencyFormat);
  formats.add(uplinkFrequencyEntry, channels::frequencyFormat);
  formats.add(bandwidthEntry, channels::bandwidthFormat);
  formats.add(uplinkBandwidthEntry, channels::bandwidthFormat);
  formats.add(rasterEntry, rasterOffset);
}

std::vector<std::uint32_t> ServingCell::otherLogCodes() const { return {cellMonitorLogCode}; }

void ServingCell::updateWithOther(const Packet& packet, std::uint32_t /*logCode*/) {
  const Array* const cells = _cellMonitor.read(packet);
  if (!cells) return;
  const Dictionary* const cell = firstCellOfKind(*cells, cellMonitor::lte, cellMonitor::serving);
  if (cell) showMonitoredCell(sectionRef, *cell);
}

void ServingCell::prepareDisplay(const Time& /*now*/) {
  const std::string whole = withThreeDigits(textShown(sectionRef, networkEntry));
  if (whole.empty() || !_modemReports) return;
  const auto report = _modemReports->last();
  if (report && report->isKnown && modem::network(*report->entries) == whole)
    sectionRef.setText(networkEntry, whole);
}

}  // namespace varnel::lte

#include "LogGenerator/KLV/GSMUMTS/ServingPLMN.h"

#include <array>

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/MobilityManagement.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::string_view selectionModes[] = {
    "Automatic", "Manual", "Limited", "LIMITED_ROUTINE_ACQ", "LIMITED_MANUAL_ACQ",
};
constexpr Field selectionMode[] = {
    {registration::selectionMode, "PLMN Sel Mod", entry(selectionModes)},
};

constexpr std::string_view serviceTypes[] = {
    "NO_SERVICE", "CS_ONLY", "PS_ONLY", "CS_PS_SERVICE", "LIMITED_SERVICE",
};
constexpr Field areaAndService[] = {
    {networkIdentity::rac, "Routing Area Code"},
    {networkIdentity::serviceType, "Service Type", entry(serviceTypes)},
};
static_assert(extent(areaAndService) <= networkIdentity::minimumSize);

constexpr std::string_view countryEntry = "Mobile Country Code";
constexpr std::string_view networkEntry = "Mobile Network Code";
constexpr std::string_view areaEntry = "Location Area Code";

constexpr CellMonitorEntry cellMonitorEntries[] = {
    {cellMonitor::mcc, countryEntry, "ServingPLMN: Failed to retrieve MCC\n"},
    {cellMonitor::mnc, networkEntry, "ServingPLMN: Failed to retrieve MNC\n"},
    {cellMonitor::lac, areaEntry, "ServingPLMN: Failed to retrieve LAC\n"},
};

// A binary-coded digit. Any other nibble, such as the filler of a two-digit network code, becomes a blank.
char digit(std::uint32_t nibble) { return nibble < 10 ? static_cast<char>('0' + nibble) : ' '; }

void setDigits(Section& section, std::string_view entry, std::array<std::uint32_t, 3> nibbles) {
  const std::array text = {digit(nibbles[0]), digit(nibbles[1]), digit(nibbles[2])};
  section.setText(entry, {text.data(), text.size()});
}

// The first serving cell of GSM or UMTS.
const Dictionary* servingCell(const Array& records) {
  for (const Value& record : records) {
    for (const std::string_view access : {cellMonitor::umts, cellMonitor::gsm}) {
      if (const Dictionary* cell = cellOfKind(record, access, cellMonitor::serving)) return cell;
    }
  }
  return nullptr;
}

void showIdentity(Section& section, const Packet& packet) {
  const auto nibble = [&](std::size_t byte, unsigned firstBit) {
    return packet.bits(networkIdentity::plmn + byte, firstBit, 4);
  };
  setDigits(section, countryEntry, {nibble(0, 0), nibble(0, 4), nibble(1, 0)});
  setDigits(section, networkEntry, {nibble(2, 0), nibble(2, 4), nibble(1, 4)});
  const std::int32_t lac = packet.u8(networkIdentity::lac) << 8 | packet.u8(networkIdentity::lac + 1);
  section.setInteger(areaEntry, integer(), lac);
  section.show(packet, areaAndService);
}

}  // namespace

constinit const PacketHandler ServingPLMN::packets[] = {
    {networkIdentity::logCode, networkIdentity::minimumSize, showIdentity},
    {registration::logCode, registration::minimumSize, selectionMode},
    {cellMonitorLogCode, 0, calling<&ServingPLMN::updateFromCellMonitor>},
};

ServingPLMN::ServingPLMN(CellMonitorReader& cellMonitor)
    : SectionDecoder("Serving PLMN", "Serving PLMN", packets), _cellMonitor(cellMonitor) {}

void ServingPLMN::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  if (!records) return;
  if (const Dictionary* cell = servingCell(*records)) showCell(sectionRef, *cell, cellMonitorEntries);
}

}  // namespace varnel

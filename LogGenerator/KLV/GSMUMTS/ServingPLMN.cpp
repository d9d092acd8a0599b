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
static_assert(within(selectionMode, registration::minimumSize));

constexpr std::string_view serviceTypes[] = {
    "NO_SERVICE", "CS_ONLY", "PS_ONLY", "CS_PS_SERVICE", "LIMITED_SERVICE",
};
constexpr Field areaAndService[] = {
    {networkIdentity::rac, "Routing Area Code"},
    {networkIdentity::serviceType, "Service Type", entry(serviceTypes)},
};
static_assert(within(areaAndService, networkIdentity::minimumSize));

constexpr std::string_view countryRow = "Mobile Country Code";
constexpr std::string_view networkRow = "Mobile Network Code";
constexpr std::string_view areaRow = "Location Area Code";

constexpr CellMonitorRow cellMonitorRows[] = {
    {cellMonitor::mcc, countryRow, "ServingPLMN: Failed to retrieve MCC\n"},
    {cellMonitor::mnc, networkRow, "ServingPLMN: Failed to retrieve MNC\n"},
    {cellMonitor::lac, areaRow, "ServingPLMN: Failed to retrieve LAC\n"},
};

// A binary-coded digit; what is none, such as the filler of a two-digit network code, is a blank.
char digit(std::uint32_t nibble) { return nibble < 10 ? static_cast<char>('0' + nibble) : ' '; }

void setDigits(Dictionary& section, std::string_view label, std::array<std::uint32_t, 3> nibbles) {
  const std::array text = {digit(nibbles[0]), digit(nibbles[1]), digit(nibbles[2])};
  section.setText(label, {text.data(), text.size()});
}

// The first serving cell of either technology.
const Dictionary* servingCell(const Array& records) {
  for (const Value& record : records) {
    for (const std::string_view access : {cellMonitor::umts, cellMonitor::gsm}) {
      if (const Dictionary* cell = cellOfKind(record, access, cellMonitor::serving)) return cell;
    }
  }
  return nullptr;
}

}  // namespace

constinit const PacketHandlers<ServingPLMN> ServingPLMN::handlers = {
    {networkIdentity::logCode, networkIdentity::minimumSize, &ServingPLMN::updateIdentity},
    {registration::logCode, registration::minimumSize, &ServingPLMN::updateSelectionMode},
    {cellMonitorLogCode, 0, &ServingPLMN::updateFromCellMonitor},
};

void ServingPLMN::updateIdentity(const Packet& packet) {
  const auto nibble = [&](std::size_t byte, unsigned firstBit) {
    return packet.bits(networkIdentity::plmn + byte, firstBit, 4);
  };
  setDigits(rows(), countryRow, {nibble(0, 0), nibble(0, 4), nibble(1, 0)});
  setDigits(rows(), networkRow, {nibble(2, 0), nibble(2, 4), nibble(1, 4)});
  const std::int32_t lac = packet.u8(networkIdentity::lac) << 8 | packet.u8(networkIdentity::lac + 1);
  setInteger(rows(), areaRow, integer(), lac);
  setFields(rows(), packet, areaAndService);
}

void ServingPLMN::updateSelectionMode(const Packet& packet) { setFields(rows(), packet, selectionMode); }

void ServingPLMN::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  if (!records) return;
  if (const Dictionary* cell = servingCell(*records)) showCellMonitorRows(rows(), *cell, cellMonitorRows);
}

}  // namespace varnel

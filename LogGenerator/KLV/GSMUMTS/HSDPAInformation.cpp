#include "LogGenerator/KLV/GSMUMTS/HSDPAInformation.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::size_t minimumSize = 18;
constexpr std::size_t primaryCountOffset = 16;
constexpr std::size_t secondaryCountOffset = 17;
constexpr std::size_t firstPrimary = minimumSize;
constexpr std::size_t processSize = 9;
// Kept: each primary process counts as 18 records.
constexpr std::size_t primaryStride = 18 * processSize;

constexpr Format number = integer("%u");
constexpr std::string_view carriers[] = {"Single Carrier", "MIMO", "Dual Carrier", "Reserved"};
constexpr Field configuration[] = {
    {u8(13), "Version", number},
    {bits(14, 0, 10), "Sub Frames", number},
    {bits(15, 2, 2), "Carrier Info", entry(carriers)},
};
static_assert(extent(configuration) <= minimumSize);

// A process of the hybrid automatic repeat request (HARQ).
constexpr Field process[] = {
    {u8(0), "Process ID", number},
    {u32(1), "No Rx Bits", number},
    {u16(5), "New Tx", number},
    {u16(7), "Block Errors", number},
};
static_assert(extent(process) == processSize);

void showProcesses(Section& section, std::string_view label, const Packet& packet, const Records& records) {
  if (records.count == 0) return;  // the old list stays
  Array processes;
  addRecords(processes, packet, records, process);
  section.set(label, Value::ofArray(std::move(processes)));
}

void update(Section& section, const Packet& packet) {
  section.show(packet, configuration);
  const std::size_t primaryCount = packet.u8(primaryCountOffset);
  const std::size_t firstSecondary = firstPrimary + primaryStride * primaryCount;
  const std::size_t secondaryCount = packet.u8(secondaryCountOffset);
  showProcesses(section, "Primary HARQ Process", packet, {firstPrimary, processSize, primaryCount});
  showProcesses(section, "Secondary HARQ Process", packet, {firstSecondary, processSize, secondaryCount});
}

constexpr PacketHandler packets[] = {
    {0x4221, minimumSize, update},
};

}  // namespace

HSDPAInformation::HSDPAInformation()
    : SectionDecoder("HSDPA Info", "HSDPA Info", packets, UnknownCodes::Ignored) {}

}  // namespace varnel

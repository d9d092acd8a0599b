#include "LogGenerator/KLV/GSMUMTS/HSDPAInformation.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::uint32_t logCode = 0x4221;
constexpr std::size_t minimumSize = 18;
constexpr std::size_t primaryCountOffset = 16;
constexpr std::size_t secondaryCountOffset = 17;
constexpr std::size_t firstPrimary = minimumSize;
constexpr std::size_t processSize = 9;
// Kept: as if each primary process took 18 records.
constexpr std::size_t primaryStride = 18 * processSize;

constexpr Format number = integer("%u");
constexpr std::string_view carriers[] = {"Single Carrier", "MIMO", "Dual Carrier", "Reserved"};
constexpr Field configuration[] = {
    {u8(13), "Version", number},
    {bits(14, 0, 10), "Sub Frames", number},
    {bits(15, 2, 2), "Carrier Info", entry(carriers)},
};
static_assert(within(configuration, minimumSize));

// A process of the hybrid automatic repeat request (HARQ).
constexpr Field process[] = {
    {u8(0), "Process ID", number},
    {u32(1), "No Rx Bits", number},
    {u16(5), "New Tx", number},
    {u16(7), "Block Errors", number},
};
static_assert(extent(process) == processSize);

void showProcesses(Dictionary& section, std::string_view label, const Packet& packet,
                   const Records& records) {
  // A count of 0 leaves what was there.
  if (records.count > 0) section.set(label, Value::ofArray(recordRows(packet, records, process)));
}

}  // namespace

constinit const PacketHandlers<HSDPAInformation> HSDPAInformation::handlers = {
    {logCode, minimumSize, &HSDPAInformation::update},
};

void HSDPAInformation::update(const Packet& packet) {
  setFields(rows(), packet, configuration);
  const std::size_t primaryCount = packet.u8(primaryCountOffset);
  const std::size_t firstSecondary = firstPrimary + primaryStride * primaryCount;
  const std::size_t secondaryCount = packet.u8(secondaryCountOffset);
  showProcesses(rows(), "Primary HARQ Process", packet, {firstPrimary, processSize, primaryCount});
  showProcesses(rows(), "Secondary HARQ Process", packet, {firstSecondary, processSize, secondaryCount});
}

}  // namespace varnel

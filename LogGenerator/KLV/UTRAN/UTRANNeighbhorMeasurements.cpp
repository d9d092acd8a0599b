#include "LogGenerator/KLV/UTRAN/UTRANNeighbhorMeasurements.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

// Kept: the records always start here, whatever their number.
constexpr std::size_t firstRecord = 168;
constexpr std::size_t recordSize = 16;

constexpr std::string_view membershipEntry = "Status";
constexpr Choice memberships[] = {{0, "ASET"}, {1, "MSET"}, {2, "DSET"}};
constexpr Choice truth[] = {{0, "FALSE"}};

constexpr Field cell[] = {
    {bits(0, 0, 14), "UARFCN"},
    {bits(1, 6, 7), "Cell ID"},
    {bits(2, 5, 8), "Filter RSCP", real("%f", 1.0 / 256)},
    {bits(3, 5, 2), membershipEntry, choice(memberships, "")},
    {bits(3, 7, 1), "inJDCS", choice(truth, "TRUE")},
};
static_assert(extent(cell) <= recordSize);

void update(Section& section, const Packet& packet) {
  const std::uint32_t count = packet.bits(16, 1, 7);
  section.refill([&](Array& cells) {
    addRecords(cells, packet, {firstRecord, recordSize, count}, cell);
    for (const Value& record : cells) {
      // A cell of an unknown set has no status.
      if (record.dictionary()->get(membershipEntry).string()->empty())
        record.dictionary()->remove(membershipEntry);
    }
  });
}

constexpr PacketHandler packets[] = {
    {0xD00A, 21, update},
};

}  // namespace

// Kept: "Neighbhor" in the trace line has an h too many.
UTRANNeighbhorMeasurements::UTRANNeighbhorMeasurements()
    : SectionDecoder("Neighbor Cell List", "NeighbhorMeasurements List", packets, UnknownCodes::Ignored) {}

}  // namespace varnel

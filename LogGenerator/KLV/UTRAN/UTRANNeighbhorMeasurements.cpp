#include "LogGenerator/KLV/UTRAN/UTRANNeighbhorMeasurements.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::uint32_t logCode = 0xD00A;
constexpr std::size_t minimumSize = 21;
// Kept: the records start here, however many there are.
constexpr std::size_t firstRecord = 168;
constexpr std::size_t recordSize = 16;

constexpr std::string_view membershipRow = "Status";
constexpr Choice memberships[] = {{0, "ASET"}, {1, "MSET"}, {2, "DSET"}};
constexpr Choice truth[] = {{0, "FALSE"}};

constexpr Field cell[] = {
    {bits(0, 0, 14), "UARFCN"},
    {bits(1, 6, 7), "Cell ID"},
    {bits(2, 5, 8), "Filter RSCP", real("%f", 1.0 / 256)},
    {bits(3, 5, 2), membershipRow, choice(memberships, "")},
    {bits(3, 7, 1), "inJDCS", choice(truth, "TRUE")},
};
static_assert(within(cell, recordSize));

}  // namespace

constinit const PacketHandlers<UTRANNeighbhorMeasurements> UTRANNeighbhorMeasurements::handlers = {
    {logCode, minimumSize, &UTRANNeighbhorMeasurements::update},
};

void UTRANNeighbhorMeasurements::update(const Packet& packet) {
  clearElementsInArray(list());
  const std::uint32_t count = packet.bits(16, 1, 7);
  Array cells = recordRows(packet, {firstRecord, recordSize, count}, cell);
  for (const Value& row : cells) {
    // A cell of no known set has no such row.
    if (row.dictionary()->get(membershipRow).string()->empty()) row.dictionary()->remove(membershipRow);
  }
  replaceArray_With(list(), std::move(cells));
}

}  // namespace varnel

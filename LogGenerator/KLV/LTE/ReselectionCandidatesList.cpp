#include "LogGenerator/KLV/LTE/ReselectionCandidatesList.h"

#include <algorithm>

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidates.h"

namespace varnel {

namespace {

constexpr std::size_t countOffset = 19;
constexpr std::size_t recordStride = 4;
constexpr std::size_t typeOffset = 2;

constexpr Choice types[] = {{0, "LTE"}, {1, "UTRAN"}, {2, "GERAN"}, {3, "CDMA1XRTT"}, {4, "CDMAHRPD"}};

// The first fields of every candidate.
constexpr Field candidate[] = {
    {u16(0), "Candidate Priority"},
    {u16(typeOffset), "Candidate RAT Type", choice(types, "??")},
};
constexpr Field lteCell[] = {
    {u16(4), "E ARFCN"},
    {bits(6, 7, 9), "Cell ID"},
};
constexpr Field utranCell[] = {
    {u16(4), "U ARFCN"},
    {u16(6), "PSC"},
};
constexpr Field geranCell[] = {
    {u16(4), "ARFCN"},
    {u8(6), "Band"},
    {u8(7), "BSIC ID"},
};
constexpr Field cdmaCell[] = {
    {u8(4), "Band"},
    {u16(8), "Channel"},
    {u16(10), "Pilot"},
};

// The other fields of a candidate, which depend on its radio access technology.
struct Cell {
  std::span<const Field> fields;
  std::size_t size;
};
constexpr Cell cells[] = {
    {lteCell, extent(lteCell)},   {utranCell, extent(utranCell)}, {geranCell, extent(geranCell)},
    {cdmaCell, extent(cdmaCell)}, {cdmaCell, extent(cdmaCell)},
};

void update(Section& section, const Packet& packet) {
  section.refill([&](Array& candidates) {
    // Kept: only the low byte of the count is read.
    const std::uint8_t count = packet.u8(countOffset);
    for (std::size_t i = 0; i < count; ++i) {
      // Kept: a record starts every 4 bytes, but records are longer, so they overlap.
      const Packet source = packet.from(reselectionCandidates::minimumSize + recordStride * i);
      const std::uint16_t type = source.u16(typeOffset);
      const Cell cell = type < std::size(cells) ? cells[type] : Cell{};
      if (!source.holds(0, std::max(extent(candidate), cell.size))) continue;
      const Value& record = candidates.emplace_back(recordOf(source, candidate));
      setFields(*record.dictionary(), source, cell.fields);
    }
  });
}

constexpr PacketHandler packets[] = {
    {reselectionCandidates::logCode, reselectionCandidates::minimumSize, update},
};

}  // namespace

ReselectionCandidatesList::ReselectionCandidatesList()
    : SectionDecoder("Reselection Candidates List", "Reselection Candidates List", packets) {}

}  // namespace varnel

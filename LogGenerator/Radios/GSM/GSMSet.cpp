#include "LogGenerator/Radios/GSM/GSMSet.h"

#include "LogGenerator/KLV/GSMUMTS/RankedGSMCell.h"

namespace varnel::radios {

namespace {

void update(Section& section, const Packet& packet) {
  using namespace cellRanking;
  const std::size_t first = minimumSize + umtsRecordSize * packet.u8(umtsCountOffset);
  section.refill([&](Array& cells) {
    addRecords(cells, packet, {first, gsmRecordSize, packet.u8(gsmCountOffset)}, gsmCell);
  });
}

constexpr PacketHandler packets[] = {
    {cellRanking::logCode, cellRanking::minimumSize, update, cellRanking::gsmCell},
};

}  // namespace

GSMSet::GSMSet() : SectionDecoder("GSM Set", "GSMSet", packets) {}

}  // namespace varnel::radios

#include "LogGenerator/KLV/GSMUMTS/GSMSet.h"

#include "LogGenerator/KLV/GSMUMTS/RankedGSMCell.h"

namespace varnel {

namespace {

void update(Section& section, const Packet& packet) {
  using namespace cellRanking;
  section.refill([&](Array& cells) {
    addCountedRecords(cells, packet, {firstRecord, gsmRecordSize, packet.u8(gsmCountOffset)}, gsmCell);
  });
}

constexpr PacketHandler packets[] = {
    {cellRanking::logCode, cellRanking::minimumSize, update, cellRanking::gsmCell},
};

}  // namespace

GSMSet::GSMSet() : SectionDecoder("GSM Set", "GSMSet", packets) {}

}  // namespace varnel

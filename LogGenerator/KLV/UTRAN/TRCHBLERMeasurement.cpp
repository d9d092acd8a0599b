#include "LogGenerator/KLV/UTRAN/TRCHBLERMeasurement.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/UTRAN/TransportChannels.h"

namespace varnel {

namespace {

constexpr Field channel[] = {
    {u8(0), "TRCH ID"},
    {u8(1), "TRCH BLER Measurement"},
};
static_assert(extent(channel) <= transportChannels::transportChannelSize);

void update(Section& section, const Packet& packet) {
  using namespace transportChannels;
  section.refill([&](Array& channels) {
    addRecords(channels, packet, {firstTransportChannel, transportChannelSize, transportChannelCount(packet)},
               channel);
  });
}

constexpr PacketHandler packets[] = {
    {transportChannels::logCode, transportChannels::minimumSize, update},
};

}  // namespace

TRCHBLERMeasurement::TRCHBLERMeasurement()
    : SectionDecoder("TRCH BLER", "TRCH BLER Measurement", packets, UnknownCodes::Ignored,
                     logNoticePriority) {}

}  // namespace varnel

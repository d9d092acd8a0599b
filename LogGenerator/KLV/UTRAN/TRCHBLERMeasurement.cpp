#include "LogGenerator/KLV/UTRAN/TRCHBLERMeasurement.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/UTRAN/TransportChannels.h"

namespace varnel {

namespace {

constexpr Field channel[] = {
    {u8(0), "TRCH ID"},
    {u8(1), "TRCH BLER Measurement"},
};
static_assert(within(channel, transportChannels::transportChannelSize));

}  // namespace

constinit const PacketHandlers<TRCHBLERMeasurement> TRCHBLERMeasurement::handlers = {
    {transportChannels::logCode, transportChannels::minimumSize, &TRCHBLERMeasurement::update},
};

void TRCHBLERMeasurement::update(const Packet& packet) {
  using namespace transportChannels;
  clearElementsInArray(list());
  const Records records{firstTransportChannel, transportChannelSize, transportChannelCount(packet)};
  replaceArray_With(list(), recordRows(packet, records, channel));
}

}  // namespace varnel

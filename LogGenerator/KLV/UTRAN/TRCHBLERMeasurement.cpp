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

std::span<const PacketHandler<TRCHBLERMeasurement>> TRCHBLERMeasurement::handlers() {
  static constexpr PacketHandler<TRCHBLERMeasurement> table[] = {
      {transportChannels::logCode, transportChannels::minimumSize, &TRCHBLERMeasurement::update},
  };
  return table;
}

void TRCHBLERMeasurement::update(const Packet& packet) {
  using namespace transportChannels;
  clearElementsInArray(list());
  const Records records{firstTransportChannel, transportChannelSize, transportChannelCount(packet)};
  replaceArray_With(list(), recordRows(packet, records, channel));
}

}  // namespace varnel

#include "LogGenerator/KLV/UTRAN/CCTRCHSIRMeasurement.h"

#include <string>

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/UTRAN/TransportChannels.h"

namespace varnel {

namespace {

using transportChannels::compositeChannelSize;

constexpr Field channel[] = {
    {u8(0), "CCTRCH ID"},
    {u8(1), "TSNUM"},
};
constexpr std::size_t firstRatio = 2;
constexpr std::size_t ratioCount = 6;
static_assert(within(channel, compositeChannelSize) && firstRatio + ratioCount == compositeChannelSize);

Value ratios(const Packet& record) {
  Array texts;
  for (std::size_t i = 0; i < ratioCount; ++i) texts.emplace_back(std::to_string(record.u8(firstRatio + i)));
  return Value::ofArray(std::move(texts));
}

}  // namespace

constinit const PacketHandlers<CCTRCHSIRMeasurement> CCTRCHSIRMeasurement::handlers = {
    {transportChannels::logCode, transportChannels::minimumSize, &CCTRCHSIRMeasurement::update},
};

void CCTRCHSIRMeasurement::update(const Packet& packet) {
  using namespace transportChannels;
  clearElementsInArray(list());
  Array channels;
  for (std::size_t i = 0; i < compositeChannelCount(packet); ++i) {
    const std::size_t offset = firstCompositeChannel(packet) + compositeChannelSize * i;
    if (!packet.holds(offset, compositeChannelSize)) continue;
    const Packet record = packet.from(offset);
    Value row = fieldRow(record, channel);
    row.dictionary()->set("SIR", ratios(record));
    channels.push_back(std::move(row));
  }
  replaceArray_With(list(), std::move(channels));
}

}  // namespace varnel

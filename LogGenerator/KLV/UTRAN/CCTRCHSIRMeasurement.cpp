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
static_assert(extent(channel) <= firstRatio && firstRatio + ratioCount == compositeChannelSize);

Value ratios(const Packet& record) {
  Array texts;
  for (std::size_t i = 0; i < ratioCount; ++i) texts.emplace_back(std::to_string(record.u8(firstRatio + i)));
  return Value::ofArray(std::move(texts));
}

void update(Section& section, const Packet& packet) {
  using namespace transportChannels;
  section.refill([&](Array& channels) {
    for (std::size_t i = 0; i < compositeChannelCount(packet); ++i) {
      const std::size_t offset = firstCompositeChannel(packet) + compositeChannelSize * i;
      if (!packet.holds(offset, compositeChannelSize)) continue;
      const Packet composite = packet.from(offset);
      const Value& record = channels.emplace_back(recordOf(composite, channel));
      record.dictionary()->set("SIR", ratios(composite));
    }
  });
}

constexpr PacketHandler packets[] = {
    {transportChannels::logCode, transportChannels::minimumSize, update},
};

}  // namespace

CCTRCHSIRMeasurement::CCTRCHSIRMeasurement()
    : SectionDecoder("CCTRCH SIR", "CCTRCH SIR Measurement", packets, UnknownCodes::Ignored) {}

}  // namespace varnel

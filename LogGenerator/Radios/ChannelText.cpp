#include "LogGenerator/Radios/ChannelText.h"

#include "LogGenerator/Radios/Channels.h"

namespace varnel::channels {

namespace {

std::string frequencyText(const Format& format, std::int32_t frequency_khz) {
  Formatter formatter;
  return std::string(formatter.text(format, megahertz(frequency_khz)));
}

}  // namespace

std::string lteDownlinkFrequency(std::uint32_t earfcn) {
  const auto channel = lteDownlink(earfcn);
  return channel ? frequencyText(frequencyFormat, channel->frequency_khz) : std::string();
}

std::string lteUplinkFrequency(std::uint32_t earfcn) {
  const auto channel = lteUplink(earfcn);
  return channel ? frequencyText(frequencyFormat, channel->frequency_khz) : std::string();
}

std::string lteBand(std::uint32_t earfcn) {
  const auto channel = lteDownlink(earfcn);
  return channel ? std::to_string(channel->band) : std::string();
}

std::string nrFrequency(std::uint32_t nrArfcn) {
  const auto frequency_khz = nrFrequency_khz(nrArfcn);
  return frequency_khz ? frequencyText(nrFrequencyFormat, *frequency_khz) : std::string();
}

}  // namespace varnel::channels

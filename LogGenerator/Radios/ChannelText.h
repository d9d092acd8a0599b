#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "LogGenerator/Field.h"

/// The texts of a display for channel numbers and bandwidths. A section or a record sets them; a decoder that
/// does lists the formats here (`Base::listNumberFormats`). A text of a channel is empty when no band has the
/// number.
namespace varnel::channels {

/// "751.0 MHz": a frequency of LTE or UMTS.
inline constexpr Format frequencyFormat = real("%.1f MHz");
/// "2524.950 MHz": a frequency of NR.
inline constexpr Format nrFrequencyFormat = real("%.3f MHz");
/// "20 MHz" and "1.4 MHz" for 100 and 6 resource blocks of LTE (3GPP TS 36.101, table 5.6-1). A field table
/// can use it.
inline constexpr Choice lteBandwidths[] = {{6, "1.4 MHz"}, {15, "3 MHz"},  {25, "5 MHz"},
                                           {50, "10 MHz"}, {75, "15 MHz"}, {100, "20 MHz"}};
inline constexpr Format lteBandwidthFormat = choice(lteBandwidths, "Unknown");
/// The unit of bandwidths, for `Base::listNumberFormats`, which needs a number's format.
inline constexpr Format bandwidthFormat = integer("%u MHz");

std::string lteDownlinkFrequency(std::uint32_t earfcn);
std::string lteUplinkFrequency(std::uint32_t earfcn);
/// "13": the band of a downlink EARFCN.
std::string lteBand(std::uint32_t earfcn);

std::string nrFrequency(std::uint32_t nrArfcn);

}  // namespace varnel::channels

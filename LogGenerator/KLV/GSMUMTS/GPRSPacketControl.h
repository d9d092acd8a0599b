#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Field.h"

namespace varnel {

/// What the cell says about packet control, log code 0x51F5. 0xFF stands for what the cell does not tell.
namespace gprsPacketControl {

inline constexpr std::uint32_t logCode = 0x51F5;
inline constexpr std::size_t minimumSize = 18;

inline constexpr Choice controlOrders[] = {
    {0xFF, "Not Available"},
    {0, "NC0"},
    {1, "NC1"},
    {2, "NC2"},
};
inline constexpr Choice accessThresholds[] = {
    {0xFF, "Not Available"}, {0, "Barred (PKT access not allowed in the Cell)"},
    {1, "Barred"},           {2, "Barred"},
    {3, "1 Only"},           {4, "1 to 2"},
    {5, "1 to 3"},           {6, "1 to 4"},
    {7, "Allowed"},
};

inline constexpr Field controlOrder{u8(15), "Network Control Order", choice(controlOrders, "Unknown")};
/// Support of packet flow contexts (PFC).
inline constexpr Source flowContexts = u8(13);
inline constexpr Field accessThreshold{u8(14), "Priority Access Threshold",
                                       choice(accessThresholds, "Unknown")};

}  // namespace gprsPacketControl

}  // namespace varnel

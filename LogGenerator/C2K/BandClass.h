#pragma once

#include "LogGenerator/Field.h"

namespace varnel::c2k {

/// Band classes, by their numbers in 3GPP2 C.S0057.
inline constexpr std::string_view bandClasses[] = {
    "800 MHz cellular band [0]",
    "1.8 to 2.0GHz PCS band [1]",
    "872 to 960MHz TACS band [2]",
    "832 to 925MHz JTACS band [3]",
    "1.75 to 1.87GHz Korean PCS band [4]",
    "450MHz band [5]",
    "2GHz band [6]",
    "700MHz band [7]",
    "1800 MHz band [8]",
    "900 MHzband [9]",  // Kept: the blank is missing.
    "Secondary 800 MHz band [10]",
    "400 MHz European PAMR band [11]",
    "800 MHz European PAMR band [12]",
};
inline constexpr Format bandClass = entry(bandClasses, integer("[Bad Value %d]"));

}  // namespace varnel::c2k

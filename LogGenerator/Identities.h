#pragma once

#include <cstdint>

namespace varnel {

/// Whether a display shows identities that name a person, such as the M-TMSI or the number of the SIM card.
enum class Identities : std::uint8_t {
  Hidden,  ///< it only says that they are "present"
  Shown,
};

}  // namespace varnel

#pragma once

#include <cstdint>
#include <string_view>

namespace varnel {

/// Whether a display shows identities that name a person, such as the M-TMSI or the number of the SIM card.
enum class Identities : std::uint8_t {
  Hidden,  ///< it only says that they are "present"
  Shown,
};

/// What an entry shows for an identity that is hidden.
inline constexpr std::string_view presentText = "present";

}  // namespace varnel

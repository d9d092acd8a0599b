#pragma once

#include <string_view>

namespace varnel {

/// What viewers say of their link while there is none.
inline constexpr std::string_view notConnectedStatus = "Connecting...";

/// What they say of it otherwise: when the display was last brought up to date, in local time.
inline constexpr std::string_view updateStatusPattern = "'Updated' yyyy-MM-dd 'at' HH:mm:ss";

}  // namespace varnel

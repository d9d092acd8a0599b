#pragma once

#include <string_view>

namespace varnel {

/// The status while there is no link.
inline constexpr std::string_view notConnectedStatus = "Connecting...";

/// The status with a link: when the display was last updated, in local time.
inline constexpr std::string_view updateStatusPattern = "'Updated' yyyy-MM-dd 'at' HH:mm:ss";

}  // namespace varnel

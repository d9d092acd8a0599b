#pragma once

namespace varnel {

/// Whether the user sees the change in motion. Either way it is complete when the call that asks for it
/// returns.
enum class Animation { None, Animated };

}  // namespace varnel

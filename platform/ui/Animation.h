#pragma once

namespace varnel {

/// Whether a change is shown happening. It has happened either way when the call that asks for it returns.
enum class Animation { None, Animated };

}  // namespace varnel

#pragma once

#include <cstddef>
#include <functional>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

#ifdef VARNEL_FUZZ
inline constexpr bool choosesEveryInput = false;
#else
inline constexpr bool choosesEveryInput = true;
#endif

/// Whether an input gets a check that takes long: one input in `oneInSoMany`, and without a fuzzer every
/// input. The bytes of the input decide, so the answer is the same each time, and an input made from a chosen
/// one is not chosen for that reason.
inline bool isChosen(ByteView input, std::size_t oneInSoMany) {
  const std::string_view bytes(reinterpret_cast<const char*>(input.data()), input.size());
  return choosesEveryInput || std::hash<std::string_view>()(bytes) % oneInSoMany == 0;
}

}  // namespace varnel

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

/// Whether an input is one of those that get a check which takes long: one in so many, and without a fuzzer
/// every one. Its own bytes tell, so it is the same each time, and none that is made of a chosen one inherits
/// it.
inline bool isChosen(ByteView input, std::size_t oneInSoMany) {
  const std::string_view bytes(reinterpret_cast<const char*>(input.data()), input.size());
  return choosesEveryInput || std::hash<std::string_view>()(bytes) % oneInSoMany == 0;
}

}  // namespace varnel

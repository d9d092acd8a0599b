#pragma once

#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// Plays an input (fuzz/InputSteps.h) to the generator of a technology with its shipped template, as the
/// model would: updates, displays with their trees, save contents, and new generators over the old state.
/// Aborts when anything is not as it must be. The two exceptions that end the program end the input, and only
/// a message that requires them may bring them about.
int fuzzGenerator(std::string_view technology, ByteView input);

}  // namespace varnel

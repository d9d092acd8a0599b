#pragma once

#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// Runs an input (fuzz/InputSteps.h) on the generator of a technology with its shipped template, as the model
/// would: updates, displays with their trees, save contents, and new generators on the old state. Aborts when
/// a result is wrong. The two exceptions that end the program end the input. Only a message that requires one
/// of them may raise it.
int fuzzGenerator(std::string_view technology, ByteView input);

}  // namespace varnel

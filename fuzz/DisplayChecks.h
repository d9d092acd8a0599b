#pragma once

#include "base/Value.h"

namespace varnel {

/// Aborts when the tree of a display, which may be absent, has a node to which its path does not lead.
void checkTree(const Value& display);

/// Aborts when a display, which may be absent, cannot be written in a format that can hold it, or when the
/// result cannot be read.
void checkFormats(const Value& display);

}  // namespace varnel

#pragma once

#include "base/Value.h"

namespace varnel {

/// Aborts when the tree of a display, which may be absent, has a node that its path does not lead to.
void checkTree(const Value& display);

/// Aborts when a display, which may be absent, cannot be written in a format that can hold it, or when what
/// was written cannot be read.
void checkFormats(const Value& display);

}  // namespace varnel

#pragma once

#include <string>

#include "model/VarnelModelNode.h"

namespace varnel {

/// The tree below its root as indented lines. Each leaf has its value beside its name, and the values of
/// siblings are aligned. A root that is a leaf is only its value. Control characters are written as escapes,
/// so that no value can control a terminal.
std::string treeAsText(const VarnelModelNode& root);

}  // namespace varnel

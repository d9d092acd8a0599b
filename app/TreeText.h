#pragma once

#include <string>

#include "model/VarnelModelNode.h"

namespace varnel {

/// The tree below its root as indented lines, each leaf's value beside its name and the values of siblings
/// aligned. A root that is itself a leaf is its value alone. Control characters are shown as escapes, so that
/// no value can steer a terminal.
std::string treeAsText(const VarnelModelNode& root);

}  // namespace varnel

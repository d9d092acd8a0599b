#pragma once

#include <string>

#include "model/VarnelModelNode.h"

namespace varnel {

/// A text as a JSON string. Bytes that are not UTF-8 become U+FFFD.
std::string jsonString(const std::string& text);

/// The tree as one line of JSON without a newline, with its names and its order: an object for a section, an
/// array for a list, a string for a leaf. The root has no name. A name that occurs twice is written twice.
std::string treeAsJson(const VarnelModelNode& root);

}  // namespace varnel

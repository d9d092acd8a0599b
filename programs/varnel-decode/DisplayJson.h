#pragma once

#include "LogGenerator/NumberFormats.h"
#include "base/Value.h"
#include "programs/varnel-decode/MergePatch.h"

namespace varnel {

/// How the values of displays are written.
enum class ValuesAs {
  Texts,    ///< as they are shown: "-93.25 dBm"
  Numbers,  ///< what is a number plainly (-93.25) and its unit elsewhere; what is absent not at all
};

/// Whether a text of a display says that there is no value: an empty one, or what stands for a value that
/// cannot be shown.
bool isAbsent(std::string_view text);

/// A display as JSON, each name once: where it occurs twice its later value counts.
struct DisplayJson {
  JsonValue display;
  /// The unit of each entry that has a value and a unit, under the names that lead to it. Records of a list
  /// share theirs. An empty object without numbers.
  JsonValue units;
};

/// Numbers are those of these formats.
DisplayJson displayJson(const Value& display, ValuesAs valuesAs, const NumberFormats& formats);

}  // namespace varnel

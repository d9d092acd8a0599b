#pragma once

#include "LogGenerator/NumberFormats.h"
#include "base/Value.h"
#include "programs/varnel-decode/MergePatch.h"

namespace varnel {

/// The form of the values of a display.
enum class ValuesAs {
  Texts,    ///< as the display shows them: "-93.25 dBm"
  Numbers,  ///< numbers plainly (-93.25) with their units elsewhere; absent values are left out
};

/// Whether a text of a display stands for no value: an empty text, or the text for a value that cannot be
/// shown.
bool isAbsent(std::string_view text);

/// A display as JSON with each name once. Where a name occurs twice, its later value counts.
struct DisplayJson {
  JsonValue display;
  /// The unit of each entry that has a value and a unit, under the names that lead to the entry. The records
  /// of a list share their units. Without numbers, an empty object.
  JsonValue units;
};

/// The formats decide what is a number.
DisplayJson displayJson(const Value& display, ValuesAs valuesAs, const NumberFormats& formats);

}  // namespace varnel

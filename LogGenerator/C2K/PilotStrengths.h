#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Field.h"
#include "platform/Value.h"

namespace varnel::c2k {

/// A row of up to so many pilots, each shown by its PN offset in the order of its index.
class PilotStrengths {
 public:
  explicit PilotStrengths(std::size_t count);

  /// Adds a pilot with its strength in dB, by a format made by `real`.
  void add(std::size_t index, std::uint16_t pn, const Format& format, double decibels);

  /// The pilots as a sorted dictionary, which is empty but for its mark when there are none.
  const Value& asDictionary() const { return _rows; }
  /// The same, but the text "(none)" when there are none.
  Value asDictionaryOrNone() const;

 private:
  Value _rows = Value::ofDictionary();
};

/// How the strength of a pilot is shown.
inline constexpr Format decibelFormat = real("%+.2f dB");

/// A linear ratio in dB. Kept: 0 gives minus infinity.
double decibels(double ratio);

/// A ratio that packets carry in units of 1/512, in dB.
double decibelsOfRatio512(std::uint16_t ratio);

}  // namespace varnel::c2k

#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/Field.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel::c2k {

/// The pilots of one variable. Each is shown by its PN offset, in the order of its index.
class PilotStrengths {
 public:
  PilotStrengths(Variable variable, Lookup& lookup) : _variable(variable), _lookup(lookup) {}

  /// Adds a pilot with its strength in dB, in a format made by `real`. Each index may come only once.
  void add(std::uint8_t index, std::uint16_t pn, const Format& format, double decibels);

  /// Publishes the pilots as a sorted dictionary. Without pilots the dictionary has only its mark.
  void publish();
  /// The same, but without pilots publishes the text "(none)".
  void publishOrNone();

 private:
  void put(std::string_view key, std::string_view text);

  Variable _variable;
  Lookup& _lookup;
  Value _pilots;
  std::size_t _size = 0;  // the number of entries that belong to this packet
};

/// The format of a pilot's strength.
inline constexpr Format decibelFormat = real("%+.2f dB");

/// A linear ratio in dB. Kept: 0 gives minus infinity.
double decibels(double ratio);

/// A ratio in units of 1/512, as in packets, converted to dB.
double decibelsOfRatio512(std::uint16_t ratio);

}  // namespace varnel::c2k

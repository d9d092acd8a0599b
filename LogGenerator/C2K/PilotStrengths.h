#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/Field.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel::c2k {

/// Pilots, each shown by its PN offset in the order of its index, under one variable.
class PilotStrengths {
 public:
  PilotStrengths(Variable variable, Lookup& lookup) : _variable(variable), _lookup(lookup) {}

  /// Adds a pilot with its strength in dB, by a format made by `real`. Every index comes once.
  void add(std::uint8_t index, std::uint16_t pn, const Format& format, double decibels);

  /// Publishes the pilots as a sorted dictionary, which is empty but for its mark when there are no
  /// pilots.
  void publish();
  /// The same, but without pilots the text "(none)".
  void publishOrNone();

 private:
  void put(std::string_view key, std::string_view text);

  Variable _variable;
  Lookup& _lookup;
  Value _pilots;
  std::size_t _size = 0;  // of the entries that are this packet's
};

/// How the strength of a pilot is shown.
inline constexpr Format decibelFormat = real("%+.2f dB");

/// A linear ratio in dB. Kept: 0 gives minus infinity.
double decibels(double ratio);

/// A ratio that packets carry in units of 1/512, in dB.
double decibelsOfRatio512(std::uint16_t ratio);

}  // namespace varnel::c2k

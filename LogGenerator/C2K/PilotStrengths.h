#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

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
  void add(std::size_t index, std::uint16_t pn, const Format& format, double decibels);

  /// Ends the row and publishes it as a sorted dictionary, which is empty but for its mark when there are no
  /// pilots.
  void publish();
  /// The same, but without pilots the text "(none)".
  void publishOrNone();

 private:
  void begin();

  Variable _variable;
  Lookup& _lookup;
  Value _rows;
  std::optional<Dictionary::Rewriting> _rewriting;  // of the rows, once they have begun
};

/// How the strength of a pilot is shown.
inline constexpr Format decibelFormat = real("%+.2f dB");

/// A linear ratio in dB. Kept: 0 gives minus infinity.
double decibels(double ratio);

/// A ratio that packets carry in units of 1/512, in dB.
double decibelsOfRatio512(std::uint16_t ratio);

}  // namespace varnel::c2k

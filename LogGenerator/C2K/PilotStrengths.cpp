#include "LogGenerator/C2K/PilotStrengths.h"

#include <cmath>
#include <string>

namespace varnel::c2k {

void PilotStrengths::add(std::size_t index, std::uint16_t pn, const Format& format, double decibels) {
  if (!_rewriting) begin();
  Formatter formatter;
  _rewriting->add(std::to_string(index) + ';' + std::to_string(pn), formatter.text(format, decibels));
}

void PilotStrengths::publish() {
  if (!_rewriting) begin();
  _rewriting.reset();
  storeDisplayValue(_variable, _rows, _lookup);
}

void PilotStrengths::publishOrNone() {
  if (_rewriting) {
    publish();
  } else {
    storeDisplayText(_variable, "(none)", _lookup);
  }
}

void PilotStrengths::begin() {
  _rows = _lookup.dictionaryFor(_variable);
  _rewriting.emplace(*_rows.dictionary());
  _rewriting->add(sortedMark, sortedMark);
}

double decibels(double ratio) { return 10.0 * std::log10(ratio); }

double decibelsOfRatio512(std::uint16_t ratio) { return decibels(ratio / 512.0); }

}  // namespace varnel::c2k

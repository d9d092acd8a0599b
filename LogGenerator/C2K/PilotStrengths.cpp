#include "LogGenerator/C2K/PilotStrengths.h"

#include <cmath>
#include <string>

#include "LogGenerator/C2K/DisplayVariables.h"
#include "platform/Dictionary.h"

namespace varnel::c2k {

PilotStrengths::PilotStrengths(std::size_t count) {
  _rows.dictionary()->reserve(count + 1);
  _rows.dictionary()->set(sortedMark, sortedMark);
}

void PilotStrengths::add(std::size_t index, std::uint16_t pn, const Format& format, double decibels) {
  Formatter formatter;
  _rows.dictionary()->setText(std::to_string(index) + ';' + std::to_string(pn),
                              formatter.text(format, decibels));
}

Value PilotStrengths::asDictionaryOrNone() const { return _rows.dictionary()->size() > 1 ? _rows : "(none)"; }

double decibels(double ratio) { return 10.0 * std::log10(ratio); }

double decibelsOfRatio512(std::uint16_t ratio) { return decibels(ratio / 512.0); }

}  // namespace varnel::c2k

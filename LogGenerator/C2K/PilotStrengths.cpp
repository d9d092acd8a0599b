#include "LogGenerator/C2K/PilotStrengths.h"

#include <array>
#include <charconv>
#include <cmath>

namespace varnel::c2k {

void PilotStrengths::add(std::uint8_t index, std::uint16_t pn, const Format& format, double decibels) {
  if (_size == 0) put(sortedMark, sortedMark);
  std::array<char, 16> key;  // room for two numbers, of 8 and of 16 bits, and more
  char* end = std::to_chars(key.begin(), key.end(), index).ptr;
  *end++ = ';';
  end = std::to_chars(end, key.end(), pn).ptr;
  put({key.data(), end}, Formatter().text(format, decibels));
}

void PilotStrengths::publish() {
  if (_size == 0) put(sortedMark, sortedMark);
  _pilots.dictionary()->truncate(_size);
  storeDisplayValue(_variable, _pilots, _lookup);
}

void PilotStrengths::publishOrNone() {
  if (_size > 0) {
    publish();
  } else {
    storeDisplayText(_variable, "(none)", _lookup);
  }
}

// Most pilots come again, and reuse the memory of the previous packet's pilots.
void PilotStrengths::put(std::string_view key, std::string_view text) {
  if (_size == 0) _pilots = _lookup.dictionaryFor(_variable);
  _pilots.dictionary()->writeAt(_size++, key, text);
}

double decibels(double ratio) { return 10.0 * std::log10(ratio); }

double decibelsOfRatio512(std::uint16_t ratio) { return decibels(ratio / 512.0); }

}  // namespace varnel::c2k

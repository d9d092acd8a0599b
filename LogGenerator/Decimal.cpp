#include "LogGenerator/Decimal.h"

#include <bit>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <cstdint>

namespace varnel {

namespace {

constexpr std::uint64_t powersOf10[] = {1, 10, 100, 1000};
// Below this limit, numbers have at most 13 digits before the point, and (up to 2^52) a fraction to shift
// out.
constexpr double limit = 9e12;
// Sign, digits, point, and decimals of such a number.
constexpr std::ptrdiff_t longest = 1 + 13 + 1 + 3;

// |number| × factor as a whole number, rounded. The number is mantissa × 2^-shift.
std::uint64_t scaled(double number, std::uint64_t factor) {
  constexpr int mantissaBits = 52;
  constexpr int bias = 1023;
  constexpr std::uint64_t hiddenBit = std::uint64_t{1} << mantissaBits;
  const auto bits = std::bit_cast<std::uint64_t>(number);
  const int exponent = static_cast<int>(bits >> mantissaBits & 0x7FF);
  const int shift = bias + mantissaBits - exponent;
  // The product has at most 63 bits, so it is less than a half here.
  if (shift > 63) return 0;
  const std::uint64_t product = ((bits & (hiddenBit - 1)) | hiddenBit) * factor;
  const std::uint64_t half = std::uint64_t{1} << (shift - 1);
  const std::uint64_t whole = product >> shift;
  const std::uint64_t rest = product & (2 * half - 1);
  return whole + ((rest > half || (rest == half && (whole & 1) != 0)) ? 1 : 0);
}

template <int precision>
char* put(char* out, char* end, double number) {
  constexpr std::uint64_t factor = powersOf10[precision];
  if (std::signbit(number)) *out++ = '-';
  const std::uint64_t decimals = scaled(number, factor);
  out = std::to_chars(out, end, decimals / factor).ptr;
  if constexpr (precision > 0) {
    *out = '.';
    std::uint64_t fraction = decimals % factor;
    for (int digit = precision; digit > 0; --digit, fraction /= 10)
      out[digit] = static_cast<char>('0' + fraction % 10);
    out += 1 + precision;
  }
  return out;
}

}  // namespace

char* putDecimal(char* out, char* end, double number, int precision) {
  if (std::fabs(number) < limit && end - out >= longest) {
    switch (precision) {
      case 0:
        return put<0>(out, end, number);
      case 1:
        return put<1>(out, end, number);
      case 2:
        return put<2>(out, end, number);
      case 3:
        return put<3>(out, end, number);
      default:
        break;
    }
  }
  return std::to_chars(out, end, number, std::chars_format::fixed, precision).ptr;
}

}  // namespace varnel

#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

#include "LogGenerator/Packet.h"
#include "base/Dictionary.h"

namespace varnel {

/// The place of a field's raw value: a little-endian run of bits, read as an unsigned or a signed number.
struct Source {
  std::uint16_t byte;
  std::uint8_t firstBit;
  std::uint8_t width;
  bool isSigned = false;

  constexpr std::size_t end() const { return byte + (firstBit + width + 7u) / 8; }
};

consteval Source bits(std::uint16_t byte, std::uint8_t firstBit, std::uint8_t width) {
  if (firstBit > 7 || width < 1 || width > 32) throw "a field has 1 to 32 bits and starts in its byte";
  return {byte, firstBit, width};
}
consteval Source u8(std::uint16_t byte) { return bits(byte, 0, 8); }
consteval Source u16(std::uint16_t byte) { return bits(byte, 0, 16); }
consteval Source u32(std::uint16_t byte) { return bits(byte, 0, 32); }
consteval Source s8(std::uint16_t byte) { return {byte, 0, 8, true}; }
consteval Source s16(std::uint16_t byte) { return {byte, 0, 16, true}; }

/// A raw value and its text.
struct Choice {
  std::uint32_t raw;
  std::string_view text;
};

/// Turns a raw value into a display text. `integer`, `hexadecimal`, `real`, `choice`, and `entry` below make
/// formats.
struct Format {
  enum class Kind : std::uint8_t { Integer, Real, Choice };

  Kind kind = Kind::Integer;
  std::string_view before{}, after{};           // the texts around the number
  bool isUnsigned = false;                      // %u instead of %d
  bool isHexadecimal = false;                   // %x instead of %d
  bool hasPlus = false;                         // the flag +: numbers that are not negative begin with it
  bool hasLeadingZeros = false;                 // the flag 0, of %0wx
  std::uint8_t width = 0, precision = 0;        // of %w.pf
  std::int32_t factor = 1, summand = 0;         // integers: raw × factor + summand
  double realFactor = 1.0, realSummand = 0.0;   // the same for reals
  std::span<const Choice> choices{};            // raw values with texts, for every kind of format
  std::span<const std::string_view> entries{};  // texts of the first raw values, for every kind of format
  std::string_view otherwise{};                 // for the kind Choice: the text of any other raw value
  Choice exception{};  // one raw value with its own text; unused while the text is empty

  /// The same format, but this raw value shows this text.
  consteval Format unless(std::uint32_t raw, std::string_view text) const {
    Format changed = *this;
    changed.exception = {raw, text};
    return changed;
  }
};

namespace format {

// Splits "before%4.2fafter" around its only conversion, which must end in one of the given letters.
consteval Format split(std::string_view text, std::string_view conversions) {
  Format result;
  const std::size_t percent = text.find('%');
  if (percent == std::string_view::npos) throw "the format has no conversion";
  const auto isDigit = [](char c) { return c >= '0' && c <= '9'; };
  std::size_t at = percent + 1;
  for (; text.at(at) == '+' || text[at] == '0'; ++at)
    (text[at] == '+' ? result.hasPlus : result.hasLeadingZeros) = true;
  for (; isDigit(text.at(at)); ++at)
    result.width = static_cast<std::uint8_t>(result.width * 10 + (text[at] - '0'));
  if (text[at] == '.') {
    for (++at; isDigit(text.at(at)); ++at) {
      result.precision = static_cast<std::uint8_t>(result.precision * 10 + (text[at] - '0'));
    }
  } else if (text[at] == 'f') {
    result.precision = 6;
  }
  if (conversions.find(text[at]) == std::string_view::npos) throw "the conversion does not fit the field";
  result.isUnsigned = text[at] == 'u';
  result.isHexadecimal = text[at] == 'x';
  if (result.hasLeadingZeros && !result.isHexadecimal) throw "zeros lead hexadecimal numbers only";
  if (result.hasPlus && (result.isUnsigned || result.isHexadecimal)) throw "the number has no sign";
  result.before = text.substr(0, percent);
  result.after = text.substr(at + 1);
  const bool isPercentage = result.after.starts_with("%%");  // shown as a percent sign
  if (isPercentage) result.after.remove_prefix(1);
  if (result.after.find('%', isPercentage) != std::string_view::npos) throw "the format has two conversions";
  if (result.before.size() + result.after.size() > 64 || result.width > 32 || result.precision > 16) {
    throw "the text would not fit in its buffer";
  }
  return result;
}

}  // namespace format

/// raw × factor + summand, written by %d (as a signed 32-bit number) or %u.
consteval Format integer(std::string_view text = "%d", std::int32_t factor = 1, std::int32_t summand = 0) {
  Format result = format::split(text, "du");
  result.factor = factor;
  result.summand = summand;
  return result;
}

/// The raw value, written by %0wx.
consteval Format hexadecimal(std::string_view text) { return format::split(text, "x"); }

/// raw × factor + summand, written by %w.pf.
consteval Format real(std::string_view text, double factor = 1.0, double summand = 0.0) {
  Format result = format::split(text, "f");
  result.kind = Format::Kind::Real;
  result.realFactor = factor;
  result.realSummand = summand;
  return result;
}

/// The text of the choice with this raw value, or else the other text.
consteval Format choice(std::span<const Choice> choices, std::string_view otherwise) {
  Format result;
  result.kind = Format::Kind::Choice;
  result.choices = choices;
  result.otherwise = otherwise;
  return result;
}

/// The entry whose index is the raw value; past the last entry the other text.
consteval Format entry(std::span<const std::string_view> entries, std::string_view otherwise = "Unknown") {
  Format result;
  result.kind = Format::Kind::Choice;
  result.entries = entries;
  result.otherwise = otherwise;
  return result;
}

/// The same; past the last entry the number in its format.
consteval Format entry(std::span<const std::string_view> entries, Format otherwise) {
  otherwise.entries = entries;
  return otherwise;
}

/// The text of the choice with this raw value, or else the number in its format.
consteval Format choice(std::span<const Choice> choices, Format otherwise) {
  otherwise.choices = choices;
  return otherwise;
}

/// One field of a packet's table: the place of the value, the entry that shows it, and its format.
struct Field {
  Source source;
  std::string_view label;
  Format format = integer();
};

/// How many bytes the fields cover, from offset 0 to the end of the last field.
constexpr std::size_t extent(std::span<const Field> fields) {
  std::size_t end = 0;
  for (const Field& field : fields) end = std::max(end, field.source.end());
  return end;
}

/// Makes display texts. Each text is in the formatter's own memory and is valid until the next one is made.
class Formatter {
 public:
  /// The text of a field of a packet.
  std::string_view text(const Packet& packet, const Source& source, const Format& format);
  std::string_view text(const Packet& packet, const Field& field) {
    return text(packet, field.source, field.format);
  }
  /// The text of a computed number in a format made by `real`, without its factor and summand. A NaN shows no
  /// minus.
  std::string_view text(const Format& format, double number);
  /// The text of a computed number in a format made by `integer`.
  std::string_view text(const Format& format, std::int32_t number);

 private:
  // Room for a double of any size with 16 decimals, and the texts around it.
  std::array<char, 448> _room;
};

/// The raw value of a field. A signed one is in 32-bit two's complement.
std::uint32_t rawValue(const Packet& packet, const Source& source);

/// Sets the fields of a record, in the order of the table.
void setFields(Dictionary& record, const Packet& packet, std::span<const Field> fields);
/// Sets a computed number of a record, in an integer format.
void setInteger(Dictionary& record, std::string_view label, const Format& format, std::int32_t number);

/// A new record with the fields.
Value recordOf(const Packet& packet, std::span<const Field> fields);

/// The place of the records of a counted list.
struct Records {
  std::size_t first;   ///< offset of the first record
  std::size_t stride;  ///< from one record to the next
  std::size_t count;
};

/// Adds the records to a list, in their order. Leaves out a record whose fields do not lie wholly inside the
/// packet.
void addRecords(Array& list, const Packet& packet, const Records& records, std::span<const Field> fields);
/// Adds all counted records. Bytes past the packet's end read as 0.
void addCountedRecords(Array& list, const Packet& packet, const Records& records,
                       std::span<const Field> fields);

}  // namespace varnel

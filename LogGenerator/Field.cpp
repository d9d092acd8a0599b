#include "LogGenerator/Field.h"

#include <charconv>
#include <cmath>
#include <limits>

namespace varnel {

namespace {

// A double of any size with 16 decimals and its sign.
using Digits = std::array<char, 352>;

std::string_view realDigits(Digits& room, const Format& format, double number) {
  if (std::isnan(number)) number = std::numeric_limits<double>::quiet_NaN();
  char* out = room.begin();
  if (format.hasPlus && !std::signbit(number)) *out++ = '+';
  out = std::to_chars(out, room.end(), number, std::chars_format::fixed, format.precision).ptr;
  return {room.begin(), static_cast<std::size_t>(out - room.begin())};
}

std::string_view integerDigits(Digits& room, const Format& format, std::uint32_t number) {
  const auto signedNumber = static_cast<std::int32_t>(number);
  char* out = room.begin();
  if (format.hasPlus && signedNumber >= 0) *out++ = '+';
  out = format.isHexadecimal ? std::to_chars(out, room.end(), number, 16).ptr
        : format.isUnsigned  ? std::to_chars(out, room.end(), number).ptr
                             : std::to_chars(out, room.end(), signedNumber).ptr;
  return {room.begin(), static_cast<std::size_t>(out - room.begin())};
}

}  // namespace

std::uint32_t rawValue(const Packet& packet, const Source& source) {
  const std::uint32_t raw = packet.bits(source.byte, source.firstBit, source.width);
  if (!source.isSigned) return raw;
  const std::uint32_t sign = std::uint32_t{1} << (source.width - 1);
  return (raw ^ sign) - sign;
}

std::string_view Formatter::text(const Packet& packet, const Field& field) {
  const Format& format = field.format;
  const std::uint32_t raw = rawValue(packet, field.source);
  if (!format.exception.text.empty() && raw == format.exception.raw) return format.exception.text;
  if (raw < format.entries.size()) return format.entries[raw];
  for (const Choice& choice : format.choices) {
    if (choice.raw == raw) return choice.text;
  }
  switch (format.kind) {
    case Format::Kind::Choice:
      return format.otherwise;
    case Format::Kind::Real: {
      const double number = field.source.isSigned ? static_cast<std::int32_t>(raw) : static_cast<double>(raw);
      return text(format, number * format.realFactor + format.realSummand);
    }
    case Format::Kind::Integer:
      break;
  }
  return text(format, static_cast<std::int32_t>(raw));
}

std::string_view Formatter::text(const Format& format, double number) {
  Digits room;
  return assemble(format, realDigits(room, format, number));
}

std::string_view Formatter::text(const Format& format, std::int32_t number) {
  Digits room;
  const auto factor = static_cast<std::uint32_t>(format.factor);
  const auto summand = static_cast<std::uint32_t>(format.summand);
  return assemble(format, integerDigits(room, format, static_cast<std::uint32_t>(number) * factor + summand));
}

// The number is padded on its left to the width, as printf does.
std::string_view Formatter::assemble(const Format& format, std::string_view digits) {
  const std::size_t padding = format.width > digits.size() ? format.width - digits.size() : 0;
  char* out = std::ranges::copy(format.before, _room.begin()).out;
  out = std::fill_n(out, padding, format.hasLeadingZeros ? '0' : ' ');
  out = std::ranges::copy(digits, out).out;
  out = std::ranges::copy(format.after, out).out;
  return {_room.begin(), static_cast<std::size_t>(out - _room.begin())};
}

void setFields(Dictionary& section, const Packet& packet, std::span<const Field> fields) {
  Formatter formatter;
  for (const Field& field : fields) section.setText(field.label, formatter.text(packet, field));
}

void setInteger(Dictionary& section, std::string_view label, const Format& format, std::int32_t number) {
  Formatter formatter;
  section.setText(label, formatter.text(format, number));
}

void setReal(Dictionary& section, std::string_view label, const Format& format, double number) {
  Formatter formatter;
  section.setText(label, formatter.text(format, number));
}

Value fieldRow(const Packet& record, std::span<const Field> fields) {
  Value row = Value::ofDictionary();
  row.dictionary()->reserve(fields.size());
  setFields(*row.dictionary(), record, fields);
  return row;
}

Array recordRows(const Packet& packet, const Records& records, std::span<const Field> fields) {
  const std::size_t size = extent(fields);
  Array rows;
  rows.reserve(records.count);
  for (std::size_t i = 0; i < records.count; ++i) {
    const std::size_t offset = records.first + records.stride * i;
    if (packet.holds(offset, size)) rows.push_back(fieldRow(packet.from(offset), fields));
  }
  return rows;
}

Array countedRows(const Packet& packet, const Records& records, std::span<const Field> fields) {
  Array rows;
  rows.reserve(records.count);
  for (std::size_t i = 0; i < records.count; ++i) {
    rows.push_back(fieldRow(packet.from(records.first + records.stride * i), fields));
  }
  return rows;
}

}  // namespace varnel

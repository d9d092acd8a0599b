#include "LogGenerator/Field.h"

#include <array>
#include <charconv>

namespace varnel {

namespace {

// Room for a double of any size with 16 decimals, 336 characters, and for the texts around it.
using TextBuffer = std::array<char, 448>;

std::string_view text(const Format& format, std::string_view digits, TextBuffer& buffer) {
  const std::size_t padding = format.width > digits.size() ? format.width - digits.size() : 0;
  char* out = std::ranges::copy(format.before, buffer.begin()).out;
  out = std::fill_n(out, padding, ' ');
  out = std::ranges::copy(digits, out).out;
  out = std::ranges::copy(format.after, out).out;
  return {buffer.begin(), out};
}

std::string_view integerText(const Format& format, std::uint32_t raw, TextBuffer& buffer) {
  const std::uint32_t number =
      raw * static_cast<std::uint32_t>(format.factor) + static_cast<std::uint32_t>(format.summand);
  std::array<char, 16> digits;
  const auto end = format.isUnsigned
                       ? std::to_chars(digits.begin(), digits.end(), number)
                       : std::to_chars(digits.begin(), digits.end(), static_cast<std::int32_t>(number));
  return text(format, {digits.begin(), end.ptr}, buffer);
}

std::string_view realText(const Format& format, double number, TextBuffer& buffer) {
  std::array<char, 336> digits;
  const auto end =
      std::to_chars(digits.begin(), digits.end(), number * format.realFactor + format.realSummand,
                    std::chars_format::fixed, format.precision);
  return text(format, {digits.begin(), end.ptr}, buffer);
}

std::string_view text(const Format& format, std::uint32_t raw, bool isSigned, TextBuffer& buffer) {
  if (!format.exception.text.empty() && raw == format.exception.raw) return format.exception.text;
  switch (format.kind) {
    case Format::Kind::Choice:
      for (const Choice& choice : format.choices) {
        if (choice.raw == raw) return choice.text;
      }
      return format.otherwise;
    case Format::Kind::Entry:
      return raw < format.entries.size() ? format.entries[raw] : format.otherwise;
    case Format::Kind::Integer:
      return integerText(format, raw, buffer);
    case Format::Kind::Real:
      break;
  }
  return realText(format, isSigned ? static_cast<std::int32_t>(raw) : static_cast<double>(raw), buffer);
}

}  // namespace

std::uint32_t rawValue(const Packet& packet, const Source& source) {
  const std::uint32_t raw = packet.bits(source.byte, source.firstBit, source.width);
  if (!source.isSigned) return raw;
  const std::uint32_t sign = std::uint32_t{1} << (source.width - 1);
  return (raw ^ sign) - sign;
}

void setFields(Dictionary& section, const Packet& packet, std::span<const Field> fields) {
  TextBuffer buffer;
  for (const Field& field : fields) {
    const std::uint32_t raw = rawValue(packet, field.source);
    section.setText(field.label, text(field.format, raw, field.source.isSigned, buffer));
  }
}

void setInteger(Dictionary& section, std::string_view label, const Format& format, std::int32_t number) {
  TextBuffer buffer;
  section.setText(label, integerText(format, static_cast<std::uint32_t>(number), buffer));
}

void setReal(Dictionary& section, std::string_view label, const Format& format, double number) {
  TextBuffer buffer;
  section.setText(label, realText(format, number, buffer));
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

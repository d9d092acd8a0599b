#include "LogGenerator/Field.h"

#include <array>
#include <charconv>

namespace varnel {

namespace {

// Room for a double of any size with 16 decimals and the texts around it.
using TextBuffer = std::array<char, 448>;

std::uint32_t rawValue(const Packet& packet, const Source& source) {
  const std::uint32_t raw = packet.bits(source.byte, source.firstBit, source.width);
  if (!source.isSigned) return raw;
  const std::uint32_t sign = std::uint32_t{1} << (source.width - 1);
  return (raw ^ sign) - sign;
}

// Writes the number behind `out`, padded on its left to the width, as printf does.
char* putNumber(char* out, char* end, const Format& format, std::uint32_t raw, bool isSigned) {
  std::array<char, 352> digits;
  std::to_chars_result result;
  if (format.kind == Format::Kind::Real) {
    const double number = isSigned ? static_cast<std::int32_t>(raw) : static_cast<double>(raw);
    result = std::to_chars(digits.begin(), digits.end(), number * format.realFactor + format.realSummand,
                           std::chars_format::fixed, format.precision);
  } else {
    const std::uint32_t number =
        raw * static_cast<std::uint32_t>(format.factor) + static_cast<std::uint32_t>(format.summand);
    result = format.isUnsigned
                 ? std::to_chars(digits.begin(), digits.end(), number)
                 : std::to_chars(digits.begin(), digits.end(), static_cast<std::int32_t>(number));
  }
  const auto length = static_cast<std::size_t>(result.ptr - digits.begin());
  const std::size_t padding = format.width > length ? format.width - length : 0;
  if (static_cast<std::size_t>(end - out) < padding + length) return out;
  out = std::fill_n(out, padding, ' ');
  return std::copy_n(digits.begin(), length, out);
}

std::string_view text(const Format& format, std::uint32_t raw, bool isSigned, TextBuffer& buffer) {
  if (!format.exception.text.empty() && raw == format.exception.raw) return format.exception.text;
  if (format.kind == Format::Kind::Choice) {
    for (const Choice& choice : format.choices) {
      if (choice.raw == raw) return choice.text;
    }
    return format.otherwise;
  }
  char* out = std::ranges::copy(format.before, buffer.begin()).out;
  out = putNumber(out, buffer.end() - format.after.size(), format, raw, isSigned);
  out = std::ranges::copy(format.after, out).out;
  return {buffer.begin(), static_cast<std::size_t>(out - buffer.begin())};
}

}  // namespace

void setFields(Dictionary& section, const Packet& packet, std::span<const Field> fields) {
  TextBuffer buffer;
  for (const Field& field : fields) {
    const std::uint32_t raw = rawValue(packet, field.source);
    section.setText(field.label, text(field.format, raw, field.source.isSigned, buffer));
  }
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

}  // namespace varnel

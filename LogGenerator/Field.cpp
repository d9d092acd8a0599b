#include "LogGenerator/Field.h"

#include <charconv>
#include <cmath>
#include <limits>

#include "LogGenerator/Decimal.h"

namespace varnel {

namespace {

char* putReal(char* out, char* end, const Format& format, double number) {
  if (std::isnan(number)) number = std::numeric_limits<double>::quiet_NaN();
  if (format.hasPlus && !std::signbit(number)) *out++ = '+';
  return putDecimal(out, end, number, format.precision);
}

char* putInteger(char* out, char* end, const Format& format, std::uint32_t raw) {
  const std::uint32_t number =
      raw * static_cast<std::uint32_t>(format.factor) + static_cast<std::uint32_t>(format.summand);
  if (format.isHexadecimal) return std::to_chars(out, end, number, 16).ptr;
  if (format.isUnsigned) return std::to_chars(out, end, number).ptr;
  const auto signedNumber = static_cast<std::int32_t>(number);
  if (format.hasPlus && signedNumber >= 0) *out++ = '+';
  return std::to_chars(out, end, signedNumber).ptr;
}

char* putRaw(char* out, char* end, const Source& source, const Format& format, std::uint32_t raw) {
  if (format.kind == Format::Kind::Real) {
    const double number = source.isSigned ? static_cast<std::int32_t>(raw) : static_cast<double>(raw);
    return putReal(out, end, format, number * format.realFactor + format.realSummand);
  }
  return putInteger(out, end, format, raw);
}

// Pads the text between the two pointers on its left side to the width, like printf.
char* pad(char* begin, char* end, const Format& format) {
  const auto length = static_cast<std::size_t>(end - begin);
  if (length >= format.width) return end;
  char* const paddedEnd = begin + format.width;
  std::fill(begin, std::copy_backward(begin, end, paddedEnd), format.hasLeadingZeros ? '0' : ' ');
  return paddedEnd;
}

// The texts before and after a number, which put(out, end) writes.
template <std::size_t size, class Put>
std::string_view numberText(std::array<char, size>& room, const Format& format, Put put) {
  char* const begin = std::ranges::copy(format.before, room.begin()).out;
  char* out = put(begin, room.end() - format.after.size());
  if (format.width > 0) out = pad(begin, out, format);
  out = std::ranges::copy(format.after, out).out;
  return {room.begin(), static_cast<std::size_t>(out - room.begin())};
}

}  // namespace

std::uint32_t rawValue(const Packet& packet, const Source& source) {
  const std::uint32_t raw = packet.bits(source.byte, source.firstBit, source.width);
  if (!source.isSigned) return raw;
  const std::uint32_t sign = std::uint32_t{1} << (source.width - 1);
  return (raw ^ sign) - sign;
}

std::string_view Formatter::text(const Packet& packet, const Source& source, const Format& format) {
  const std::uint32_t raw = rawValue(packet, source);
  if (!format.exception.text.empty() && raw == format.exception.raw) return format.exception.text;
  if (raw < format.entries.size()) return format.entries[raw];
  for (const Choice& choice : format.choices) {
    if (choice.raw == raw) return choice.text;
  }
  if (format.kind == Format::Kind::Choice) return format.otherwise;
  return numberText(_room, format,
                    [&](char* out, char* end) { return putRaw(out, end, source, format, raw); });
}

std::string_view Formatter::text(const Format& format, double number) {
  return numberText(_room, format, [&](char* out, char* end) { return putReal(out, end, format, number); });
}

std::string_view Formatter::text(const Format& format, std::int32_t number) {
  return numberText(_room, format, [&](char* out, char* end) {
    return putInteger(out, end, format, static_cast<std::uint32_t>(number));
  });
}

void setFields(Dictionary& record, const Packet& packet, std::span<const Field> fields) {
  Formatter formatter;
  for (const Field& field : fields) record.setText(field.label, formatter.text(packet, field));
}

void setInteger(Dictionary& record, std::string_view label, const Format& format, std::int32_t number) {
  record.setText(label, Formatter().text(format, number));
}

Value recordOf(const Packet& packet, std::span<const Field> fields) {
  Value record = Value::ofDictionary();
  record.dictionary()->reserve(fields.size());
  setFields(*record.dictionary(), packet, fields);
  return record;
}

void addRecords(Array& list, const Packet& packet, const Records& records, std::span<const Field> fields) {
  const std::size_t size = extent(fields);
  list.reserve(list.size() + records.count);
  for (std::size_t i = 0; i < records.count; ++i) {
    const std::size_t offset = records.first + records.stride * i;
    if (packet.holds(offset, size)) list.push_back(recordOf(packet.from(offset), fields));
  }
}

void addCountedRecords(Array& list, const Packet& packet, const Records& records,
                       std::span<const Field> fields) {
  list.reserve(list.size() + records.count);
  for (std::size_t i = 0; i < records.count; ++i) {
    list.push_back(recordOf(packet.from(records.first + records.stride * i), fields));
  }
}

}  // namespace varnel

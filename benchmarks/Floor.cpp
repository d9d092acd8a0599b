#include "Floor.h"

#include <plist/plist.h>

#include <array>
#include <charconv>
#include <cstring>

#include "base/Dictionary.h"

namespace varnel {

namespace {

constexpr std::string_view mark = "\x01";
constexpr std::size_t headerSize = 13;
constexpr std::size_t longestNumber = 18;

bool isDigit(char c) { return c >= '0' && c <= '9'; }

std::size_t listOffset(ByteView message, bool isObject) {
  if (isObject) return 0;
  const std::size_t prefix = !message.empty() && message[0] == 0x81 ? 2 : 0;
  const bool isServerMade = message.size() > prefix && message[prefix] == 0xFF;
  return isServerMade ? std::min(prefix + headerSize, message.size()) : message.size();
}

std::uint64_t sumOf(ByteView bytes) {
  std::uint64_t sum = 0;
  std::size_t i = 0;
  for (; i + sizeof sum <= bytes.size(); i += sizeof sum) {
    std::uint64_t word = 0;
    std::memcpy(&word, bytes.data() + i, sizeof word);
    sum += word;
  }
  for (; i < bytes.size(); ++i) sum += bytes[i];
  return sum;
}

void parse(ByteView list) {
  plist_t parsed = nullptr;
  plist_from_memory(reinterpret_cast<const char*>(list.data()), static_cast<std::uint32_t>(list.size()),
                    &parsed);
  plist_free(parsed);
}

}  // namespace

void Floor::learn(ByteView message, bool isObject, const std::vector<std::string>& texts) {
  Message& learned = _messages.emplace_back();
  learned.bytes.assign(message.begin(), message.end());
  learned.listOffset = listOffset(message, isObject);
  for (const std::string& text : texts) learned.texts.push_back(split(text));
}

std::uint64_t Floor::run(std::size_t message) const {
  const Message& learned = _messages[message];
  const ByteView bytes = learned.bytes;
  const std::uint64_t sum = sumOf(bytes);
  if (learned.listOffset < bytes.size()) parse(bytes.subspan(learned.listOffset));
  std::array<char, 65536> buffer;
  char* out = buffer.data();
  for (const Text& text : learned.texts) out = write(text, out, buffer.data() + buffer.size());
  return sum + static_cast<std::uint64_t>(out - buffer.data()) + static_cast<unsigned char>(buffer[sum % 16]);
}

Floor::Text Floor::split(const std::string& text) {
  std::size_t begin = text.find_first_of("0123456789");
  if (begin == std::string::npos) return {.before = text};
  std::size_t end = begin;
  while (end < text.size() && isDigit(text[end])) ++end;
  if (end - begin > longestNumber || (text[begin] == '0' && end - begin > 1)) return {.before = text};
  const bool hasFraction = end + 1 < text.size() && text[end] == '.' && isDigit(text[end + 1]);
  Text result;
  if (hasFraction) {
    const std::size_t point = end++;
    while (end < text.size() && isDigit(text[end])) ++end;
    result.precision = static_cast<int>(end - point - 1);
  }
  if (begin > 0 && text[begin - 1] == '-') --begin;
  result.before = text.substr(0, begin);
  result.after = text.substr(end);
  const std::string number = text.substr(begin, end - begin);
  result.kind = hasFraction ? Text::Kind::Real : Text::Kind::Integer;
  if (hasFraction) {
    result.real = std::stod(number);
  } else {
    result.integer = std::stoll(number);
  }
  return result;
}

char* Floor::write(const Text& text, char* out, char* end) {
  constexpr std::size_t roomForANumber = 64;
  if (static_cast<std::size_t>(end - out) < text.before.size() + text.after.size() + roomForANumber)
    return out;
  out = std::copy(text.before.begin(), text.before.end(), out);
  if (text.kind == Text::Kind::Integer) out = std::to_chars(out, end, text.integer).ptr;
  if (text.kind == Text::Kind::Real) {
    out = std::to_chars(out, end, text.real, std::chars_format::fixed, text.precision).ptr;
  }
  return std::copy(text.after.begin(), text.after.end(), out);
}

void markTexts(const Value& display) {
  if (Array* elements = display.array()) elements->clear();
  Dictionary* rows = display.dictionary();
  if (!rows) return;
  for (const auto& [key, value] : *rows) {
    if (value.string()) {
      rows->setText(key, mark);
    } else {
      markTexts(value);
    }
  }
}

std::vector<std::string> takeTexts(const Value& display) {
  std::vector<std::string> texts;
  const auto add = [&](const Value& value) {
    const auto more = takeTexts(value);
    texts.insert(texts.end(), more.begin(), more.end());
  };
  if (const std::string* text = display.string(); text && *text != mark) texts.push_back(*text);
  if (const Array* elements = display.array()) {
    for (const Value& element : *elements) add(element);
  }
  if (const Dictionary* rows = display.dictionary()) {
    for (const auto& [key, value] : *rows) add(value);
  }
  return texts;
}

}  // namespace varnel

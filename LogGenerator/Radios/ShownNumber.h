#pragma once

#include <charconv>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>

#include "LogGenerator/Section.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel {

/// The number at the beginning of a text that the display shows. Absent when there is none, as in an empty
/// text.
template <class Number>
std::optional<Number> shownNumber(const Value& shown) {
  const std::string* const text = shown.string();
  Number number{};
  if (!text || std::from_chars(text->data(), text->data() + text->size(), number).ec != std::errc())
    return std::nullopt;
  return number;
}

/// The text of a key section's entry; empty when there is none.
inline std::string_view textShown(const Section& section, std::string_view entry) {
  const Dictionary* const entries = section.container().dictionary();
  const std::string* const text = entries ? entries->get(entry).string() : nullptr;
  return text ? std::string_view(*text) : std::string_view();
}

/// The number at the beginning of the text of a key section's entry. Absent when there is none.
inline std::optional<std::uint32_t> numberShown(const Section& section, std::string_view entry) {
  const Dictionary* const entries = section.container().dictionary();
  return entries ? shownNumber<std::uint32_t>(entries->get(entry)) : std::nullopt;
}

/// Whether a key section's entry shows another number than this. An entry without a number does not.
inline bool showsAnotherNumber(const Section& section, std::string_view entry, std::uint32_t number) {
  const auto shown = numberShown(section, entry);
  return shown && *shown != number;
}

}  // namespace varnel

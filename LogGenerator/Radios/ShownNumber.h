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

/// Whether a key section's entry shows another number than this. An entry without a number does not.
inline bool showsAnotherNumber(const Section& section, std::string_view entry, std::uint32_t number) {
  const Dictionary* const entries = section.container().dictionary();
  const auto shown = entries ? shownNumber<std::uint32_t>(entries->get(entry)) : std::nullopt;
  return shown && *shown != number;
}

}  // namespace varnel

#include "LogGenerator/NumberFormats.h"

#include <algorithm>

namespace varnel {

namespace {

// An unsigned 32-bit number has no more; longer rows of digits are identities, as those of SIM cards.
constexpr std::size_t mostDigits = 10;

std::size_t leadingDigits(std::string_view text) {
  const auto isDigit = [](char c) { return c >= '0' && c <= '9'; };
  return static_cast<std::size_t>(std::ranges::find_if_not(text, isDigit) - text.begin());
}

// Whether the text is a decimal number that every reader of numbers takes: digits without a leading 0, and
// perhaps a fraction.
bool isPlainNumber(std::string_view text) {
  if (text.starts_with('-')) text.remove_prefix(1);
  const std::size_t whole = leadingDigits(text);
  if (whole == 0 || whole > mostDigits || (whole > 1 && text.front() == '0')) return false;
  text.remove_prefix(whole);
  if (text.empty()) return true;
  if (text.front() != '.') return false;
  text.remove_prefix(1);
  return !text.empty() && leadingDigits(text) == text.size();
}

// The number in a text that has these texts around it; empty when it is not of that form.
std::string_view numberBetween(std::string_view before, std::string_view after, std::string_view text) {
  if (!text.starts_with(before)) return {};
  text.remove_prefix(before.size());
  if (!text.ends_with(after)) return {};
  text.remove_suffix(after.size());
  text.remove_prefix(std::min(text.find_first_not_of(' '), text.size()));  // of a format with a width
  if (text.starts_with('+')) text.remove_prefix(1);
  return isPlainNumber(text) ? text : std::string_view();
}

}  // namespace

std::string_view NumberFormats::Surroundings::unit() const {
  std::string_view text = after.substr(std::min(after.find_first_not_of(' '), after.size()));
  return text.substr(0, text.find(" ("));  // a remark stands behind the unit
}

void NumberFormats::add(std::string_view section, std::string_view entry, const Format& format) {
  const bool showsTexts =
      format.kind == Format::Kind::Choice || !format.choices.empty() || !format.entries.empty();
  if (showsTexts || format.isHexadecimal) return;
  _entries[{std::string(section), std::string(entry)}].push_back({format.before, format.after});
}

const std::vector<NumberFormats::Surroundings>* NumberFormats::find(std::span<const std::string> path) const {
  for (std::size_t section = 0; section < path.size(); ++section) {
    for (std::size_t entry = section + 1; entry < path.size(); ++entry) {
      const auto found = _entries.find({path[section], path[entry]});
      if (found != _entries.end()) return &found->second;
    }
  }
  return nullptr;
}

std::string_view NumberFormats::unit(std::span<const std::string> path) const {
  const auto* const formats = find(path);
  if (!formats) return {};
  const std::string_view unit = formats->front().unit();
  const bool areAlike = std::ranges::all_of(
      *formats, [&](const Surroundings& surroundings) { return surroundings.unit() == unit; });
  return areAlike ? unit : std::string_view();
}

std::string_view NumberFormats::number(std::span<const std::string> path, std::string_view value) const {
  if (const auto* const formats = find(path)) {
    for (const Surroundings& surroundings : *formats) {
      const std::string_view number = numberBetween(surroundings.before, surroundings.after, value);
      if (!number.empty()) return number;
    }
  }
  return numberBetween({}, {}, value);
}

}  // namespace varnel

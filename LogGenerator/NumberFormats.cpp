#include "LogGenerator/NumberFormats.h"

#include <algorithm>
#include <optional>

namespace varnel {

namespace {

// An unsigned 32-bit number has no more digits. A longer text of digits is an identity, such as a SIM card's
// number.
constexpr std::size_t mostDigits = 10;

std::size_t leadingDigits(std::string_view text) {
  const auto isDigit = [](char c) { return c >= '0' && c <= '9'; };
  return static_cast<std::size_t>(std::ranges::find_if_not(text, isDigit) - text.begin());
}

// Whether the text is a decimal number that every program can read: digits without a leading 0, and maybe a
// fraction.
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

// The number between these two texts; empty when the text has another form.
std::string_view numberBetween(std::string_view before, std::string_view after, std::string_view text) {
  if (!text.starts_with(before)) return {};
  text.remove_prefix(before.size());
  if (!text.ends_with(after)) return {};
  text.remove_suffix(after.size());
  text.remove_prefix(std::min(text.find_first_not_of(' '), text.size()));  // blanks of a width
  if (text.starts_with('+')) text.remove_prefix(1);
  return isPlainNumber(text) ? text : std::string_view();
}

// What follows a name at the beginning of a path; nothing when the path begins with another name.
std::optional<std::string_view> behindName(std::string_view path, std::string_view name) {
  if (!path.starts_with(name)) return std::nullopt;
  path.remove_prefix(name.size());
  if (path.empty() || path.front() == '/' || path.front() == '[') return path;
  return std::nullopt;
}

// The path from its next name; empty when there is none.
std::string_view fromNextName(std::string_view path) {
  const std::size_t slash = path.find('/');
  return slash == std::string_view::npos ? std::string_view() : path.substr(slash + 1);
}

}  // namespace

std::string_view EntryFormats::Surroundings::unit() const {
  std::string_view text = after.substr(std::min(after.find_first_not_of(' '), after.size()));
  return text.substr(0, text.find(" ("));  // a remark follows the unit
}

std::string_view EntryFormats::unit() const {
  return !_formats || haveSeveralUnits() ? std::string_view() : _formats->front().unit();
}

bool EntryFormats::haveSeveralUnits() const {
  return _formats && std::ranges::any_of(*_formats, [this](const Surroundings& surroundings) {
           return surroundings.unit() != _formats->front().unit();
         });
}

std::string_view EntryFormats::unitOf(std::string_view value) const {
  if (!haveSeveralUnits()) return unit();
  const auto found = std::ranges::find_if(*_formats, [&](const Surroundings& surroundings) {
    return !numberBetween(surroundings.before, surroundings.after, value).empty();
  });
  return found == _formats->end() ? std::string_view() : found->unit();
}

std::string_view EntryFormats::number(std::string_view value) const {
  if (_formats) {
    for (const Surroundings& surroundings : *_formats) {
      const std::string_view number = numberBetween(surroundings.before, surroundings.after, value);
      if (!number.empty()) return number;
    }
  }
  return numberBetween({}, {}, value);
}

void NumberFormats::add(std::string_view section, std::string_view entry, const Format& format) {
  const bool showsTexts =
      format.kind == Format::Kind::Choice || !format.choices.empty() || !format.entries.empty();
  if (showsTexts || format.isHexadecimal) return;
  _sections[std::string(section)][std::string(entry)].push_back({format.before, format.after});
}

void NumberFormats::add(const NumberFormats& others) {
  for (const auto& [section, entries] : others._sections) {
    for (const auto& [entry, formats] : entries) {
      auto& known = _sections[section][entry];
      known.insert(known.end(), formats.begin(), formats.end());
    }
  }
}

EntryPlace NumberFormats::at(std::span<const std::string> path) const {
  for (std::size_t section = 0; section < path.size(); ++section) {
    const auto entries = _sections.find(path[section]);
    if (entries == _sections.end()) continue;
    for (std::size_t entry = section + 1; entry < path.size(); ++entry) {
      const auto found = entries->second.find(path[entry]);
      if (found != entries->second.end()) return {EntryFormats(found->second), entry + 1};
    }
  }
  return {};
}

EntryFormats NumberFormats::underSection(const Section& entries, std::string_view path) {
  for (path = fromNextName(path); !path.empty(); path = fromNextName(path)) {
    for (const auto& [name, formats] : entries) {
      if (behindName(path, name)) return EntryFormats(formats);
    }
  }
  return {};
}

EntryFormats NumberFormats::under(std::string_view path) const {
  if (path.starts_with('/')) path.remove_prefix(1);
  for (; !path.empty(); path = fromNextName(path)) {
    for (const auto& [name, entries] : _sections) {
      const auto rest = behindName(path, name);
      if (!rest) continue;
      const EntryFormats found = underSection(entries, *rest);
      if (found.areKnown()) return found;
    }
  }
  return {};
}

}  // namespace varnel

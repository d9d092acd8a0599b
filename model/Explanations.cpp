#include "model/Explanations.h"

#include <algorithm>
#include <charconv>

#include "base/Dictionary.h"

namespace varnel {

namespace {

constexpr std::string_view resourceName = "Explanations", rowsEntry = "Rows", levelsEntry = "Levels";
constexpr std::string_view anyRecord = "*", anyName = "**";
constexpr std::string_view simCard = "SIM ";

bool isNumber(std::string_view name) {
  return !name.empty() && std::ranges::all_of(name, [](char c) { return c >= '0' && c <= '9'; });
}

// Names are joined without what selects a record. A record itself is named "*", and a SIM card "SIM".
std::string withoutRecords(std::string_view path) {
  std::string plain;
  bool isRecord = false;
  for (bool isFirst = true; isFirst || !path.empty(); isFirst = false) {
    if (path.starts_with('/')) path.remove_prefix(1);
    std::string name;
    isRecord = false;
    while (!path.empty() && path.front() != '/') {
      const std::size_t end = path.front() == '[' ? path.find(']') : std::string_view::npos;
      if (end != std::string_view::npos) {
        path.remove_prefix(end + 1);
        isRecord = true;
      } else {
        name += path.front();
        path.remove_prefix(1);
      }
    }
    if (isNumber(name)) {
      isRecord = true;
      continue;
    }
    if (name.starts_with(simCard) && isNumber(std::string_view(name).substr(simCard.size())))
      name = simCard.substr(0, simCard.size() - 1);
    if (!plain.empty()) plain += '/';
    plain += name;
  }
  return isRecord ? plain.append("/").append(anyRecord) : plain;
}

std::string textIn(const Dictionary& entries, std::string_view key) {
  const std::string* const text = entries.get(key).string();
  return text ? *text : std::string();
}

std::optional<double> numberIn(const Dictionary& entries, std::string_view key) {
  if (const auto integer = entries.get(key).integer()) return static_cast<double>(*integer);
  return entries.get(key).real();
}

// Limits are whole numbers or have one decimal.
std::string limitText(double limit, const std::string& unit) {
  char text[32];
  char* const end = std::to_chars(text, text + sizeof text, limit).ptr;
  return std::string(text, end) + ' ' + unit;
}

}  // namespace

std::string_view nameOf(SignalLevel level) {
  constexpr std::string_view names[] = {"poor", "fair", "good", "excellent"};
  return names[static_cast<std::size_t>(level)];
}

std::string Explanation::text() const {
  std::string text = meaning + '\n';
  const auto add = [&](std::string_view label, std::string_view content) {
    if (!content.empty()) text.append(label).append(": ").append(content).append("\n");
  };
  add("Unit", unit);
  add("Usual", usual);
  if (limits) {
    add("Levels", "poor below " + limitText(limits->fair, unit) + ", fair from there, good from " +
                      limitText(limits->good, unit) + ", excellent from " +
                      limitText(limits->excellent, unit) + " (a rule of thumb, not a standard)");
  }
  add("Defined in", standard);
  return text;
}

std::optional<SignalLevel> Explanation::levelBy(const Limits& limits, double number) {
  if (number > limits.highest) return std::nullopt;
  if (number >= limits.excellent) return SignalLevel::Excellent;
  if (number >= limits.good) return SignalLevel::Good;
  return number >= limits.fair ? SignalLevel::Fair : SignalLevel::Poor;
}

Explanations::Explanations(const Resources& resources) : _resource(resources.propertyList(resourceName)) {}

const Value* Explanations::find(std::string_view path, std::string* key) const {
  const Dictionary* const all = _resource.dictionary();
  const Dictionary* const rows = all ? all->get(rowsEntry).dictionary() : nullptr;
  if (!rows) return nullptr;
  const std::string plain = withoutRecords(path);
  const auto findEndOf = [&](std::string_view names) -> const Value* {
    while (true) {
      if (rows->has(names)) {
        if (key) *key = names;
        return &rows->get(names);
      }
      const std::size_t slash = names.find('/');
      if (slash == std::string_view::npos) return nullptr;
      names.remove_prefix(slash + 1);
    }
  };
  if (const Value* const found = findEndOf(plain)) return found;
  // A name may have slashes of its own.
  for (std::size_t slash = plain.find('/'); slash != std::string::npos; slash = plain.find('/', slash + 1)) {
    const std::string any = plain.substr(0, slash + 1).append(anyName);
    const Value* const found = findEndOf(any);
    if (found) return found;
  }
  return nullptr;
}

std::optional<Explanation> Explanations::of(std::string_view path) const {
  const Value* const found = find(path, nullptr);
  if (!found) return std::nullopt;
  if (const std::string* const meaning = found->string()) return Explanation{*meaning, {}, {}, {}, {}};
  const Dictionary* const entries = found->dictionary();
  if (!entries) return std::nullopt;
  return Explanation{textIn(*entries, "Meaning"), textIn(*entries, "Unit"), textIn(*entries, "Usual"),
                     textIn(*entries, "Standard"), limitsNamed(textIn(*entries, "Level"))};
}

std::optional<Explanation::Limits> Explanations::limitsOf(std::string_view path) const {
  const Value* const found = find(path, nullptr);
  const Dictionary* const entries = found ? found->dictionary() : nullptr;
  return entries ? limitsNamed(textIn(*entries, "Level")) : std::nullopt;
}

std::optional<Explanation::Limits> Explanations::limitsNamed(std::string_view name) const {
  const Dictionary* const levels = _resource.dictionary()->get(levelsEntry).dictionary();
  const Dictionary* const limits = levels ? levels->get(name).dictionary() : nullptr;
  if (!limits) return std::nullopt;
  const auto fair = numberIn(*limits, "Fair"), good = numberIn(*limits, "Good"),
             excellent = numberIn(*limits, "Excellent"), highest = numberIn(*limits, "Highest");
  if (!fair || !good || !excellent || !highest) return std::nullopt;
  return Explanation::Limits{*fair, *good, *excellent, *highest};
}

std::string Explanations::keyFor(std::string_view path) const {
  std::string key;
  find(path, &key);
  return key;
}

std::vector<std::string> Explanations::keys() const {
  std::vector<std::string> keys;
  const Dictionary* const all = _resource.dictionary();
  const Dictionary* const rows = all ? all->get(rowsEntry).dictionary() : nullptr;
  if (!rows) return keys;
  for (const Dictionary::Entry& row : *rows) keys.push_back(row.key);
  return keys;
}

std::optional<SignalLevel> Explanations::levelOf(std::string_view path, std::string_view value,
                                                 const EntryFormats& formats) const {
  const std::string_view text = formats.number(value);
  if (text.empty()) return std::nullopt;
  double number = 0;
  std::from_chars(text.data(), text.data() + text.size(), number);
  return levelOf(path, number, formats.unitOf(value));
}

std::optional<SignalLevel> Explanations::levelOf(std::string_view path, double number,
                                                 std::string_view unit) const {
  const auto limits = unit.empty() ? std::nullopt : limitsOf(path);
  return limits ? Explanation::levelBy(*limits, number) : std::nullopt;
}

}  // namespace varnel

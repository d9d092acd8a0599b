#include "app/RecordSummary.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>

#include "app/RecordIdentity.h"

namespace varnel {

namespace {

constexpr std::string_view separator = ", ";
constexpr std::string_view minus = "\u2212";
constexpr std::size_t mostOthers = 2;

// What a record without a level says, the first ones that it shows.
struct Other {
  std::string_view name, label;
};
constexpr Other othersOfIdentified[] = {
    {"APN", ""},
    {"State", ""},
    {"QCI", "QCI"},
    {"Candidate Priority", "Priority"},
    {"Status", ""},
    {"Filter RSCP", "RSCP"},
    {"RSSI", "RSSI"},
    {"TRCH BLER Measurement", "BLER"},
    {"CRC Received in Error", "Errors"},
    {"Block Errors", "Block Errors"},
};
// A message, for example. Its channel is that of the message.
constexpr Other othersOfUnidentified[] = {
    {"Name", ""},
    {"Channel", ""},
    {"Protocol", ""},
    {"Mobile Country Code", "MCC"},
    {"Mobile Network Code", "MNC"},
};

const std::string* textOf(const VarnelModelNode& record, std::string_view name) {
  for (const auto& child : *record.childNodes()) {
    if (child->value() && !child->value()->empty() && child->displayName() == name) return child->value();
  }
  return nullptr;
}

// A number below zero has the same sign everywhere in a summary.
std::string labeled(std::string_view label, std::string_view value) {
  std::string text(label);
  if (!text.empty()) text += ' ';
  if (value.size() > 1 && value[0] == '-' && value[1] >= '0' && value[1] <= '9') {
    text += minus;
    value.remove_prefix(1);
  }
  return text.append(value);
}

void addOthers(std::vector<std::string>& parts, const VarnelModelNode& record) {
  const auto add = [&](const auto& others) {
    std::size_t count = 0;
    for (const Other& other : others) {
      const std::string* const text = textOf(record, other.name);
      if (!text) continue;
      parts.push_back(labeled(other.label, *text));
      if (++count == mostOthers) return;
    }
  };
  parts.empty() ? add(othersOfUnidentified) : add(othersOfIdentified);
  if (!parts.empty()) return;
  for (const auto& child : *record.childNodes()) {
    if (!child->value() || child->value()->empty()) continue;
    parts.push_back(labeled(child->displayName(), *child->value()));
    if (parts.size() == mostOthers) return;
  }
}

// With one decimal at most, so that there is room for it.
std::string shortText(const RecordSummaries::Level& level) {
  const std::string number(level.number);
  const int decimals = number.find('.') == std::string::npos ? 0 : 1;
  char digits[64];
  std::snprintf(digits, sizeof digits, "%.*f", decimals, std::fabs(std::strtod(number.c_str(), nullptr)));
  std::string text(digits);
  const bool isZero = std::ranges::all_of(text, [](char c) { return c == '0' || c == '.'; });
  if (number.starts_with('-') && !isZero) text.insert(0, minus);
  return text.append(" ").append(level.unit);
}

bool contains(std::string_view text, std::string_view part) {
  return text.find(part) != std::string_view::npos;
}

// A list of LTE cells shows the power of the whole channel too, and that before the power of the cell.
constexpr std::string_view powerOfChannel = "RSSI";
bool isOfWholeChannel(std::string_view name) { return contains(name, powerOfChannel); }

// The power and the quality of what is received.
class MainLevels {
 public:
  void take(const std::string& name, const RecordSummaries::Level& level) {
    if (level.unit != "dBm") {
      if (!_quality) _quality = level;
    } else if (!_power || (_isOfWholeChannel && !isOfWholeChannel(name))) {
      _power = level;
      _isOfWholeChannel = isOfWholeChannel(name);
    }
  }
  void addTo(RecordSummary& summary) const {
    if (_power) {
      // It would be read as the power of the cell.
      summary.parts.push_back(labeled(_isOfWholeChannel ? powerOfChannel : "", shortText(*_power)));
      summary.level = _power->level;
    }
    if (!_quality) return;
    summary.parts.push_back(shortText(*_quality));
    if (!summary.level) summary.level = _quality->level;
  }

 private:
  std::optional<RecordSummaries::Level> _power, _quality;
  bool _isOfWholeChannel = false;
};

// Up to the last separator within the first `length` characters, and with it.
std::size_t wholeParts(std::string_view text, std::size_t length) {
  const std::size_t end = text.substr(0, length).rfind(separator);
  return end == std::string_view::npos ? 0 : end + separator.size();
}

}  // namespace

RecordSummaries::RecordSummaries(const VarnelModelNode& list, const VarnelModelNode& around)
    : _list(list), _around(around) {
  std::string first;
  bool isAlone = true;
  for (const auto& record : *list.childNodes()) {
    const std::string identity = identityOf(*record);
    if (identity.empty()) continue;
    if (first.empty()) {
      first = identity;
      continue;
    }
    const auto same = std::ranges::mismatch(first, identity).in1 - first.begin();
    const std::size_t length = wholeParts(first, static_cast<std::size_t>(same));
    _commonLength = isAlone ? length : std::min(_commonLength, length);
    if (_commonLength == 0) return;
    isAlone = false;
  }
}

std::string RecordSummaries::identityOf(const VarnelModelNode& record) const {
  return identityOfRecord(record, _list, _around).text;
}

RecordSummary RecordSummaries::of(const VarnelModelNode& record, const LevelReader& levelIn) const {
  RecordSummary summary;
  if (!record.childNodes()) return summary;
  if (const std::string identity = identityOf(record); !identity.empty())
    summary.parts.push_back(identity.substr(_commonLength));
  MainLevels levels;
  for (const auto& child : *record.childNodes()) {
    if (!child->value()) continue;
    if (const auto level = levelIn(*child)) levels.take(child->displayName(), *level);
  }
  levels.addTo(summary);
  if (!summary.level) addOthers(summary.parts, record);
  return summary;
}

}  // namespace varnel

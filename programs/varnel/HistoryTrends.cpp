#include "programs/varnel/HistoryTrends.h"

#include <algorithm>
#include <cstdio>
#include <map>

#include "host/FileIdentity.h"
#include "host/Printable.h"
#include "host/WholeFile.h"
#include "programs/shared/CsvField.h"
#include "programs/shared/Timestamps.h"

namespace varnel {

namespace {

std::string clockNameOf(const TimeZone& zone) {
  char text[32];
  const int minutes = zone.offsetSeconds / 60;
  std::snprintf(text, sizeof text, "UTC%c%02d:%02d", minutes < 0 ? '-' : '+', std::abs(minutes) / 60,
                std::abs(minutes) % 60);
  return minutes == 0 ? "UTC" : text;
}

// "/LTE/Neighbors/Cells[EARFCN 1300, PCI 16]/" is "LTE > Neighbors > Cells, EARFCN 1300, PCI 16".
std::string placeIn(std::string_view path) {
  std::string place;
  bool isInBrackets = false;
  for (const char c : path) {
    if (c == '/' && !isInBrackets) {
      if (!place.empty()) place += " > ";
    } else if (c == '[') {
      isInBrackets = true;
      place += ", ";
    } else if (c == ']') {
      isInBrackets = false;
    } else {
      place += c;
    }
  }
  if (place.ends_with(" > ")) place.resize(place.size() - 3);
  return place;
}

std::string numberText(double number, unsigned decimals) {
  char text[400];
  std::snprintf(text, sizeof text, "%.*f", static_cast<int>(decimals), number);
  return text;
}

}  // namespace

std::optional<std::string> HistoryTrends::clockName() const {
  if (!isDated()) return std::nullopt;
  return clockNameOf(_parts.clock ? _parts.clock->zoneAt(_parts.numbers.timeAt(whole().end)) : TimeZone());
}

TrendRow HistoryTrends::rowOf(ValueHistory::Number number) const {
  const std::string_view key = _parts.numbers.key(number), name = _parts.numbers.name(number);
  TrendRow row{std::string(key), printable(name), {}, printable(_parts.numbers.unit(number))};
  const auto nameStart = static_cast<std::size_t>(name.data() - key.data());
  // The row of a second record with the same key is another one.
  const std::string_view rest = key.substr(nameStart + name.size());
  if (rest.starts_with(" (")) row.name += printable(rest.substr(0, rest.find(')') + 1));
  row.place = printable(placeIn(key.substr(0, nameStart)));
  return row;
}

std::vector<TrendRow> HistoryTrends::rows() const {
  std::vector<TrendRow> rows;
  for (const auto number : _parts.numbers.series()) rows.push_back(rowOf(number));
  std::ranges::sort(rows, [](const TrendRow& one, const TrendRow& other) {
    return std::tie(one.place, one.name, one.key) < std::tie(other.place, other.name, other.key);
  });
  return rows;
}

std::optional<TrendRow> HistoryTrends::row(const std::string& key) const {
  const auto number = _parts.numbers.seriesOfKey(key);
  return number ? std::optional(rowOf(*number)) : std::nullopt;
}

TrendSource::Moment HistoryTrends::momentAt(Duration point) const {
  const Time time = _parts.numbers.timeAt(point);
  return {time, _parts.clock ? _parts.clock->zoneAt(time).offsetSeconds : 0};
}

std::vector<ValueHistory::Column> HistoryTrends::columns(const std::string& key, const Stretch& stretch,
                                                         std::size_t count) const {
  const auto number = _parts.numbers.seriesOfKey(key);
  return number ? _parts.numbers.columns(*number, stretch, count) : std::vector<ValueHistory::Column>(count);
}

ValueHistory::Summary HistoryTrends::summary(const std::string& key, const Stretch& stretch) const {
  const auto number = _parts.numbers.seriesOfKey(key);
  return number ? _parts.numbers.summary(*number, stretch) : ValueHistory::Summary();
}

std::vector<TrendSource::Event> HistoryTrends::events(const Stretch& stretch) const {
  std::vector<Event> events;
  for (const auto& found : _parts.events.in(stretch))
    events.push_back({found.at, found.event.kind, nameOf(found.event.kind), printable(textOf(found.event))});
  return events;
}

std::optional<TrendSource::Duration> HistoryTrends::playingPosition() const {
  const auto time = _parts.playedTime ? _parts.playedTime() : std::nullopt;
  return time ? _parts.numbers.pointAt(*time) : std::nullopt;
}

std::string HistoryTrends::remark() const {
  std::string remark = _parts.remark ? _parts.remark() : std::string();
  const auto add = [&](const std::string& sentence) {
    if (!remark.empty() && !sentence.empty()) remark += ". ";
    remark += sentence;
  };
  add(_parts.numbers.notice());
  if (_parts.events.lacksSome())
    add("Only the last " + std::to_string(EventHistory::mostEvents) + " events are marked");
  return remark;
}

std::optional<double> HistoryTrends::progress() const {
  return _parts.progress ? _parts.progress() : std::nullopt;
}

std::string HistoryTrends::table(std::span<const std::string> keys, const Stretch& stretch) const {
  std::string table = isDated() ? "Time" : "Seconds";
  // The samples of one display have the same time, and so the same line.
  std::map<std::pair<Duration, Time>, std::vector<std::string>> lines;
  for (std::size_t i = 0; i < keys.size(); ++i) {
    const auto number = _parts.numbers.seriesOfKey(keys[i]);
    const std::string unit(number ? _parts.numbers.unit(*number) : std::string_view());
    table += ',' + csvField(keys[i].substr(keys[i].starts_with('/') ? 1 : 0) +
                            (unit.empty() ? std::string() : " (" + unit + ")"));
    if (!number) continue;
    const unsigned decimals = _parts.numbers.summary(*number, stretch).decimals;
    for (const auto& sample : _parts.numbers.samples(*number, stretch)) {
      auto& fields = lines[{sample.at, sample.time}];
      fields.resize(keys.size());
      fields[i] = numberText(sample.value, decimals);
    }
  }
  table += '\n';
  for (const auto& [moment, fields] : lines) {
    table += isDated() ? timestamp(moment.second) : secondsText(moment.first - whole().begin);
    for (const std::string& field : fields) table += ',' + field;
    table += '\n';
  }
  return table;
}

std::string HistoryTrends::save(const std::string& path, std::string_view bytes) {
  const std::string input = _parts.input ? _parts.input() : std::string();
  if (!input.empty() && FileIdentity::ofPath(path).isSameFileAs(FileIdentity::ofPath(input)))
    return printable(path) + " was not written: it is the file that is open. Choose another name.";
  const auto error =
      writeWholeFile(path, {reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size()});
  if (!error) return {};
  return printable(path) + " was not written: " + error.message() + ".";
}

}  // namespace varnel

#include "programs/varnel-decode/GpxTrack.h"

#include <array>
#include <cerrno>
#include <charconv>
#include <stdexcept>
#include <string_view>
#include <system_error>

#include "LogGenerator/SortedKey.h"
#include "base/Dictionary.h"
#include "base/MessagePrefix.h"
#include "base/PropertyListText.h"
#include "host/OutputFile.h"
#include "platform/ModemReport.h"
#include "programs/shared/Timestamps.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;

// What was measured earlier belongs to another place.
constexpr auto oldestLevel = 10s;

// A row of the display that a point shows. With a list, it is that of the list's first record.
struct Row {
  std::string_view radio;  // in the description
  std::string_view group, section, list, entry;
};

constexpr Row rows[] = {
    {"LTE", "Modem", "LTE Cell", "", "EARFCN"},      {"LTE", "Modem", "LTE Cell", "", "Physical Cell ID"},
    {"LTE", "Modem", "LTE Cell", "", "RSRP"},        {"LTE", "Modem", "LTE Cell", "", "RSRQ"},
    {"LTE", "Modem", "LTE Cell", "", "SINR"},        {"LTE", "Modem", "LTE Cell", "", "RSSI"},
    {"NR", "Modem", "NR Cell", "", "NR-ARFCN"},      {"NR", "Modem", "NR Cell", "", "Physical Cell ID"},
    {"NR", "Modem", "NR Cell", "", "RSRP"},          {"NR", "Modem", "NR Cell", "", "RSRQ"},
    {"NR", "Modem", "NR Cell", "", "SINR"},          {"NR", "Modem", "NR Cell", "", "RSSI"},
    {"UMTS", "Modem", "UMTS Cell", "", "UARFCN"},    {"UMTS", "Modem", "UMTS Cell", "", "Scrambling Code"},
    {"UMTS", "Modem", "UMTS Cell", "", "RSCP"},      {"UMTS", "Modem", "UMTS Cell", "", "EcIo"},
    {"UMTS", "Modem", "UMTS Cell", "", "RSSI"},      {"GSM", "Modem", "GSM Cell", "", "ARFCN"},
    {"GSM", "Modem", "GSM Cell", "", "BSIC"},        {"GSM", "Modem", "GSM Cell", "", "RSSI"},
    {"CDMA2000", "Modem", "CDMA Cell", "", "PN"},    {"CDMA2000", "Modem", "CDMA Cell", "", "RSSI"},
    {"CDMA2000", "Modem", "CDMA Cell", "", "EcIo"},  {"CDMA2000", "Modem", "CDMA Cell", "", "SINR"},
    {"LTE", "LTE", "Measurements", "", "EARFCN"},    {"LTE", "LTE", "Measurements", "", "Physical Cell ID"},
    {"LTE", "LTE", "Measurements", "", "RSRP"},      {"LTE", "LTE", "Measurements", "", "RSRQ"},
    {"LTE", "LTE", "Measurements", "", "RSSI"},      {"LTE", "LTE", "Measurements", "", "SNR Rx0"},
    {"NR", "NR", "Cells", "Layers", "NR-ARFCN"},     {"NR", "NR", "Cells", "Layers", "Serving Cell"},
    {"NR", "NR", "Cells", "Layers", "RSRP Rx0"},     {"UMTS", "UMTS", "Active Set", "", "Scrambling Code"},
    {"UMTS", "UMTS", "Active Set", "", "RSCP"},      {"UMTS", "UMTS", "Active Set", "", "Energy Per Chip"},
    {"GSM", "GSM", "GSM Serving Cell", "", "ARFCN"}, {"GSM", "GSM", "GSM Serving Cell", "", "RSSI"},
};

// The entry of a sorted dictionary that is shown under this name.
const Value& shownUnder(const Dictionary& groups, std::string_view name) {
  static const Value nothing;
  for (const auto& [key, value] : groups)
    if (displayNameOfSortedKey(key) == name) return value;
  return nothing;
}

const Dictionary* firstRecord(const Value& list) {
  const Array* const records = list.array();
  return records && !records->empty() ? records->front().dictionary() : nullptr;
}

// What a row shows, and when that was written.
struct Shown {
  const std::string* text = nullptr;
  std::optional<Time> writtenAt{};
};

Shown shownIn(const Dictionary& groups, const Row& row, const WriteTimes& times) {
  const Dictionary* const sections = shownUnder(groups, row.group).dictionary();
  if (!sections) return {};
  const Value& section = sections->get(row.section);
  const Dictionary* const entries = section.dictionary();
  if (!entries) {
    const Dictionary* const record = firstRecord(section);
    return record ? Shown{record->get(row.entry).string(), times.refilledAt(*section.array())} : Shown{};
  }
  if (row.list.empty()) return {entries->get(row.entry).string(), times.writtenAt(*entries, row.entry)};
  const Dictionary* const record = firstRecord(entries->get(row.list));
  return record ? Shown{record->get(row.entry).string(), times.writtenAt(*entries, row.list)} : Shown{};
}

std::string escaped(std::string_view text) {
  std::string result;
  for (const char character : replacedWhereUnfit(Encoding::Xml, text)) {
    switch (character) {
      case '&':
        result += "&amp;";
        break;
      case '<':
        result += "&lt;";
        break;
      case '>':
        result += "&gt;";
        break;
      case '"':
        result += "&quot;";
        break;
      default:
        result += character;
    }
  }
  return result;
}

std::string fixed(double number, int decimals) {
  std::array<char, 64> room;
  const auto end = std::to_chars(room.begin(), room.end(), number, std::chars_format::fixed, decimals).ptr;
  return {room.begin(), end};
}

std::string element(std::string_view indent, std::string_view name, std::string_view text) {
  return std::string(indent)
      .append("<")
      .append(name)
      .append(">")
      .append(escaped(text))
      .append("</")
      .append(name)
      .append(">\n");
}

[[noreturn]] void failWithTemporaryFile(const char* what) {
  throw std::system_error(errno, std::generic_category(), what);
}

void append(std::FILE* file, std::string_view text) {
  if (std::fwrite(text.data(), 1, text.size(), file) != text.size())
    failWithTemporaryFile("cannot write a temporary file");
}

constexpr std::string_view beginning =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<gpx version=\"1.1\" creator=\"varnel-decode\" xmlns=\"http://www.topografix.com/GPX/1/1\" "
    "xmlns:varnel=\"urn:varnel:track:1\">\n";
constexpr std::string_view end = "</gpx>\n";
constexpr std::string_view segmentBegins = "    <trkseg>\n", segmentEnds = "    </trkseg>\n";

// A named output that fails on the first error.
class Output {
 public:
  explicit Output(const std::string& path) : _path(path), _file(path) { check(_file.open()); }
  void write(std::string_view text) {
    check(_file.write({reinterpret_cast<const std::uint8_t*>(text.data()), text.size()}));
  }
  void finish() { check(_file.finish()); }

 private:
  void check(std::error_code failure) const {
    if (failure) throw std::system_error(failure, "cannot write " + _path);
  }

  const std::string& _path;
  OutputFile _file;
};

void copy(std::FILE* from, Output& to) {
  if (std::fflush(from) != 0) failWithTemporaryFile("cannot write a temporary file");
  std::rewind(from);
  std::array<char, 65536> room;
  while (const std::size_t size = std::fread(room.data(), 1, room.size(), from))
    to.write({room.data(), size});
  if (std::ferror(from)) failWithTemporaryFile("cannot read a temporary file");
}

}  // namespace

void GpxTrack::take(ByteView bytes, std::optional<Time> time, Time now, const Value& display) {
  const auto message = LogMessage::framed(bytes);
  if (!message || message->logCode() != modemReport::logCode || !display.dictionary()) return;
  const auto report = _reports.read(message->packet());
  if (!report || !report->isKnown) return;
  const auto subscription = subscriptionOf(bytes).value_or(0);
  const auto position = modem::positionIn(*report->entries);
  const auto known = _tracks.find(subscription);
  if (!position) {
    // The modem has lost its position: no line joins the points before and after.
    if (known == _tracks.end() || !known->second.isInSegment) return;
    append(known->second.points.get(), segmentEnds);
    known->second.isInSegment = false;
    return;
  }
  Track& track = known == _tracks.end() ? _tracks[subscription] : known->second;
  if (!track.points) track.points.reset(std::tmpfile());
  if (!track.points) failWithTemporaryFile("cannot make a temporary file");
  // Several reports can tell of one fix.
  if (track.isInSegment && position->time && track.lastFix == position->time) return;
  track.lastFix = position->time;
  const Value& groups =
      subscription == 0 ? display : display.dictionary()->get(subscriptionName(subscription));
  addPoint(track, *position, position->time ? position->time : time, now, groups);
}

void GpxTrack::addPoint(Track& track, const modem::Position& position, std::optional<Time> time, Time now,
                        const Value& groups) {
  std::string text(track.isInSegment ? std::string_view() : segmentBegins);
  track.isInSegment = true;
  text.append("      <trkpt lat=\"").append(fixed(position.latitude, 7));
  text.append("\" lon=\"").append(fixed(position.longitude, 7)).append("\">\n");
  constexpr std::string_view indent = "        ";
  if (position.altitude_m) text += element(indent, "ele", fixed(*position.altitude_m, 1));
  if (time) text += element(indent, "time", timestamp(*time));

  std::string description, values;
  std::string_view radio;
  for (const Row& row : rows) {
    const Shown shown = groups.dictionary() ? shownIn(*groups.dictionary(), row, _writeTimes) : Shown{};
    if (!shown.text || shown.text->empty()) continue;
    if (shown.writtenAt && durationBetween(*shown.writtenAt, now) > oldestLevel) continue;
    description.append(description.empty() ? "" : ", ");
    if (row.radio != radio) description.append(row.radio).append(" ");
    radio = row.radio;
    description.append(row.entry).append(" ").append(*shown.text);
    const std::string_view whole = *shown.text;
    const std::size_t space = whole.find(' ');
    values.append("          <varnel:value path=\"").append(row.group).append("/").append(row.section);
    if (!row.list.empty()) values.append("/").append(row.list);
    values.append("/").append(row.entry).append("\"");
    if (space != std::string_view::npos)
      values.append(" unit=\"").append(escaped(whole.substr(space + 1))).append("\"");
    values.append(">").append(escaped(whole.substr(0, space))).append("</varnel:value>\n");
  }
  if (!description.empty()) text += element(indent, "desc", description);
  if (!position.source.empty()) text += element(indent, "src", position.source);
  if (!values.empty()) text.append("        <extensions>\n").append(values).append("        </extensions>\n");
  text += "      </trkpt>\n";
  append(track.points.get(), text);
}

void GpxTrack::finish(const std::string& inputName) {
  if (_tracks.empty())
    throw std::runtime_error(inputName + " has no positions, so " + _file +
                             " was not written; a server keeps them in recordings with --record-position");
  Output output(_file);
  output.write(beginning);
  for (const auto& [subscription, track] : _tracks) {
    output.write("  <trk>\n");
    const std::string card = subscription == 0 ? std::string() : ", " + subscriptionName(subscription);
    output.write(element("    ", "name", inputName + card));
    copy(track.points.get(), output);
    if (track.isInSegment) output.write(segmentEnds);
    output.write("  </trk>\n");
  }
  output.write(end);
  output.finish();
}

}  // namespace varnel

#include "programs/varnel-telephonyd/StatusText.h"

#include <charconv>
#include <cstdio>

#include "host/Printable.h"
#include "programs/varnel-telephonyd/MessageCounts.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;
using std::chrono::milliseconds;

std::string formatted(const char* format, auto... values) {
  char text[96];
  std::snprintf(text, sizeof text, format, values...);
  return text;
}

// Hours, minutes, and seconds, such as 0:01:12.345.
std::string clockText(milliseconds duration) {
  const long long ms = duration.count();
  return formatted("%lld:%02lld:%02lld.%03lld", ms / 3'600'000, ms / 60'000 % 60, ms / 1000 % 60, ms % 1000);
}

std::string secondsText(milliseconds duration) {
  return formatted("%lld.%03lld", static_cast<long long>(duration.count() / 1000),
                   static_cast<long long>(duration.count() % 1000));
}

std::string momentText(Time time) {
  const CalendarTime at = calendarTime(time);
  return formatted("%04lld-%02u-%02uT%02u:%02u:%02u.%03dZ", static_cast<long long>(at.year), at.month, at.day,
                   at.hour, at.minute, at.second, time.nanoseconds / 1'000'000);
}

// The shortest text that stands for this number.
std::string numberText(double number) {
  char text[32];
  const auto end = std::to_chars(std::begin(text), std::end(text), number).ptr;
  return std::string(text, end);
}

std::string line(const char* name, const std::string& text) { return formatted("%-12s", name) + text + '\n'; }

const char* stateOf(const ServerStatus& status) {
  if (status.isSeeking) return status.isPaused ? "seeking, then paused" : "seeking";
  return status.isPaused ? "paused" : "playing";
}

std::string messagesText(const ServerStatus& status) {
  return std::to_string(status.received) + " received, " + std::to_string(status.delivered) + " delivered, " +
         std::to_string(status.waiting) + " waiting, " + std::to_string(status.dropped) + " dropped, " +
         std::to_string(status.refused()) + " refused (" + std::to_string(status.tooLong) +
         " too long for the channel, " + std::to_string(status.notAskedFor) + " not asked for)";
}

std::string jsonString(std::string_view text) {
  std::string json = "\"";
  for (const char character : text) {
    if (character == '"' || character == '\\') json += '\\';
    if (static_cast<unsigned char>(character) < 0x20)
      json += formatted("\\u%04x", static_cast<unsigned>(character));
    else
      json += character;
  }
  return json + '"';
}

void appendMember(std::string& json, const char* name, const std::string& value) {
  json.append(json.ends_with('{') ? "" : ",").append(jsonString(name)).append(":").append(value);
}

std::string messagesJson(const ServerStatus& status) {
  std::string json = "{";
  appendMember(json, "received", std::to_string(status.received));
  appendMember(json, "delivered", std::to_string(status.delivered));
  appendMember(json, "waiting", std::to_string(status.waiting));
  appendMember(json, "dropped", std::to_string(status.dropped));
  appendMember(json, "refused", std::to_string(status.refused()));
  appendMember(json, "tooLong", std::to_string(status.tooLong));
  appendMember(json, "notAskedFor", std::to_string(status.notAskedFor));
  return json + '}';
}

// Reads a text piece by piece. Once a piece is missing, nothing more is read.
class Scanner {
 public:
  explicit Scanner(std::string_view text) : _rest(text) {}

  // A number with at most this many digits.
  std::int64_t digits(std::size_t most) {
    std::int64_t number = 0;
    std::size_t count = 0;
    for (; count < most && isDigit(); ++count) number = 10 * number + take() - '0';
    _isSound = _isSound && count > 0;
    return number;
  }
  // What follows a point, in milliseconds; 0 without one.
  milliseconds fraction() {
    if (!skip('.')) return 0ms;
    std::int64_t number = 0, unit = 100;
    for (_isSound = _isSound && isDigit(); isDigit(); unit /= 10) number += unit * (take() - '0');
    return milliseconds(number);
  }
  bool skip(char character) {
    if (_rest.empty() || _rest.front() != character) return false;
    _rest.remove_prefix(1);
    return true;
  }
  void expect(char character) { _isSound = skip(character) && _isSound; }
  bool isAtEnd() const { return _isSound && _rest.empty(); }

 private:
  bool isDigit() const { return !_rest.empty() && _rest.front() >= '0' && _rest.front() <= '9'; }
  char take() {
    const char character = _rest.front();
    _rest.remove_prefix(1);
    return character;
  }

  std::string_view _rest;
  bool _isSound = true;
};

std::optional<StreamPlace> readDuration(std::string_view text) {
  Scanner scanner(text);
  std::int64_t seconds = scanner.digits(10);
  for (int colons = 0; colons < 2 && scanner.skip(':'); ++colons) seconds = 60 * seconds + scanner.digits(2);
  const milliseconds fraction = scanner.fraction();
  if (!scanner.isAtEnd()) return std::nullopt;
  return std::chrono::seconds(seconds) + fraction;
}

std::optional<StreamPlace> readMoment(std::string_view text) {
  using namespace std::chrono;
  Scanner scanner(text);
  const auto number = [&scanner](std::size_t digits) { return static_cast<int>(scanner.digits(digits)); };
  const year year{number(4)};
  scanner.expect('-');
  const month month{static_cast<unsigned>(number(2))};
  scanner.expect('-');
  const day day{static_cast<unsigned>(number(2))};
  if (!scanner.skip('T')) scanner.expect(' ');
  const hours hour{number(2)};
  scanner.expect(':');
  const minutes minute{number(2)};
  seconds second{0};
  milliseconds fraction{0};
  if (scanner.skip(':')) {
    second = seconds(number(2));
    fraction = scanner.fraction();
  }
  scanner.skip('Z');
  const year_month_day date = year / month / day;
  if (!scanner.isAtEnd() || !date.ok() || hour >= days(1) || minute >= hours(1) || second > minutes(1))
    return std::nullopt;
  const auto moment = sys_days(date).time_since_epoch() + hour + minute + second;
  return Time{duration_cast<seconds>(moment).count(),
              static_cast<std::int32_t>(fraction.count()) * 1'000'000};
}

}  // namespace

std::string statusText(const ServerStatus& status) {
  const std::string name = status.name.empty() ? "" : " " + printable(status.name);
  std::string text = line("source", printable(status.source) + name);
  if (!status.modem.empty()) text += line("modem", printable(status.modem));
  text += line("technology", printable(status.technology));
  if (status.isPlayable)
    text += line("state", std::string(stateOf(status)) + ", speed " + numberText(status.speed));
  if (status.position) {
    const std::string of = status.length ? " of " + clockText(*status.length) : "";
    const std::string at = status.time ? ", " + dateDescription(*status.time) : "";
    text += line("position", clockText(*status.position) + of + at);
  }
  if (status.length && !status.position) text += line("length", clockText(*status.length));
  if (!status.recording.empty()) text += line("recording", printable(status.recording));
  text += line("channels", std::to_string(status.channels));
  text += line("clients", std::to_string(status.clients));
  text += line("messages", messagesText(status));
  if (status.badFrames) text += line("bad frames", std::to_string(*status.badFrames));
  return text;
}

std::string statusJson(const ServerStatus& status) {
  std::string json = "{";
  appendMember(json, "source", jsonString(status.source));
  if (!status.name.empty()) appendMember(json, "name", jsonString(status.name));
  if (!status.modem.empty()) appendMember(json, "modem", jsonString(status.modem));
  appendMember(json, "technology", jsonString(status.technology));
  if (!status.recording.empty()) appendMember(json, "recording", jsonString(status.recording));
  appendMember(json, "clients", std::to_string(status.clients));
  appendMember(json, "channels", std::to_string(status.channels));
  appendMember(json, "messages", messagesJson(status));
  if (status.badFrames) appendMember(json, "badFrames", std::to_string(*status.badFrames));
  if (status.isPlayable) {
    appendMember(json, "paused", status.isPaused ? "true" : "false");
    appendMember(json, "seeking", status.isSeeking ? "true" : "false");
    appendMember(json, "speed", numberText(status.speed));
  }
  if (status.position) appendMember(json, "position", secondsText(*status.position));
  if (status.length) appendMember(json, "length", secondsText(*status.length));
  if (status.time) appendMember(json, "time", jsonString(momentText(*status.time)));
  if (status.firstTime) appendMember(json, "firstTime", jsonString(momentText(*status.firstTime)));
  if (status.lastTime) appendMember(json, "lastTime", jsonString(momentText(*status.lastTime)));
  return json + '}';
}

std::optional<StreamPlace> readPlace(std::string_view text) {
  if (const auto duration = readDuration(text)) return duration;
  return readMoment(text);
}

}  // namespace varnel

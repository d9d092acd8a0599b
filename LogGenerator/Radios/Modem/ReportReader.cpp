#include "LogGenerator/Radios/Modem/ReportReader.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

#include "base/PropertyList.h"
#include "platform/ModemReport.h"

namespace varnel::modem {

namespace {

constexpr std::size_t longestText = 128;
constexpr std::int64_t from1970To2001_s = 978307200;

bool isControl(char character) {
  const auto byte = static_cast<unsigned char>(character);
  return byte < 0x20 || byte == 0x7F;
}

bool isDigit(char character) { return character >= '0' && character <= '9'; }

}  // namespace

std::optional<Report> ReportReader::read(const Packet& packet) {
  const ByteView payload = packet.payload();
  if (!_payload || !std::ranges::equal(payload, *_payload)) {
    if (!_payload) _payload.emplace();
    _payload->assign(payload.begin(), payload.end());
    _content.reset();  // frees the memory for the new one
    _content = readPropertyList(payload);
  }
  return last();
}

std::optional<Report> ReportReader::last() const {
  const Dictionary* const entries = _content ? _content->dictionary() : nullptr;
  if (!entries) return std::nullopt;
  const auto version =
      wholeNumber(*entries, modemReport::versionKey, 0, std::numeric_limits<std::uint32_t>::max());
  if (!version) return std::nullopt;
  return Report{{static_cast<std::uint32_t>(*version)}, *version == modemReport::version, entries};
}

std::optional<std::int64_t> wholeNumber(const Dictionary& entries, std::string_view key, std::int64_t least,
                                        std::int64_t most) {
  const auto found = entries.get(key).integer();
  return found && *found >= least && *found <= most ? found : std::nullopt;
}

std::optional<double> number(const Dictionary& entries, std::string_view key, double least, double most) {
  const Value& value = entries.get(key);
  auto found = value.real();
  if (const auto whole = value.integer()) found = static_cast<double>(*whole);
  return found && *found >= least && *found <= most ? found : std::nullopt;
}

std::string shortText(const Value& value) {
  const std::string* const text = value.string();
  if (!text || text->size() > longestText || std::ranges::any_of(*text, isControl)) return {};
  return *text;
}

std::string network(const Dictionary& entries) {
  constexpr std::size_t countryDigits = 3;
  const std::string* const digits = entries.get(modemReport::plmn).string();
  if (!digits || (digits->size() != 5 && digits->size() != 6) || !std::ranges::all_of(*digits, isDigit))
    return {};
  return digits->substr(0, countryDigits) + '-' + digits->substr(countryDigits);
}

std::optional<Position> positionIn(const Dictionary& report) {
  const Dictionary* const entries = report.get(modemReport::position).dictionary();
  if (!entries) return std::nullopt;
  const auto latitude = number(*entries, modemReport::latitude, -90, 90);
  const auto longitude = number(*entries, modemReport::longitude, -180, 180);
  if (!latitude || !longitude) return std::nullopt;
  Position position{.latitude = *latitude,
                    .longitude = *longitude,
                    .altitude_m = number(*entries, modemReport::altitude, -1000, 100000),
                    .time = std::nullopt,
                    .source = shortText(entries->get(modemReport::source))};
  if (const auto date = entries->get(modemReport::time).date())
    position.time = Time{from1970To2001_s + date->seconds, date->microseconds * 1000};
  return position;
}

}  // namespace varnel::modem

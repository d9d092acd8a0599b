#include "programs/varnel-decode/StatisticsSum.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string_view>

namespace varnel {

namespace {

using Json = nlohmann::ordered_json;

constexpr const char* countNames[] = {"Received", "Decoded", "Too Short",
                                      "Too Long", "Unknown", "Unknown Version"};

struct NoCount {};

// The library would turn -5 and 1.9 into other numbers.
std::uint64_t countIn(const Json& json) {
  if (!json.is_number_unsigned()) throw NoCount();
  return json.get<std::uint64_t>();
}

template <class Counts>
void addCounts(Counts& counts, const Json& json) {
  for (std::size_t i = 0; i < counts.size(); ++i) counts[i] += countIn(json.at(countNames[i]));
}

template <class Counts>
void setCounts(Json& json, const Counts& counts) {
  for (std::size_t i = 0; i < counts.size(); ++i) json[countNames[i]] = counts[i];
}

std::vector<std::uint64_t> numbersIn(std::string_view text) {
  std::vector<std::uint64_t> numbers;
  while (!text.empty()) {
    std::uint64_t number = 0;
    std::from_chars(text.data(), text.data() + text.size(), number);
    numbers.push_back(number);
    text.remove_prefix(std::min(text.find('.'), text.size() - 1) + 1);
  }
  return numbers;
}

constexpr std::uint64_t noLogCode = std::numeric_limits<std::uint64_t>::max();

}  // namespace

void StatisticsSum::add(std::istream& report, const std::string& name) {
  std::uint64_t number = 0;
  for (std::string line; std::getline(report, line);) {
    ++number;
    const auto refuse = [&] {
      throw std::runtime_error("line " + std::to_string(number) + " of " + name +
                               " is not one of --stats --format json");
    };
    try {
      addLine(line);
    } catch (const Json::exception&) {
      refuse();
    } catch (const NoCount&) {
      refuse();
    }
  }
}

void StatisticsSum::addLine(const std::string& line) {
  const Json json = Json::parse(line);
  _captures += json.contains("Captures") ? countIn(json.at("Captures")) : 1;
  for (const Json& message : json.at("Messages")) {
    const Json& code = message.at("Log Code");
    Messages& messages =
        _messages[{code.is_null() ? noLogCode : countIn(code), message.at("Name").get<std::string>()}];
    addCounts(messages.counts, message);
    for (const Json& version : message.at("Unknown Versions")) {
      const auto count = countIn(version.at("Messages"));
      if (version.at("Version").is_null()) {
        messages.otherVersions += count;
      } else {
        const auto text = version.at("Version").get<std::string>();
        messages.versions[{numbersIn(text), text}] += count;
      }
    }
  }
  for (const auto& [kind, count] : json.at("Frames").items()) {
    auto found = std::ranges::find(_frames, kind, &std::pair<std::string, std::uint64_t>::first);
    if (found == _frames.end()) found = _frames.insert(found, {kind, 0});
    found->second += countIn(count);
  }
  _noiseBytes += countIn(json.at("Noise Bytes"));
  for (const Json& card : json.at("SIM")) {
    const Json& number = card.at("Number");
    _cards[number.is_null() ? std::nullopt : std::optional(countIn(number))] += countIn(card.at("Records"));
  }
  addCounts(_total, json.at("Total"));
}

std::string StatisticsSum::asJson() const {
  Json json;
  json["Captures"] = _captures;
  Json& all = json["Messages"] = Json::array();
  for (const auto& [kind, messages] : _messages) {
    Json message;
    message["Name"] = kind.second;
    message["Log Code"] = kind.first == noLogCode ? Json() : Json(kind.first);
    setCounts(message, messages.counts);
    Json& versions = message["Unknown Versions"] = Json::array();
    for (const auto& [version, count] : messages.versions)
      versions.push_back({{"Version", version.second}, {"Messages", count}});
    if (messages.otherVersions > 0)
      versions.push_back({{"Version", nullptr}, {"Messages", messages.otherVersions}});
    all.push_back(std::move(message));
  }
  Json& frames = json["Frames"] = Json::object();
  for (const auto& [kind, count] : _frames) frames[kind] = count;
  json["Noise Bytes"] = _noiseBytes;
  Json& cards = json["SIM"] = Json::array();
  for (const auto& [number, records] : _cards)
    cards.push_back({{"Number", number ? Json(*number) : Json()}, {"Records", records}});
  setCounts(json["Total"], _total);
  return json.dump(-1, ' ', false, Json::error_handler_t::replace) + '\n';
}

}  // namespace varnel

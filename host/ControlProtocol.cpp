#include "host/ControlProtocol.h"

#include <algorithm>
#include <iterator>

#include "base/Dictionary.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {

using Command = ControlRequest::Command;

constexpr struct {
  Command command;
  std::string_view name;
} commandNames[] = {
    {Command::Status, "Status"},     {Command::Pause, "Pause"}, {Command::Continue, "Continue"},
    {Command::SetSpeed, "SetSpeed"}, {Command::Seek, "Seek"},   {Command::SetTechnology, "SetTechnology"},
    {Command::Stop, "Stop"},
};

constexpr std::string_view commandKey = "Command", speedKey = "Speed", positionKey = "Position",
                           timeKey = "Time", technologyKey = "Technology", errorKey = "Error",
                           playableKey = "Playable", pausedKey = "Paused", seekingKey = "Seeking",
                           lengthKey = "Length", firstTimeKey = "FirstTime", lastTimeKey = "LastTime",
                           badFramesKey = "BadFrames";

constexpr struct {
  std::string_view key;
  std::string ServerStatus::*text;
} texts[] = {
    {"Source", &ServerStatus::source},       {"Name", &ServerStatus::name},
    {"Modem", &ServerStatus::modem},         {technologyKey, &ServerStatus::technology},
    {"Recording", &ServerStatus::recording},
};

constexpr struct {
  std::string_view key;
  std::uint64_t ServerStatus::*number;
} numbers[] = {
    {"Clients", &ServerStatus::clients},   {"Channels", &ServerStatus::channels},
    {"Received", &ServerStatus::received}, {"Delivered", &ServerStatus::delivered},
    {"Waiting", &ServerStatus::waiting},   {"Dropped", &ServerStatus::dropped},
    {"TooLong", &ServerStatus::tooLong},   {"NotAskedFor", &ServerStatus::notAskedFor},
};

constexpr struct {
  std::string_view key;
  std::optional<std::chrono::milliseconds> ServerStatus::*duration;
} durations[] = {{positionKey, &ServerStatus::position}, {lengthKey, &ServerStatus::length}};

constexpr struct {
  std::string_view key;
  std::optional<Time> ServerStatus::*time;
} times[] = {{timeKey, &ServerStatus::time},
             {firstTimeKey, &ServerStatus::firstTime},
             {lastTimeKey, &ServerStatus::lastTime}};

Value integer(std::uint64_t number) { return Value::ofInteger(static_cast<std::int64_t>(number)); }

std::uint64_t count(const Value& value) {
  const auto number = value.integer();
  return number && *number > 0 ? static_cast<std::uint64_t>(*number) : 0;
}

// Seconds and nanoseconds.
Value valueOf(Time time) {
  return Value::ofArray({Value::ofInteger(time.seconds), Value::ofInteger(time.nanoseconds)});
}

std::optional<Time> timeIn(const Value& value) {
  const Array* const parts = value.array();
  if (!parts || parts->size() != 2) return std::nullopt;
  const auto seconds = (*parts)[0].integer(), nanoseconds = (*parts)[1].integer();
  if (!seconds || !nanoseconds || *nanoseconds < 0 || *nanoseconds > 999'999'999) return std::nullopt;
  return Time{*seconds, static_cast<std::int32_t>(*nanoseconds)};
}

std::optional<std::chrono::milliseconds> durationIn(const Value& value) {
  const auto number = value.integer();
  // Longer ones could not be added to a time.
  constexpr std::int64_t longest = std::int64_t{1} << 50;
  if (!number || *number < 0 || *number > longest) return std::nullopt;
  return std::chrono::milliseconds(*number);
}

std::optional<StreamPlace> placeIn(const Dictionary& request) {
  if (const auto position = durationIn(request.get(positionKey))) return *position;
  if (const auto time = timeIn(request.get(timeKey))) return *time;
  return std::nullopt;
}

Value propertyList(const ServerStatus& status) {
  Value list = Value::ofDictionary();
  Dictionary& fields = *list.dictionary();
  for (const auto& [key, text] : texts) fields.set(key, status.*text);
  for (const auto& [key, number] : numbers) fields.set(key, integer(status.*number));
  if (status.badFrames) fields.set(badFramesKey, integer(*status.badFrames));
  fields.set(playableKey, Value::ofBoolean(status.isPlayable));
  fields.set(pausedKey, Value::ofBoolean(status.isPaused));
  fields.set(seekingKey, Value::ofBoolean(status.isSeeking));
  fields.set(speedKey, Value::ofReal(status.speed));
  for (const auto& [key, duration] : durations)
    if (status.*duration) fields.set(key, Value::ofInteger((status.*duration)->count()));
  for (const auto& [key, time] : times)
    if (status.*time) fields.set(key, valueOf(*(status.*time)));
  return list;
}

ServerStatus statusIn(const Dictionary& fields) {
  ServerStatus status;
  for (const auto& [key, text] : texts)
    if (const std::string* const found = fields.get(key).string()) status.*text = *found;
  for (const auto& [key, number] : numbers) status.*number = count(fields.get(key));
  if (fields.get(badFramesKey).integer()) status.badFrames = count(fields.get(badFramesKey));
  status.isPlayable = fields.get(playableKey).boolean().value_or(false);
  status.isPaused = fields.get(pausedKey).boolean().value_or(false);
  status.isSeeking = fields.get(seekingKey).boolean().value_or(false);
  status.speed = fields.get(speedKey).real().value_or(1);
  for (const auto& [key, duration] : durations) status.*duration = durationIn(fields.get(key));
  for (const auto& [key, time] : times) status.*time = timeIn(fields.get(key));
  return status;
}

Value propertyList(const ControlRefusal& refusal) {
  Value list = Value::ofDictionary();
  list.dictionary()->set(errorKey, refusal.sentence);
  return list;
}

}  // namespace

namespace controlProtocol {

Bytes writeRequest(const ControlRequest& request) {
  const Value list = Value::ofDictionary();
  Dictionary& fields = *list.dictionary();
  const auto* const named =
      std::ranges::find(commandNames, request.command, [](auto& row) { return row.command; });
  fields.set(commandKey, named->name);
  if (request.command == Command::SetSpeed) fields.set(speedKey, Value::ofReal(request.speed));
  if (request.command == Command::SetTechnology) fields.set(technologyKey, request.technology);
  if (request.command == Command::Seek) {
    if (const auto* const position = std::get_if<std::chrono::milliseconds>(&request.place))
      fields.set(positionKey, Value::ofInteger(position->count()));
    else
      fields.set(timeKey, valueOf(std::get<Time>(request.place)));
  }
  // A technology may come from a command line, as bytes that no property list can hold.
  return writeXmlPropertyList(list).value_or(Bytes());
}

std::optional<ControlRequest> readRequest(ByteView bytes) {
  if (bytes.size() > longestRequest) return std::nullopt;
  const auto list = readPropertyList(bytes);
  const Dictionary* const fields = list ? list->dictionary() : nullptr;
  const std::string* const name = fields ? fields->get(commandKey).string() : nullptr;
  if (!name) return std::nullopt;
  const auto* const named = std::ranges::find(commandNames, *name, [](auto& row) { return row.name; });
  if (named == std::end(commandNames)) return std::nullopt;
  ControlRequest request{.command = named->command};
  if (request.command == Command::SetSpeed) {
    const auto speed = fields->get(speedKey).real();
    if (!speed) return std::nullopt;
    request.speed = *speed;
  }
  if (request.command == Command::SetTechnology) {
    const std::string* const technology = fields->get(technologyKey).string();
    if (!technology) return std::nullopt;
    request.technology = *technology;
  }
  if (request.command == Command::Seek) {
    const auto place = placeIn(*fields);
    if (!place) return std::nullopt;
    request.place = *place;
  }
  return request;
}

Bytes writeReply(const ControlReply& reply) {
  const auto write = [](const auto& content) { return writeXmlPropertyList(propertyList(content)); };
  if (auto bytes = std::visit(write, reply)) return *std::move(bytes);
  // The name of a file can be bytes that no property list can hold.
  ServerStatus status = std::get<ServerStatus>(reply);
  status.name.clear();
  status.recording.clear();
  return writeXmlPropertyList(propertyList(status)).value();
}

std::optional<ControlReply> readReply(ByteView bytes) {
  const auto list = readPropertyList(bytes);
  const Dictionary* const fields = list ? list->dictionary() : nullptr;
  if (!fields) return std::nullopt;
  if (const std::string* const error = fields->get(errorKey).string()) return ControlRefusal{*error};
  return statusIn(*fields);
}

}  // namespace controlProtocol

}  // namespace varnel

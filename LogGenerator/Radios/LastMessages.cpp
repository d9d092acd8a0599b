#include "LogGenerator/Radios/LastMessages.h"

#include <algorithm>
#include <cstdint>
#include <string>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/PacketVersion.h"

namespace varnel {

namespace {

constexpr std::string_view listEntry = "Messages";

// The text of a time with its milliseconds: a modem sends many messages per second. Its date and time of day
// are made only once for messages of one second.
class TimeText {
 public:
  std::string_view of(Time time) {
    constexpr std::string_view zone = " +0000";
    constexpr int nanosecondsPerMillisecond = 1'000'000;
    if (_text.empty() || time.seconds != _seconds) {
      _seconds = time.seconds;
      _text = dateDescription(time);
      _fraction = _text.size() - zone.size();
      _text.insert(_fraction, ".000");
    }
    int rest = time.nanoseconds / nanosecondsPerMillisecond;
    for (const std::size_t digit : {3, 2, 1}) {
      _text.at(_fraction + digit) = static_cast<char>('0' + rest % 10);
      rest /= 10;
    }
    return _text;
  }

 private:
  std::string _text;
  std::size_t _fraction = 0;  // where it begins, with its point
  std::int64_t _seconds = 0;
};

std::string_view cellLabel(AirMessage::Radio radio) {
  return radio == AirMessage::Radio::UMTS ? "Scrambling Code" : "Physical Cell ID";
}

}  // namespace

void LastMessages::take(const AirMessageReading& reading) {
  if (reading.version) _version = {*reading.version, reading.fate.outcome == MessageFate::Outcome::Decoded};
  if (!reading.message) return;
  Received& received = _received.at(_next);
  received = {sectionRef.time(), *reading.message, reading.message->bytes.size()};
  received.message.bytes = {};
  _next = (_next + 1) % greatestCount;
  _count = std::min(_count + 1, greatestCount);
}

void LastMessages::prepareDisplay(const Time& /*now*/) {
  if (_version) {
    const auto& [number, isKnown] = *_version;
    sectionRef.setText(versionEntry, isKnown ? number.text() : number.unknownText());
    _version.reset();
  }
  if (_count == 0) return;
  Array list;
  list.reserve(greatestCount);
  TimeText text;
  for (std::size_t age = 1; age <= _count; ++age) {
    const Received& received = _received.at((_next + greatestCount - age) % greatestCount);
    list.push_back(recordOf(received, text.of(received.time)));
  }
  _count = 0;
  const Dictionary* const entries = sectionRef.container().dictionary();
  if (!entries) return;
  const Value shown = entries->get(listEntry);
  if (Array* const older = shown.array()) {
    for (const Value& record : *older) {
      if (list.size() == greatestCount) break;
      list.push_back(record);
    }
    replaceArray_With(*older, std::move(list));
    sectionRef.set(listEntry, shown);  // notes when
  } else {
    sectionRef.set(listEntry, Value::ofArray(std::move(list)));
  }
}

Value LastMessages::recordOf(const Received& received, std::string_view time) {
  const AirMessage& message = received.message;
  constexpr std::size_t entryCount = 10;
  Value record = Value::ofDictionary();
  Dictionary& entries = *record.dictionary();
  entries.reserve(entryCount);
  entries.add("Time", time);
  entries.add("Radio", nameOf(message.radio));
  entries.add("Protocol", nameOf(message.protocol));
  if (message.direction != AirMessage::Direction::Unknown)
    entries.add("Direction", nameOf(message.direction));
  if (!message.channel.empty()) entries.add("Channel", message.channel);
  entries.add("Name", message.name);
  if (message.channelNumber)
    entries.add(channelNumberName(message.radio), std::to_string(*message.channelNumber));
  if (message.physicalCell) entries.add(cellLabel(message.radio), std::to_string(*message.physicalCell));
  if (message.frame) entries.add("System Frame Number", std::to_string(*message.frame));
  entries.add("Length", std::to_string(received.length));
  return record;
}

}  // namespace varnel

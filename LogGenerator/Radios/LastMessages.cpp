#include "LogGenerator/Radios/LastMessages.h"

#include <algorithm>
#include <cstdio>
#include <string>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/PacketVersion.h"

namespace varnel {

namespace {

constexpr std::string_view listEntry = "Messages";

// A modem sends many messages per second, so the text has milliseconds before its time zone.
std::string timeText(Time time) {
  constexpr std::string_view zone = " +0000";
  constexpr int nanosecondsPerMillisecond = 1'000'000;
  char fraction[16];
  std::snprintf(fraction, sizeof fraction, ".%03d", time.nanoseconds / nanosecondsPerMillisecond);
  std::string text = dateDescription(time);
  return text.insert(text.size() - zone.size(), fraction);
}

std::string_view cellLabel(AirMessage::Radio radio) {
  return radio == AirMessage::Radio::UMTS ? "Scrambling Code" : "Physical Cell ID";
}

}  // namespace

void LastMessages::take(const AirMessageReading& reading) {
  if (reading.version) {
    const Version version{*reading.version, reading.fate.outcome == MessageFate::Outcome::Decoded};
    if (version != _version || !showsVersion()) {
      _version = version;
      showVersion();
    }
  }
  if (!reading.message) return;
  Received& received = _received.at(_next);
  received = {sectionRef.time(), *reading.message, reading.message->bytes.size()};
  received.message.bytes = {};
  _next = (_next + 1) % greatestCount;
  _count = std::min(_count + 1, greatestCount);
}

bool LastMessages::showsVersion() const {
  const Dictionary* const entries = sectionRef.container().dictionary();
  const std::string* const text = entries ? entries->get(versionEntry).string() : nullptr;
  return text && !text->empty();
}

void LastMessages::showVersion() {
  if (!_version) return;
  const auto& [number, isKnown] = *_version;
  sectionRef.setText(versionEntry, isKnown ? number.text() : number.unknownText());
}

void LastMessages::prepareDisplay(const Time& /*now*/) {
  if (_count == 0) return;
  showVersion();
  Array list;
  list.reserve(greatestCount);
  for (std::size_t age = 1; age <= _count; ++age)
    list.push_back(recordOf(_received.at((_next + greatestCount - age) % greatestCount)));
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

Value LastMessages::recordOf(const Received& received) {
  const auto& [time, message, length] = received;
  constexpr std::size_t entryCount = 10;
  Value record = Value::ofDictionary();
  Dictionary& entries = *record.dictionary();
  entries.reserve(entryCount);
  entries.add("Time", timeText(time));
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
  entries.add("Length", std::to_string(length));
  return record;
}

}  // namespace varnel

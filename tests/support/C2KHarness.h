#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {

/// The display variables of CDMA2000 modems.
inline constexpr const char* c2kVariables[] = {
    "kChannel",         "k1xEVDODeviceState",
    "kBandClass",       "kRxAGC0",
    "kRxAGC1",          "kTxAGC",
    "kServingPNOffset", "kSessionState",
    "kUATI24",          "kColorCode",
    "kActiveSetPilots", "kFingerC2I",
    "k1xDeviceState",   "k1xRx0BandClass",
    "k1xRx0ChanNum",    "k1xRxAGC0",
    "k1xRx1BandClass",  "k1xRx1ChanNum",
    "k1xRxAGC1",        "k1xTxAGC",
    "k1xActiveSetInfo", "k1xTrafficFER",
    "k1xRoamingHome",   "kSystemId",
    "kNetworkId",       "kPacketZoneId",
    "kBaseId",          "kProtocolRevision",
    "kFLDataRate",      "kRLDataRate",
};

/// A generator whose variables are all in one dictionary, under their own names. The dictionary is emptied
/// before each message. So afterwards it shows what the message published, and in which order.
class C2KTest : public testing::Test {
 protected:
  C2KTest() {
    const Value lookup = Value::ofDictionary();
    for (const char* variable : c2kVariables) {
      lookup.dictionary()->set(variable,
                               Value::ofArray({dictionaryOf({{"key", variable}, {"dict", display}})}));
    }
    state.set("Display", display);
    state.set("Lookup", lookup);
    state.set("ExtraInfo", extraInfo);
    log.take();
  }

  /// What the message publishes. The log keeps its lines.
  std::string published(const Bytes& message) {
    *display.dictionary() = {};
    log.take();
    generator.updateState_withData(state, message);
    return described(display);
  }
  /// What the message publishes for one variable; absent when it publishes nothing for it.
  std::string published(const Bytes& message, std::string_view variable) {
    published(message);
    return described(display.dictionary()->get(variable));
  }

  /// Expects the message to publish nothing and to log only this line, or no line if it is empty.
  void expectRefused(const Bytes& message, const std::string& line) {
    EXPECT_EQ(published(message), "{}") << message.size() << " bytes";
    EXPECT_EQ(log.takeTexts(), line.empty() ? std::vector<std::string>() : std::vector<std::string>{line})
        << message.size() << " bytes";
  }

  /// Sends the packet cut at every shorter length. The check gets the length, what was published, and the
  /// logged lines. Each time the state is the same as before.
  void forEachTruncation(
      const Bytes& packet,
      const std::function<void(std::size_t, const std::string&, const std::vector<std::string>&)>& check) {
    const Dictionary before = state;
    for (std::size_t size = packet.size(); size-- > 0;) {
      SCOPED_TRACE(std::to_string(size) + " bytes");
      state = before;
      *extraInfo.dictionary() = {};
      const std::string shown = published(Bytes(packet.data(), packet.data() + size));
      check(size, shown, log.takeTexts());
    }
  }

  /// The bytes of the messages since the last call, as the next display state will hold them.
  std::string collected() {
    generator.generateLogUsingState(state);
    return described(state.get("DisplayState"));
  }

  RecordingLog log;
  TestServices host;
  C2KLogGenerator generator{host.services};
  const Value display = Value::ofDictionary();
  const Value extraInfo = Value::ofDictionary();
  Dictionary state;
};

/// A packet of log type 1 with subpackets one after the other from offset 17.
class SubpacketBuilder {
 public:
  /// A subpacket with this id. Its size is that of its bytes, which begin with its header.
  SubpacketBuilder& add(std::uint8_t id, std::size_t size) {
    return add(id, size, static_cast<std::uint16_t>(size));
  }
  /// A subpacket that claims a wrong size.
  SubpacketBuilder& add(std::uint8_t id, std::size_t size, std::uint16_t claimedSize) {
    _start = _bytes.size();
    _bytes.resize(_start + size);
    ++_bytes[14];
    return u8(0, id).u16(2, claimedSize);
  }
  /// Writes a value at an offset within the last subpacket.
  SubpacketBuilder& u8(std::size_t offset, std::uint8_t value) {
    _bytes.at(_start + offset) = value;
    return *this;
  }
  SubpacketBuilder& u16(std::size_t offset, std::uint16_t value) {
    return u8(offset, static_cast<std::uint8_t>(value)).u8(offset + 1, static_cast<std::uint8_t>(value >> 8));
  }
  /// Sets all bytes after the header of the last subpacket.
  SubpacketBuilder& fill(std::uint8_t byte) {
    for (std::size_t at = _start + 4; at < _bytes.size(); ++at) _bytes[at] = byte;
    return *this;
  }
  /// Claims a wrong number of subpackets.
  SubpacketBuilder& count(std::uint8_t number) {
    _bytes[14] = number;
    return *this;
  }
  /// Adds bytes after the last subpacket.
  SubpacketBuilder& pad(std::size_t size, std::uint8_t byte = 0) {
    _bytes.resize(_bytes.size() + size, byte);
    return *this;
  }

  explicit SubpacketBuilder(std::uint32_t logCode) : _bytes(PacketBuilder(logCode, 17).bytes()) {}
  Bytes bytes() const { return _bytes; }

 private:
  Bytes _bytes;
  std::size_t _start = 17;
};

}  // namespace varnel

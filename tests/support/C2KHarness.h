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

/// A generator whose variables all lie in one dictionary, under their own names. The dictionary is emptied
/// before each message, so afterwards it tells what the message published, in which order.
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

  /// What the message publishes; the log keeps its lines.
  std::string published(const Bytes& message) {
    *display.dictionary() = {};
    log.take();
    generator.updateState_withData(state, message);
    return described(display);
  }
  /// What the message shows for one variable; absent when it does not publish it.
  std::string published(const Bytes& message, std::string_view variable) {
    published(message);
    return described(display.dictionary()->get(variable));
  }

  /// Expects the message to publish nothing and to log this line alone, or none when it is empty.
  void expectRefused(const Bytes& message, const std::string& line) {
    EXPECT_EQ(published(message), "{}") << message.size() << " bytes";
    EXPECT_EQ(log.takeTexts(), line.empty() ? std::vector<std::string>() : std::vector<std::string>{line})
        << message.size() << " bytes";
  }

  /// Hands over what is left of the packet at every shorter length. The check gets the length, what was
  /// published and the lines that were logged. Each time the state is as it was before.
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

  /// The bytes of the messages since the last call, as the next display state holds them.
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

/// A packet of type 1 with sub-packets one behind the other from offset 17 on.
class SubpacketBuilder {
 public:
  /// A sub-packet of that id whose size is that of its bytes, which begin with its header.
  SubpacketBuilder& add(std::uint8_t id, std::size_t size) {
    return add(id, size, static_cast<std::uint16_t>(size));
  }
  /// A sub-packet that claims another size than it has.
  SubpacketBuilder& add(std::uint8_t id, std::size_t size, std::uint16_t claimedSize) {
    _start = _bytes.size();
    _bytes.resize(_start + size);
    ++_bytes[14];
    return u8(0, id).u16(2, claimedSize);
  }
  /// Puts a value into the sub-packet that was added last, at an offset within it.
  SubpacketBuilder& u8(std::size_t offset, std::uint8_t value) {
    _bytes.at(_start + offset) = value;
    return *this;
  }
  SubpacketBuilder& u16(std::size_t offset, std::uint16_t value) {
    return u8(offset, static_cast<std::uint8_t>(value)).u8(offset + 1, static_cast<std::uint8_t>(value >> 8));
  }
  /// Puts the byte everywhere behind its header.
  SubpacketBuilder& fill(std::uint8_t byte) {
    for (std::size_t at = _start + 4; at < _bytes.size(); ++at) _bytes[at] = byte;
    return *this;
  }
  /// Says another number of sub-packets than there are.
  SubpacketBuilder& count(std::uint8_t number) {
    _bytes[14] = number;
    return *this;
  }
  /// Puts bytes behind the last sub-packet.
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

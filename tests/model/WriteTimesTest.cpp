#include "LogGenerator/WriteTimes.h"

#include <gtest/gtest.h>

#include <memory>

#include "LogGenerator/LogGenerator.h"
#include "host/FileResources.h"
#include "platform/TelephonyService.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

constexpr Time noon{.seconds = 1'700'000'000};
constexpr Time later{.seconds = 1'700'000'003};

/// A generator with its shipped template, whose clock the test sets.
class WriteTimesTest : public testing::Test {
 protected:
  void start(std::string_view technology) {
    generator = LogGenerator::generatorFromTechnology(
        technology,
        {resources, host.services.clock, host.services.application, host.services.standardOutput});
  }
  void receive(const Bytes& message, const Time& now) {
    host.clock.set(now);
    generator->updateState_withData(state, message);
  }
  const Value& section(std::string_view name) const { return find(state.get(stateKey::display), name); }

  static const Value& find(const Value& object, std::string_view name) {
    static const Value absent;
    if (!object.dictionary()) return absent;
    if (object.dictionary()->has(name)) return object.dictionary()->get(name);
    for (const auto& [key, value] : *object.dictionary()) {
      if (const Value& found = find(value, name); !found.isAbsent()) return found;
    }
    return absent;
  }
  std::optional<Time> writtenAt(std::string_view sectionName, std::string_view entry) const {
    return generator->writtenAt(*section(sectionName).dictionary(), entry);
  }

  TestServices host;
  const FileResources resources{resourceFolder()};
  Dictionary state;
  std::unique_ptr<LogGenerator> generator;
};

TEST_F(WriteTimesTest, AnEntryIsAsOldAsTheLastPacketThatWroteIt) {
  start(technology::kalviLTE);
  receive(PacketBuilder(0xB0C2, 38).bytes(), noon);
  receive(PacketBuilder(0xB0C1, 22).bytes(), later);
  EXPECT_EQ(writtenAt("Serving Cell Info", "Physical Cell ID"), noon);
  EXPECT_EQ(writtenAt("Serving Cell Info", "Num Tx Antennas"), later);
  EXPECT_EQ(writtenAt("Serving Cell Info", "UARFCN"), std::nullopt);
  EXPECT_EQ(writtenAt("Serving Cell Measurements", "Version"), std::nullopt);
}

TEST_F(WriteTimesTest, APacketThatIsTooShortWritesNothing) {
  start(technology::kalviLTE);
  receive(PacketBuilder(0xB0C2, 38).bytes(), noon);
  receive(PacketBuilder(0xB0C2, 37).bytes(), later);
  EXPECT_EQ(writtenAt("Serving Cell Info", "Physical Cell ID"), noon);
}

TEST_F(WriteTimesTest, AListIsAsOldAsItsLastPacket) {
  start(technology::kalviLTE);
  receive(PacketBuilder(0xB179, 29).bytes(), noon);
  EXPECT_EQ(generator->refilledAt(*section("Detected Cells").array()), noon);
  EXPECT_EQ(generator->refilledAt(*section("Neighbor Cells List").array()), std::nullopt);
  EXPECT_EQ(generator->refilledAt(Array()), std::nullopt);
}

TEST_F(WriteTimesTest, AVariableIsWrittenInEveryPlaceAtOnce) {
  start(technology::kalviCDMA);
  receive(PacketBuilder(0x12B6, 25).bytes(), noon);
  const auto& display = *state.get(stateKey::display).dictionary();
  const Value& placement = state.get(stateKey::lookup).dictionary()->get("kActiveSetPilots").array()->front();
  const Dictionary& rows = *placement.dictionary()->get("dict").dictionary();
  EXPECT_EQ(generator->writtenAt(rows, *placement.dictionary()->get("key").string()), noon);
  EXPECT_EQ(generator->writtenAt(display, "nothing"), std::nullopt);
}

TEST_F(WriteTimesTest, TheWholePictureOfAnObjectIsAsOldAsItsMessage) {
  start(technology::ifxGSM);
  const Value object = Value::ofDictionary();
  object.dictionary()->set("RSSI", "-80");
  object.dictionary()->set("ARFCN", "62");
  receive(writeBinaryPropertyList(object).value(), noon);
  EXPECT_EQ(generator->writtenAt(*state.get(stateKey::display).dictionary(), "RSSI"), noon);
}

TEST_F(WriteTimesTest, NobodyKeepsATimeOfADisplayThatAnotherGeneratorMade) {
  start(technology::kalviLTE);
  receive(PacketBuilder(0xB0C2, 38).bytes(), noon);
  start(technology::kalviLTE);
  receive(PacketBuilder(0xB0C2, 38).bytes(), later);
  EXPECT_EQ(writtenAt("Serving Cell Info", "Physical Cell ID"), std::nullopt);
}

}  // namespace
}  // namespace varnel

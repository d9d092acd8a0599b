#include "LogGenerator/KLVLogGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

// The bytes of a report as far as they are not zero, by hand.
class Report {
 public:
  Report& put(std::size_t offset, std::initializer_list<std::uint8_t> bytes) {
    std::ranges::copy(bytes, _bytes.begin() + static_cast<std::ptrdiff_t>(offset));
    return *this;
  }
  Report& put(std::size_t offset, std::string_view text) {
    std::ranges::copy(text, _bytes.begin() + static_cast<std::ptrdiff_t>(offset));
    return *this;
  }
  std::string text() const { return described(_bytes); }
  Bytes with(std::initializer_list<std::uint8_t> more) const {
    Bytes longer = _bytes;
    longer.insert(longer.end(), more);
    return longer;
  }

 private:
  Bytes _bytes = Bytes(161);
};

Report beginning() { return Report().put(0, {0xA1, 0x00, 0xFD, 0x1F}); }

// A report with these texts and zeros for everything else that a caller may choose.
std::string reportOf(std::string_view version, std::string_view executable, std::string_view buildDate) {
  Bytes buffer(161, 0xEE);
  std::uint32_t written = 0;
  EXPECT_EQ(DLFAddVersionReport(buffer.data(), 161, written, 0, 0, version, executable, buildDate, {}),
            DLFStatus::Success);
  return described(buffer);
}

TEST(DLFAddVersionReport, FillsThe161Bytes) {
  Bytes buffer(161, 0xEE);
  std::uint32_t written = 99;
  const DLFStatus status =
      DLFAddVersionReport(buffer.data(), 161, written, 0x1234, 0xFEDC, "Varnel 2.0", "EXECUTABLE_NAME",
                          "Nov  2 2022 18:26:06", {0x65E1E095, -210, 1});
  EXPECT_EQ(status, DLFStatus::Success);
  EXPECT_EQ(written, 161u);
  EXPECT_EQ(described(buffer), beginning()
                                   .put(12, {0x34, 0x12, 0xDC, 0xFE})
                                   .put(16, "Varnel")
                                   .put(23, "EXECUTABLE_NAME")
                                   .put(63, "Nov  2 2022 18:26")
                                   .put(81, {0x95, 0xE0, 0xE1, 0x65})
                                   .put(85, {0x2E, 0xFF})
                                   .put(87, {0x01, 0x00})
                                   .text());
}

TEST(DLFAddVersionReport, CutsTheTextsTo6And15And17Characters) {
  EXPECT_EQ(reportOf("1234567", "1234567890123456", "123456789012345678"),
            beginning().put(16, "123456").put(23, "123456789012345").put(63, "12345678901234567").text());
}

TEST(DLFAddVersionReport, KeepsTextsThatFitExactly) {
  EXPECT_EQ(reportOf("(none)", "123456789012345", "12345678901234567"),
            beginning().put(16, "(none)").put(23, "123456789012345").put(63, "12345678901234567").text());
}

TEST(DLFAddVersionReport, FillsUpShorterTextsWithZeros) {
  EXPECT_EQ(reportOf("1.0", "v", ""), beginning().put(16, "1.0").put(23, "v").text());
}

TEST(DLFAddVersionReport, ZoneOffsetsAreSigned16BitNumbers) {
  const auto zoneBytes = [](std::int16_t minutes) {
    Bytes buffer(161);
    std::uint32_t written = 0;
    DLFAddVersionReport(buffer.data(), 161, written, 0, 0, "", "", "", {0, minutes, 0});
    return described(ByteView(buffer).subspan(81, 8));
  };
  EXPECT_EQ(zoneBytes(0), "<0000000000000000>");
  EXPECT_EQ(zoneBytes(330), "<000000004a010000>");
  EXPECT_EQ(zoneBytes(-1), "<00000000ffff0000>");
  EXPECT_EQ(zoneBytes(-32768), "<0000000000800000>");
}

TEST(DLFAddVersionReport, ABufferOfLessThan161BytesIsTooSmallAndStaysAsItIs) {
  for (const std::uint32_t capacity : {0u, 1u, 160u}) {
    Bytes buffer(161, 0xEE);
    std::uint32_t written = 99;
    const DLFStatus status =
        DLFAddVersionReport(buffer.data(), capacity, written, 1, 1, "Varnel 2.0", "EXECUTABLE_NAME", "", {});
    EXPECT_EQ(static_cast<int>(status), 3) << "capacity " << capacity;
    EXPECT_EQ(written, 0u) << "capacity " << capacity;
    EXPECT_THAT(buffer, Each(0xEE)) << "capacity " << capacity;
  }
}

TEST(DLFAddVersionReport, ALargerBufferKeepsItsRest) {
  Bytes buffer(170, 0xEE);
  std::uint32_t written = 0;
  EXPECT_EQ(DLFAddVersionReport(buffer.data(), 170, written, 0, 0, "", "", "", {}), DLFStatus::Success);
  EXPECT_EQ(written, 161u);
  EXPECT_EQ(described(buffer),
            described(beginning().with({0xEE, 0xEE, 0xEE, 0xEE, 0xEE, 0xEE, 0xEE, 0xEE, 0xEE})));
}

// Opens the export; receives nothing itself.
class Generator final : public KLVLogGenerator {
 public:
  using KLVLogGenerator::_binData;
  using KLVLogGenerator::collect;
  using KLVLogGenerator::generateDlfFromState;
  using KLVLogGenerator::KLVLogGenerator;
  using KLVLogGenerator::storeBinDataInState;

  void updateState_withData(Dictionary&, ByteView) override {}
  Value generateLogUsingState(Dictionary&) override { return {}; }
  Value getStartCommand() const override { return {}; }
};

class KLVLogGeneratorTest : public testing::Test {
 protected:
  KLVLogGeneratorTest() {
    host.clock.set({1709301909, 999999999});
    log.take();
  }

  // One history record with that display state.
  static Value record(Value displayState) {
    return dictionaryOf({{"DisplayState", std::move(displayState)}});
  }
  void setHistory(Array records) { state.set("History", Value::ofArray(std::move(records))); }
  std::string exported() const {
    const std::optional<Bytes> dlf = generator.generateDlfFromState(state);
    return dlf ? described(*dlf) : "nothing";
  }
  // The bytes behind the version report.
  std::string exportedPackets() const {
    const std::optional<Bytes> dlf = generator.generateDlfFromState(state);
    return dlf ? described(ByteView(*dlf).subspan(161)) : "nothing";
  }

  RecordingLog log;
  TestServices host;
  Generator generator{host.services};
  Dictionary state;
};

constexpr const char* wrongClass =
    "<16>Got wrong class writing history to DLF; aborting writing the DLF file";

// The report of a generator in a host of version 2.0, at 2024-03-01 14:05:09 UTC.
Report generatorsReport() {
  return beginning()
      .put(12, {0x01, 0x00, 0x01, 0x00})
      .put(16, "Varnel")
      .put(23, "EXECUTABLE_NAME")
      .put(63, "Nov  2 2022 18:26")
      .put(81, {0x95, 0xE0, 0xE1, 0x65});
}

TEST_F(KLVLogGeneratorTest, TheExportBeginsWithTheVersionReport) {
  EXPECT_EQ(exported(), generatorsReport().text());
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(KLVLogGeneratorTest, OfVersion20TheFieldHoldsSixCharactersAndANul) {
  host.application.version = "2.0";
  const std::optional<Bytes> dlf = generator.generateDlfFromState(state);
  ASSERT_TRUE(dlf);
  EXPECT_EQ(described(ByteView(*dlf).subspan(16, 7)), "<5661726e656c00>");
}

TEST_F(KLVLogGeneratorTest, AnUnknownVersionIsNoneInParentheses) {
  host.application.version.reset();
  EXPECT_EQ(exported(), generatorsReport().put(16, "(none)").text());
}

TEST_F(KLVLogGeneratorTest, AnEmptyVersionIsAKnownOne) {
  host.application.version = "";
  EXPECT_EQ(exported(), generatorsReport().text());
}

TEST_F(KLVLogGeneratorTest, TheBuildDateLosesItsLastThreeCharacters) {
  host.application.buildDate = "Mar 31 2024 09:08:07";
  EXPECT_EQ(exported(), generatorsReport().put(63, "Mar 31 2024 09:08").text());
}

TEST_F(KLVLogGeneratorTest, TheZoneOffsetIsInMinutesRoundedTowardsZero) {
  const auto zoneBytes = [&](std::int32_t seconds) {
    host.clock.setZone({seconds, false});
    const Bytes dlf = generator.generateDlfFromState(state).value();
    return described(ByteView(dlf).subspan(85, 4));
  };
  EXPECT_EQ(zoneBytes(0), "<00000000>");
  EXPECT_EQ(zoneBytes(3600), "<3c000000>");
  EXPECT_EQ(zoneBytes(19859), "<4a010000>");   // 330 minutes and 59 seconds
  EXPECT_EQ(zoneBytes(-12600), "<2eff0000>");  // -210 minutes
  EXPECT_EQ(zoneBytes(-12659), "<2eff0000>");
  EXPECT_EQ(zoneBytes(-12660), "<2dff0000>");
  EXPECT_EQ(zoneBytes(-59), "<00000000>");
}

TEST_F(KLVLogGeneratorTest, TheDaylightFlagIsThatOfTheZone) {
  host.clock.setZone({7200, true});
  EXPECT_EQ(exported(), generatorsReport().put(85, {0x78, 0x00, 0x01, 0x00}).text());
}

TEST_F(KLVLogGeneratorTest, EachDisplayStateIsWrittenFromItsSecondByteOnOldestFirst) {
  setHistory({record(Value::ofData({0x01, 0xA0, 0xA1})), record(Value::ofData({0x81, 0x00, 0x01, 0xB0}))});
  EXPECT_EQ(exported(), described(generatorsReport().with({0xA0, 0xA1, 0x00, 0x01, 0xB0})));
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(KLVLogGeneratorTest, ADisplayStateOfOneByteOrLessContributesNothing) {
  setHistory({record(Value::ofData({})), record(Value::ofData({0x01}))});
  EXPECT_EQ(exportedPackets(), "<>");
}

TEST_F(KLVLogGeneratorTest, ADisplayStateOfTwoBytesContributesOne) {
  setHistory({record(Value::ofData({0x01, 0x02}))});
  EXPECT_EQ(exportedPackets(), "<02>");
}

TEST_F(KLVLogGeneratorTest, RecordsWithoutDisplayStateAreSkipped) {
  setHistory({Value::ofDictionary(), record(Value::ofData({0x01, 0x02})), Value::ofDictionary()});
  EXPECT_EQ(exportedPackets(), "<02>");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(KLVLogGeneratorTest, ADisplayStateThatIsNoDataAbortsTheExport) {
  const Value values[] = {Value::ofDictionary(), Value::ofArray(), "text", Value::ofInteger(1)};
  for (const Value& value : values) {
    setHistory({record(Value::ofData({0x01, 0x02})), record(value), record(Value::ofData({0x01, 0x03}))});
    EXPECT_EQ(exported(), "nothing") << described(value);
    EXPECT_THAT(log.takeTexts(), ElementsAre(wrongClass)) << described(value);
  }
}

TEST_F(KLVLogGeneratorTest, TheSaveContentsAreTheHistoryAndThenTheExport) {
  setHistory({record(Value::ofData({0x01, 0x02, 0x03})), dictionaryOf({{"Description", "second"}})});
  const std::string dlf = described(generatorsReport().with({0x02, 0x03}));
  EXPECT_EQ(described(generator.getSaveContentsFromState(state)),
            R"~([{DisplayState: <010203>}, {Description: "second"}, )~"
            R"~({Description: "DLF binary (163 bytes)", DLF: )~" +
                dlf + "}]");
}

TEST_F(KLVLogGeneratorTest, AHistoryWithoutDisplayStatesIsExportedAsTheVersionReportAlone) {
  setHistory({Value::ofDictionary()});
  EXPECT_EQ(described(generator.getSaveContentsFromState(state)),
            R"~([{}, {Description: "DLF binary (161 bytes)", DLF: )~" + generatorsReport().text() + "}]");
}

TEST_F(KLVLogGeneratorTest, AStateWithoutHistoryIsExportedAsTheVersionReportAlone) {
  EXPECT_EQ(described(generator.getSaveContentsFromState(state)),
            R"~([{Description: "DLF binary (161 bytes)", DLF: )~" + generatorsReport().text() + "}]");
}

TEST_F(KLVLogGeneratorTest, AnAbortedExportStillSavesTheHistory) {
  setHistory({record(Value::ofData({0x01, 0x02})), record(dictionaryOf({{"Object", "1"}}))});
  EXPECT_EQ(described(generator.getSaveContentsFromState(state)),
            R"([{DisplayState: <0102>}, {DisplayState: {Object: "1"}}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(wrongClass));
}

TEST_F(KLVLogGeneratorTest, TheSaveContentsAreAnArrayOfTheirOwn) {
  setHistory({Value::ofDictionary()});
  const Value contents = generator.getSaveContentsFromState(state);
  EXPECT_NE(contents.array(), state.get("History").array());
  EXPECT_EQ(described(state), "{History: [{}]}");
  EXPECT_EQ(contents.array()->front().dictionary(), state.get("History").array()->front().dictionary());
}

TEST_F(KLVLogGeneratorTest, TheCollectedBytesMoveIntoTheState) {
  EXPECT_THAT(generator._binData, IsEmpty());
  generator._binData = {0x01, 0x02};
  generator.storeBinDataInState(state);
  EXPECT_EQ(described(state), "{DisplayState: <0102>}");
  EXPECT_THAT(generator._binData, IsEmpty());
  generator.storeBinDataInState(state);
  EXPECT_EQ(described(state), "{DisplayState: <>}");
}

constexpr std::size_t sixteenMebibytes = 16'777'216;

TEST_F(KLVLogGeneratorTest, AnIntervalHolds16MebibytesOfRawBytesAndNoMessageInPart) {
  generator.collect(Bytes(sixteenMebibytes - 3, 0x01));
  generator.collect(Bytes(4, 0x02));  // a byte too many
  generator.collect(Bytes(3, 0x03));
  generator.collect(Bytes(1, 0x04));
  generator.collect(Bytes());
  ASSERT_EQ(generator._binData.size(), sixteenMebibytes);
  EXPECT_EQ(described(ByteView(generator._binData).last(4)), "<01030303>");
  EXPECT_EQ(generator.messagesLeftOutOfLog(), 2u);
}

TEST_F(KLVLogGeneratorTest, WhatAnIntervalLeavesOutIsLoggedOnceItIsOverAndCountedOnAndOn) {
  generator.collect(Bytes(sixteenMebibytes, 0x01));
  for (int i = 0; i < 3; ++i) generator.collect(Bytes{0x02});
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  generator.storeBinDataInState(state);
  EXPECT_THAT(
      log.takeTexts(),
      ElementsAre("<4>The binary log lacks 3 messages of this interval, which brought more than 16777216 "
                  "bytes"));
  generator.collect(Bytes{0x03});
  generator.storeBinDataInState(state);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(described(state), "{DisplayState: <03>}");
  EXPECT_EQ(generator.messagesLeftOutOfLog(), 3u);
  generator.collect(Bytes(sixteenMebibytes + 1, 0x04));
  EXPECT_EQ(generator.messagesLeftOutOfLog(), 4u);
}

TEST_F(KLVLogGeneratorTest, OneThatKeepsNoRawBytesStoresEmptyDataAndLeavesNothingOut) {
  generator.collect(Bytes{0x01});
  generator.keepNoRawBytes();
  generator.collect(Bytes{0x02});
  generator.collect(Bytes(sixteenMebibytes + 1, 0x03));
  generator.storeBinDataInState(state);
  EXPECT_EQ(described(state), "{DisplayState: <>}");
  EXPECT_EQ(generator.messagesLeftOutOfLog(), 0u);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

}  // namespace
}  // namespace varnel

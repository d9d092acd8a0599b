#include "LogGenerator/KLVLogGenerator2.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cinttypes>
#include <cstdio>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingDecoder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

struct Serving {
  static constexpr std::string_view name = "Serving Cell";
  static inline const std::vector<std::uint32_t> logCodes = {0x51F8, 0xD0E0};
};
struct Neighbors {
  static constexpr std::string_view name = "Neighbor Cells";
  static inline const std::vector<std::uint32_t> logCodes = {0xFF0000, 0x51F8};
};
struct Twice {
  static constexpr std::string_view name = "Twice";
  static inline const std::vector<std::uint32_t> logCodes = {0xFF0020, 0xFF0020};
};

// "Neighbor Cells" is created first.
class TestIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

  std::unique_ptr<RecordingDecoder<Neighbors>> neighbors = create<RecordingDecoder<Neighbors>>();
  std::unique_ptr<RecordingDecoder<Serving>> serving = create<RecordingDecoder<Serving>>();
  std::unique_ptr<RecordingDecoder<Twice>> twice = create<RecordingDecoder<Twice>>();
};

struct Edges {
  static constexpr std::string_view name = "Edges";
  static inline const std::vector<std::uint32_t> logCodes = {0xFEFFFF, 0xFF0000,   0xFFFF,
                                                             0x0000,   0x01000000, 0xFFFFFF};
};
class EdgesIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

 private:
  std::unique_ptr<RecordingDecoder<Edges>> edges = create<RecordingDecoder<Edges>>();
};

class Raising final : public RecordingDecoder<Serving> {
 public:
  void updateWithData_logCode(const Packet&, std::uint32_t) override { throw ArrayOutOfBoundsException(); }
};
class RaisingIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

 private:
  std::unique_ptr<Raising> raising = create<Raising>();
};

class Generator final : public KLVLogGenerator2 {
 public:
  Generator(const Services& services, std::shared_ptr<ClassIndex> classIndex)
      : KLVLogGenerator2(services, "Rows", std::move(classIndex)) {}
  using KLVLogGenerator::_binData;
};

class KLVLogGenerator2Test : public testing::Test {
 protected:
  KLVLogGenerator2Test() {
    host.resources.add("Rows", displayTemplate);
    log.take();
  }

  // A generator whose index nobody else owns, so that its lines are those of daily life.
  std::unique_ptr<Generator> makeGenerator() {
    auto index = std::make_shared<TestIndex>(host.standardOutput);
    decoders = index.get();
    return std::make_unique<Generator>(host.services, std::move(index));
  }

  // Hands a message to a generator that has its display already; the lines that come of it.
  std::vector<std::string> linesOf(const Bytes& message) {
    if (!state.has("Display")) generator->updateState_withData(state, {});
    log.take();
    generator->updateState_withData(state, message);
    return log.takeTexts();
  }

  RecordingLog log;
  TestServices host;
  Value displayTemplate = dictionaryOf({{"Serving Cell", dictionaryOf({{"ARFCN", ""}, {"RSSI", "none"}})},
                                        {"Neighbor Cells", Value::ofArray()},
                                        {"Title", "Cells"}});
  TestIndex* decoders = nullptr;
  std::unique_ptr<Generator> generator = makeGenerator();
  Dictionary state;
};

constexpr const char* displayOfTemplate =
    R"({Serving Cell: {ARFCN: "", RSSI: "none"}, Neighbor Cells: [], Title: "Cells"})";

// Framing and dispatch.

TEST_F(KLVLogGenerator2Test, MessagesOf12BytesOrLessAreIgnoredSilently) {
  for (std::size_t size = 0; size <= 12; ++size) {
    EXPECT_THAT(linesOf(Bytes(size, 0x02)), IsEmpty()) << size << " bytes";
    EXPECT_THAT(linesOf(Bytes(size, 0x81)), IsEmpty()) << size << " bytes";
    EXPECT_THAT(linesOf(Bytes(size, 0x01)), IsEmpty()) << size << " bytes";
  }
}

TEST_F(KLVLogGenerator2Test, AMessageOf13BytesAndType2IsDroppedWithALine) {
  EXPECT_THAT(linesOf(Bytes(13, 0x02)), ElementsAre("<3>Invalid log type: 2. Dropping."));
}

TEST_F(KLVLogGenerator2Test, AllTypesBut1AndFFAreDroppedWithTheTypeInHexadecimal) {
  Bytes message = PacketBuilder(0x51F8, 13).bytes();
  for (unsigned type = 0; type < 256; ++type) {
    if (type == 0x01 || type == 0x81 || type == 0xFF) continue;
    message[0] = static_cast<std::uint8_t>(type);
    char line[64];
    std::snprintf(line, sizeof line, "<3>Invalid log type: %x. Dropping.", type);
    EXPECT_THAT(linesOf(message), ElementsAre(line));
  }
}

TEST_F(KLVLogGenerator2Test, APacketOf13BytesAndType1GoesToTheSubscriberOfItsCode) {
  EXPECT_THAT(linesOf(PacketBuilder(0xD0E0, 13).bytes()),
              ElementsAre("<4>Serving Cell gets 53472: <010d00e0d00000000000000000>"));
}

TEST_F(KLVLogGenerator2Test, APacketOfTypeFFGoesToTheSubscribersOfTheExtraCode) {
  EXPECT_THAT(linesOf(PacketBuilder(0xFF0000, 14).u8(13, 0xAB).bytes()),
              ElementsAre("<4>Neighbor Cells gets 16711680: <ff0e0000000000000000000000ab>"));
}

TEST_F(KLVLogGenerator2Test, ExtraCode20IsCodeFF0020AndASecondSubscriptionASecondDelivery) {
  const char* line = "<4>Twice gets 16711712: <ff0d0020000000000000000000>";
  EXPECT_THAT(linesOf(PacketBuilder(0xFF0020, 13).bytes()), ElementsAre(line, line));
}

TEST_F(KLVLogGenerator2Test, SubscribersOfASharedCodeAreCalledInTheOrderOfTheirCreation) {
  EXPECT_THAT(linesOf(PacketBuilder(0x51F8, 15).u16(13, 0x0201).bytes()),
              ElementsAre("<4>Neighbor Cells gets 20984: <010f00f85100000000000000000102>",
                          "<4>Serving Cell gets 20984: <010f00f85100000000000000000102>"));
}

TEST_F(KLVLogGenerator2Test, APacketThatNobodyWantsIsDroppedSilently) {
  EXPECT_THAT(linesOf(PacketBuilder(0x51F9, 20).bytes()), IsEmpty());
  EXPECT_THAT(linesOf(PacketBuilder(0x0020, 20).bytes()), IsEmpty());
  EXPECT_THAT(linesOf(PacketBuilder(0xFF51F8, 20).bytes()), IsEmpty());
}

TEST_F(KLVLogGenerator2Test, RecordLengthAndTimestampAreNotRead) {
  const Bytes message = {0x01, 0xFF, 0xFF, 0xE0, 0xD0, 1, 2, 3, 4, 5, 6, 7, 8};
  EXPECT_THAT(linesOf(message), ElementsAre("<4>Serving Cell gets 53472: <01ffffe0d00102030405060708>"));
}

TEST_F(KLVLogGenerator2Test, ALeading81AndTheByteBehindItAreNoPartOfThePacket) {
  const Bytes message = {0x81, 0x00, 0x01, 0x0E, 0x00, 0xE0, 0xD0, 0, 0, 0, 0, 0, 0, 0, 0, 0xAB};
  EXPECT_THAT(linesOf(message), ElementsAre("<4>Serving Cell gets 53472: <010e00e0d00000000000000000ab>"));
}

TEST_F(KLVLogGenerator2Test, OnlyOnePrefixIsDropped) {
  const Bytes message = {0x81, 0x01, 0x81, 0x00, 0x01, 0, 0, 0xE0, 0xD0, 0, 0, 0, 0, 0, 0, 0, 0};
  EXPECT_THAT(linesOf(message), ElementsAre("<3>Invalid log type: 81. Dropping."));
}

TEST_F(KLVLogGenerator2Test, APrefixedMessageOf13Or14BytesIsDispatchedThoughItsPacketIsShorterThanAHeader) {
  EXPECT_THAT(linesOf({0x81, 0x00, 0x01, 0, 0, 0xE0, 0xD0, 0, 0, 0, 0, 0, 0}),
              ElementsAre("<4>Serving Cell gets 53472: <010000e0d0000000000000>"));
  EXPECT_THAT(linesOf({0x81, 0x00, 0x01, 0, 0, 0xE0, 0xD0, 0, 0, 0, 0, 0, 0, 0}),
              ElementsAre("<4>Serving Cell gets 53472: <010000e0d000000000000000>"));
}

TEST_F(KLVLogGenerator2Test, AnExceptionOfADecoderIsNotCaught) {
  Generator raising(host.services, std::make_shared<RaisingIndex>(host.standardOutput));
  EXPECT_THROW(raising.updateState_withData(state, PacketBuilder(0x51F8, 13).bytes()),
               ArrayOutOfBoundsException);
}

TEST_F(KLVLogGenerator2Test, EveryMessageIsCollectedAsReceived) {
  generator->updateState_withData(state, {});
  EXPECT_EQ(described(generator->_binData), "<>");
  generator->updateState_withData(state, Bytes{0xAA});                        // too short
  generator->updateState_withData(state, Bytes(13, 0x02));                    // of no valid type
  generator->updateState_withData(state, PacketBuilder(0x51F9, 13).bytes());  // wanted by nobody
  generator->updateState_withData(state, Bytes{0x81, 0x00, 0x01, 0, 0, 0xE0, 0xD0, 0, 0, 0, 0, 0, 0});
  EXPECT_EQ(described(generator->_binData),
            "<aa"
            "02020202020202020202020202"
            "010d00f9510000000000000000"
            "81000100"
            "00e0d0000000000000>");
}

TEST_F(KLVLogGenerator2Test, AMessageThatIsLeftOutOfTheBinaryLogIsDecodedAllTheSame) {
  linesOf(Bytes(KLVLogGenerator::mostRawBytes, 0x00));
  EXPECT_THAT(linesOf(PacketBuilder(0xD0E0, 13).bytes()),
              ElementsAre("<4>Serving Cell gets 53472: <010d00e0d00000000000000000>"));
  EXPECT_EQ(generator->_binData.size(), 16'777'216u);
  EXPECT_EQ(generator->messagesLeftOutOfLog(), 1u);
}

// The display.

TEST_F(KLVLogGenerator2Test, TheFirstMessageLoadsTheTemplateAndTheGenerationBehindItYieldsTheDisplay) {
  generator->updateState_withData(state, PacketBuilder(0x51F9, 13).bytes());
  EXPECT_EQ(described(state), "{Template: " + std::string(displayOfTemplate) +
                                  ", Display: " + displayOfTemplate + ", ExtraInfo: {}}");
  EXPECT_EQ(described(generator->generateLogUsingState(state)), displayOfTemplate);
}

TEST_F(KLVLogGenerator2Test, AShortFirstMessageLoadsTheTemplateToo) {
  generator->updateState_withData(state, {});
  EXPECT_EQ(described(state.get("Display")), displayOfTemplate);
}

TEST_F(KLVLogGenerator2Test, AGenerationThatBuildsTheDisplayYieldsNothing) {
  EXPECT_EQ(described(generator->generateLogUsingState(state)), "absent");
  EXPECT_EQ(described(state.get("Display")), displayOfTemplate);
  EXPECT_EQ(described(generator->generateLogUsingState(state)), displayOfTemplate);
}

TEST_F(KLVLogGenerator2Test, AGenerationThatBuildsTheDisplayRecordsItInTheHistory) {
  host.clock.set({1709301909, 0});
  generator->generateLogUsingState(state);
  EXPECT_EQ(described(state.get("History")),
            "[{DisplayState: <>, Display: " + std::string(displayOfTemplate) +
                R"(, ExtraInfo: {}, Date: "2024-03-01 14:05:09 +0000", )"
                R"~(Description: "Snapshot (2024-03-01 14:05:09 +0000)"}])~");
}

TEST_F(KLVLogGenerator2Test, TheDisplayIsBuiltWithTheseLinesBeforeTheMessageIsLookedAt) {
  generator->updateState_withData(state, PacketBuilder(0xD0E0, 13).bytes());
  char initialized[96];
  std::snprintf(initialized, sizeof initialized,
                "<4>Initialized class index: 0x%" PRIxPTR ", Self: 0x%" PRIxPTR,
                reinterpret_cast<std::uintptr_t>(static_cast<ClassIndex*>(decoders)),
                reinterpret_cast<std::uintptr_t>(static_cast<LogGenerator*>(generator.get())));
  const auto lines = log.takeTexts();
  ASSERT_GE(lines.size(), 6u);
  EXPECT_THAT(std::vector(lines.end() - 6, lines.end()),
              ElementsAre(initialized, "<4>Dictionary = 1", "<4>String = 0", "<4>Serving Cell",
                          "<4>Neighbor Cells", "<4>Serving Cell gets 53472: <010d00e0d00000000000000000>"));
}

TEST_F(KLVLogGenerator2Test, TheDisplayIsBuiltOnce) {
  generator->updateState_withData(state, {});
  const Dictionary* display = state.get("Display").dictionary();
  EXPECT_THAT(linesOf(Bytes{}), IsEmpty());
  EXPECT_EQ(generator->generateLogUsingState(state).dictionary(), display);
  EXPECT_EQ(generator->generateLogUsingState(state).dictionary(), display);
  EXPECT_THAT(host.resources.requests(), ElementsAre("Rows"));
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(KLVLogGenerator2Test, TheDisplayIsAnotherObjectThanTheTemplate) {
  generator->updateState_withData(state, {});
  Dictionary& display = *state.get("Display").dictionary();
  display.get("Serving Cell").dictionary()->set("ARFCN", "62");
  display.get("Neighbor Cells").array()->emplace_back("63");
  display.set("Title", "changed");
  EXPECT_EQ(described(state.get("Template")), displayOfTemplate);
  EXPECT_EQ(described(displayTemplate), displayOfTemplate);
}

TEST_F(KLVLogGenerator2Test, EachDecoderGetsTheLiveContainerOfItsSection) {
  generator->updateState_withData(state, {});
  const Dictionary& display = *state.get("Display").dictionary();
  ASSERT_NE(decoders->serving->section().dictionary(), nullptr);
  EXPECT_EQ(decoders->serving->section().dictionary(), display.get("Serving Cell").dictionary());
  ASSERT_NE(decoders->neighbors->section().array(), nullptr);
  EXPECT_EQ(decoders->neighbors->section().array(), display.get("Neighbor Cells").array());
  EXPECT_TRUE(decoders->twice->section().isAbsent()) << "the template has no such section";
}

TEST_F(KLVLogGenerator2Test, WhatADecoderWritesIsInTheDisplayOfTheNextGeneration) {
  generator->updateState_withData(state, {});
  decoders->serving->section().dictionary()->set("RSSI", "-70 dBm");
  EXPECT_EQ(described(generator->generateLogUsingState(state)),
            R"({Serving Cell: {ARFCN: "", RSSI: "-70 dBm"}, Neighbor Cells: [], Title: "Cells"})");
}

TEST_F(KLVLogGenerator2Test, SectionsAreFoundAtAnyDepthTheInnerOneFirst) {
  const Value nested = dictionaryOf(
      {{"1;Outer", dictionaryOf({{"Serving Cell", dictionaryOf({{"Neighbor Cells", Value::ofArray()}})},
                                 {"_sorted", ""}})},
       {"Lists", Value::ofArray({dictionaryOf({{"Twice", Value::ofDictionary()}}), "text"})}});
  host.resources.add("Rows", nested);
  generator->updateState_withData(state, {});
  const auto lines = log.takeTexts();
  ASSERT_GE(lines.size(), 3u);
  EXPECT_THAT(std::vector(lines.end() - 3, lines.end()),
              ElementsAre("<4>Neighbor Cells", "<4>Serving Cell", "<4>Twice"));
  EXPECT_EQ(described(state.get("Display")),
            R"({1;Outer: {Serving Cell: {Neighbor Cells: []}, _sorted: ""}, Lists: [{Twice: {}}, "text"]})");
}

TEST_F(KLVLogGenerator2Test, ASectionThatIsATextIsHandedOverAsWell) {
  host.resources.add("Rows", dictionaryOf({{"Serving Cell", "none"}}));
  generator->updateState_withData(state, {});
  EXPECT_EQ(described(decoders->serving->section()), R"("none")");
}

TEST_F(KLVLogGenerator2Test, WhatIsNeitherTextNorContainerIsReportedAndLeftOut) {
  host.resources.add("Rows", dictionaryOf({{"Number", Value::ofInteger(1)},
                                           {"Text", "kept"},
                                           {"List", Value::ofArray({"1", Value::ofBoolean(true), "3"})},
                                           {"Data", Value::ofData({1})}}));
  generator->updateState_withData(state, {});
  EXPECT_EQ(described(state.get("Display")), R"({Text: "kept", List: ["1", "3"]})");
  const auto lines = log.takeTexts();
  ASSERT_GE(lines.size(), 7u);
  EXPECT_THAT(
      std::vector(lines.end() - 7, lines.end()),
      ElementsAre("<4>String = 0", "<3>Received an object of unknown type", "<4>Processing the template",
                  "<3>Received an object of unknown type", "<4>Processing the template",
                  "<3>Received an object of unknown type", "<4>Processing the template"));
}

TEST_F(KLVLogGenerator2Test, ATemplateThatIsNeitherTextNorContainerIsReportedTwiceAtEachMessage) {
  host.resources.add("Rows", Value::ofInteger(1));
  const auto lines = ElementsAre(HasSubstr("<4>Initialized class index: "), "<4>Dictionary = 1",
                                 "<4>String = 0", "<3>Received an object of unknown type",
                                 "<4>Processing the template", "<3>Received an object of unknown type");
  for (int message = 0; message < 2; ++message) {
    generator->updateState_withData(state, {});
    EXPECT_THAT(log.takeTexts(), lines);
    EXPECT_FALSE(state.has("Display"));
    EXPECT_EQ(described(state.get("ExtraInfo")), "{}");
  }
}

TEST_F(KLVLogGenerator2Test, ATemplateInTheStateIsNotLoadedAgain) {
  state.set("Template", dictionaryOf({{"Twice", dictionaryOf({{"A", "1"}})}}));
  generator->updateState_withData(state, {});
  EXPECT_THAT(host.resources.requests(), IsEmpty());
  EXPECT_EQ(described(state.get("Display")), R"({Twice: {A: "1"}})");
}

TEST_F(KLVLogGenerator2Test, ADisplayThatIsRebuiltComesWithANewExtraInfo) {
  generator->updateState_withData(state, {});
  state.get("ExtraInfo").dictionary()->set("old", "old");
  state.remove("Display");
  generator->updateState_withData(state, {});
  EXPECT_EQ(described(state.get("Display")), displayOfTemplate);
  EXPECT_EQ(described(state.get("ExtraInfo")), "{}");
  EXPECT_THAT(host.resources.requests(), ElementsAre("Rows"));
}

// Without a template.

class KLVLogGenerator2WithoutTemplateTest : public KLVLogGenerator2Test {
 protected:
  KLVLogGenerator2WithoutTemplateTest() {
    host.resources.add("Rows", Value());
    log.take();
  }
};

TEST_F(KLVLogGenerator2WithoutTemplateTest, EachMessageReportsItAndIsDispatchedAndCollected) {
  const Bytes message = PacketBuilder(0xD0E0, 13).bytes();
  for (int i = 0; i < 2; ++i) {
    generator->updateState_withData(state, message);
    EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Cannot load template for display",
                                             "<4>Serving Cell gets 53472: <010d00e0d00000000000000000>"));
  }
  EXPECT_EQ(described(state), "{}");
  EXPECT_EQ(generator->_binData.size(), 26u);
}

TEST_F(KLVLogGenerator2WithoutTemplateTest, AGenerationReportsItAndYieldsNothing) {
  generator->updateState_withData(state, Bytes{0xAB});
  log.take();
  EXPECT_EQ(described(generator->generateLogUsingState(state)), "absent");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Cannot load template for display"));
  EXPECT_EQ(described(state), "{DisplayState: <ab>, History: [{DisplayState: <ab>}]}");
}

// Generation.

TEST_F(KLVLogGenerator2Test, AGenerationMovesTheCollectedBytesIntoTheState) {
  generator->updateState_withData(state, Bytes{0x01});
  generator->updateState_withData(state, Bytes{0x02, 0x03});
  generator->generateLogUsingState(state);
  EXPECT_EQ(described(state.get("DisplayState")), "<010203>");
  EXPECT_THAT(generator->_binData, IsEmpty());
  generator->updateState_withData(state, Bytes{0x04});
  generator->generateLogUsingState(state);
  EXPECT_EQ(described(state.get("DisplayState")), "<04>");
  generator->generateLogUsingState(state);
  EXPECT_EQ(described(state.get("DisplayState")), "<>");
}

TEST_F(KLVLogGenerator2Test, EachGenerationRecordsOneSnapshotOfItsIntervalUpToFive) {
  for (std::uint8_t interval = 1; interval <= 6; ++interval) {
    generator->updateState_withData(state, Bytes{0x01, interval});
    generator->generateLogUsingState(state);
  }
  std::string intervals;
  for (const Value& record : *state.get("History").array())
    intervals += described(record.dictionary()->get("DisplayState"));
  EXPECT_EQ(intervals, "<0102><0103><0104><0105><0106>");
}

TEST_F(KLVLogGenerator2Test, TheExportHoldsTheMessagesOfEachIntervalWithoutTheFirstByte) {
  generator->updateState_withData(state, Bytes{0x01, 0xA0});
  generator->updateState_withData(state, Bytes{0x81, 0xB0, 0x01});
  generator->generateLogUsingState(state);
  generator->updateState_withData(state, Bytes{0xFF, 0xC0});
  generator->generateLogUsingState(state);
  const Value contents = generator->getSaveContentsFromState(state);
  ASSERT_EQ(contents.array()->size(), 3u);
  const Bytes* dlf = contents.array()->back().dictionary()->get("DLF").data();
  ASSERT_NE(dlf, nullptr);
  EXPECT_EQ(described(ByteView(*dlf).subspan(161)), "<a081b001c0>");
}

// The start command.

TEST_F(KLVLogGenerator2Test, TheStartCommandSeparatesLogCodesAndExtraCodes) {
  EXPECT_EQ(described(generator->getStartCommand()),
            R"({SetState: "Streaming", SetKalviLogCodes: [20984, 53472], SetTkExtraCodes: [0, 32]})");
}

TEST_F(KLVLogGenerator2Test, CodesFromFF0000OnAreExtraCodes) {
  const Generator edges(host.services, std::make_shared<EdgesIndex>(host.standardOutput));
  EXPECT_EQ(described(edges.getStartCommand()),
            R"({SetState: "Streaming", SetKalviLogCodes: [16711679, 65535, 0], )"
            R"(SetTkExtraCodes: [0, 65536, 65535]})");
}

TEST_F(KLVLogGenerator2Test, EmptyListsAreSentAsWell) {
  const Generator idle(host.services, std::make_shared<ClassIndex>(host.standardOutput));
  EXPECT_EQ(described(idle.getStartCommand()),
            R"({SetState: "Streaming", SetKalviLogCodes: [], SetTkExtraCodes: []})");
}

// After a reconnection: a new generator on the state of another.

class KLVLogGenerator2ReconnectionTest : public KLVLogGenerator2Test {
 protected:
  KLVLogGenerator2ReconnectionTest() {
    generator->updateState_withData(state, {});
    decoders->serving->section().dictionary()->set("RSSI", "-70 dBm");
    generator->generateLogUsingState(state);
    generator = makeGenerator();
    log.take();
  }
};

constexpr const char* displayBeforeReconnection =
    R"({Serving Cell: {ARFCN: "", RSSI: "-70 dBm"}, Neighbor Cells: [], Title: "Cells"})";

TEST_F(KLVLogGenerator2ReconnectionTest, TheDecodersGetNoSection) {
  generator->updateState_withData(state, PacketBuilder(0x51F8, 13).bytes());
  EXPECT_TRUE(decoders->serving->section().isAbsent());
  EXPECT_TRUE(decoders->neighbors->section().isAbsent());
}

TEST_F(KLVLogGenerator2ReconnectionTest, PacketsAreDispatchedAndLoggedAsUsual) {
  generator->updateState_withData(state, PacketBuilder(0x51F8, 13).bytes());
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>Neighbor Cells gets 20984: <010d00f8510000000000000000>",
                                           "<4>Serving Cell gets 20984: <010d00f8510000000000000000>"));
}

TEST_F(KLVLogGenerator2ReconnectionTest, TheFirstGenerationYieldsTheOldDisplayUntouched) {
  const Dictionary* display = state.get("Display").dictionary();
  const Value generated = generator->generateLogUsingState(state);
  EXPECT_EQ(generated.dictionary(), display);
  EXPECT_EQ(described(generated), displayBeforeReconnection);
}

TEST_F(KLVLogGenerator2ReconnectionTest, TheRawBytesAreStillCollected) {
  generator->updateState_withData(state, Bytes{0x01, 0x02});
  generator->generateLogUsingState(state);
  EXPECT_EQ(described(state.get("DisplayState")), "<0102>");
  EXPECT_EQ(state.get("History").array()->size(), 2u);
}

}  // namespace
}  // namespace varnel

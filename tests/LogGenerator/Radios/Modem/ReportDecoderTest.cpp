#include "LogGenerator/Radios/Modem/ReportDecoder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "LogGenerator/Radios/Modem/CellRows.h"
#include "LogGenerator/Radios/Modem/OtherCells.h"
#include "LogGenerator/Radios/Modem/PositionSection.h"
#include "LogGenerator/Radios/Modem/Registration.h"
#include "LogGenerator/Radios/Modem/ServingCell.h"
#include "tests/LogGenerator/Radios/Modem/ModemReports.h"
#include "tests/support/RecordingLog.h"

// What all decoders of modem reports have in common.

namespace varnel::modem {
namespace {

using testing::ElementsAre;
using Outcome = MessageFate::Outcome;

class ReportDecoderTest : public testing::Test {
 protected:
  template <class Look>
  void withEachDecoder(Look look) {
    Registration registration(reader);
    look(registration, Value::ofDictionary());
    for (const Radio& radio : radios()) {
      ServingCell cell(radio, reader);
      look(cell, Value::ofDictionary());
    }
    OtherCells others(reader);
    look(others, Value::ofArray());
    PositionSection position(reader, Identities::Shown);
    look(position, Value::ofDictionary());
  }

  RecordingLog log;
  ReportReader reader;
};

Bytes reportOfAll() {
  Array cells;
  for (const char* radio : {"LTE", "NR", "UMTS", "GSM", "CDMA2000"}) {
    cells.push_back(cellOf(radio, "Serving", {{"RSSI", Value::ofInteger(-70)}}));
    cells.push_back(cellOf(radio, "Neighbor", {{"RSSI", Value::ofInteger(-90)}}));
  }
  return modemReportOf(
      {{"Operator", "Somebody"},
       {"Cells", Value::ofArray(std::move(cells))},
       {"Position", dictionaryOf({{"Latitude", Value::ofReal(52.5)}, {"Longitude", Value::ofReal(13.25)}})}});
}

TEST_F(ReportDecoderTest, EachTakesTheReportsAlone) {
  withEachDecoder([](ReportDecoder& decoder, const Value&) {
    EXPECT_THAT(decoder.getLogCodeArray(), ElementsAre(0xFF0003u)) << decoder.getSectionName();
  });
}

TEST_F(ReportDecoderTest, EachShowsSomethingOfAReportAndNothingAfterAnEmptyOne) {
  withEachDecoder([](ReportDecoder& decoder, const Value& section) {
    const std::string before = described(section);
    EXPECT_NE(shownAfter(decoder, {reportOfAll()}, section), before) << decoder.getSectionName();
    shownAfter(decoder, {modemReportOf({})}, section);
    if (const Array* records = section.array()) {
      EXPECT_TRUE(records->empty()) << decoder.getSectionName();
    } else {
      for (const auto& [entry, value] : *section.dictionary())
        EXPECT_EQ(described(value), entry == "Version" ? R"("1")" : R"("")") << entry;
    }
  });
}

TEST_F(ReportDecoderTest, PayloadsThatAreNoReportChangeNothing) {
  const Bytes whole = reportOfAll();
  withEachDecoder([&](ReportDecoder& decoder, const Value& section) {
    const std::string before = shownAfter(decoder, {whole}, section);
    EXPECT_EQ(shownAfter(decoder,
                         {serverMessageOfText(0xFF0003, "no property list"),
                          serverMessage(0xFF0003, Value::ofArray({"text"})),
                          serverMessage(0xFF0003, dictionaryOf({{"Operator", "Nobody"}})),
                          serverMessage(0xFF0003, dictionaryOf({{"Version", "1"}})),
                          serverMessage(0xFF0003, dictionaryOf({{"Version", Value::ofInteger(-1)}})),
                          serverMessage(0xFF0003, dictionaryOf({{"Version", Value::ofReal(1)}})),
                          PacketBuilder(0xFF0003, 13).bytes()},
                         section),
              before);
    for (std::size_t size = 13; size < whole.size(); ++size)
      EXPECT_EQ(shownAfter(decoder, {Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size))},
                           section),
                before)
          << size << " bytes";
  });
}

TEST_F(ReportDecoderTest, EntriesOfOtherKindsCountAsAbsent) {
  const Bytes odd = modemReportOf({{"RegistrationState", "1"},
                                   {"Operator", Value::ofInteger(1)},
                                   {"PLMN", Value::ofInteger(26201)},
                                   {"AccessTechnologies", "LTE"},
                                   {"SignalQuality", Value::ofReal(50)},
                                   {"Cells", Value::ofDictionary()},
                                   {"Position", Value::ofArray()}});
  withEachDecoder([&](ReportDecoder& decoder, const Value& section) {
    const std::string empty = shownAfter(decoder, {modemReportOf({})}, section);
    EXPECT_EQ(shownAfter(decoder, {odd}, section), empty);
    EXPECT_EQ(
        shownAfter(decoder, {reportOfCells({"text", Value::ofArray(), Value::ofDictionary()})}, section),
        empty);
  });
}

TEST_F(ReportDecoderTest, OfAnUnknownVersionOnlyTheVersionIsShown) {
  const Bytes later =
      serverMessage(0xFF0003, dictionaryOf({{"Version", Value::ofInteger(2)}, {"Operator", "Nobody"}}));
  withEachDecoder([&](ReportDecoder& decoder, const Value& section) {
    std::string expected = shownAfter(decoder, {reportOfAll()}, section);
    if (const auto at = expected.find(R"(Version: "1")"); at != std::string::npos)
      expected.replace(at, 12, "Version: \"2 (not known)\"");
    EXPECT_EQ(shownAfter(decoder, {later}, section), expected);
    EXPECT_EQ(decoder.fateOf(Packet(later), 0xFF0003),
              (MessageFate{Outcome::UnknownVersion, 0xFF0003, PacketVersion{2}}));
    EXPECT_EQ(decoder.fateOf(Packet(reportOfAll()), 0xFF0003), (MessageFate{Outcome::Decoded, 0xFF0003}));
  });
}

TEST_F(ReportDecoderTest, WithoutASectionWhatIsDecodedIsLost) {
  withEachDecoder([](ReportDecoder& decoder, const Value&) {
    const Bytes report = reportOfAll();
    decoder.updateWithData_logCode(Packet(report), 0xFF0003);
  });
}

}  // namespace
}  // namespace varnel::modem

#include "programs/varnel-decode/EventWriter.h"

#include <gtest/gtest.h>

#include <memory>

namespace varnel {
namespace {

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};

// What is written of an event with a date, and of the same without.
std::string written(EventFormat format, const std::optional<std::string>& captureName = {},
                    const DisplayEvent& event = {{1709301909, 250'000'000},
                                                 EventKind::Handover,
                                                 "LTE/Serving Cell",
                                                 "EARFCN 5230, Physical Cell ID 16",
                                                 "EARFCN 1300, Physical Cell ID 17"}) {
  const std::unique_ptr<std::FILE, CloseFile> file{std::tmpfile()};
  const EventWriter writer(file.get(), captureName, format);
  writer.write(event, Dating::Known, std::chrono::milliseconds(1500));
  writer.write(event, Dating::Unknown, std::chrono::milliseconds(1500));
  std::string text(static_cast<std::size_t>(std::ftell(file.get())), '\0');
  std::rewind(file.get());
  EXPECT_EQ(std::fread(text.data(), 1, text.size(), file.get()), text.size());
  return text;
}

TEST(EventWriter, TextHasColumnsForPeople) {
  EXPECT_EQ(written(EventFormat::Text),
            "2024-03-01T14:05:09.250Z  handover           LTE/Serving Cell                EARFCN 5230, "
            "Physical Cell ID 16 -> EARFCN 1300, Physical Cell ID 17\n"
            "1.500 s                   handover           LTE/Serving Cell                EARFCN 5230, "
            "Physical Cell ID 16 -> EARFCN 1300, Physical Cell ID 17\n");
}

TEST(EventWriter, WhatWasNotShownBeforeLeavesNoArrow) {
  EXPECT_EQ(written(EventFormat::Text, {},
                    {{1709301909, 0}, EventKind::ReturnOfService, "NR/Registration", "", "Normal Service"}),
            "2024-03-01T14:05:09.000Z  return of service  NR/Registration                 Normal Service\n"
            "1.500 s                   return of service  NR/Registration                 Normal Service\n");
}

TEST(EventWriter, CsvQuotesWhatHasCommas) {
  EXPECT_EQ(eventTableHeader(EventColumns::WithoutCapture), "Time,Kind,From,To,Section,Elapsed\n");
  EXPECT_EQ(written(EventFormat::Csv),
            "2024-03-01T14:05:09.250Z,handover,\"EARFCN 5230, Physical Cell ID 16\",\"EARFCN 1300, Physical "
            "Cell ID 17\",LTE/Serving Cell,1.500\n"
            ",handover,\"EARFCN 5230, Physical Cell ID 16\",\"EARFCN 1300, Physical Cell ID 17\",LTE/Serving "
            "Cell,1.500\n");
}

TEST(EventWriter, JsonIsAnObjectPerLine) {
  EXPECT_EQ(written(EventFormat::Json),
            R"({"Time":"2024-03-01T14:05:09.250Z","Kind":"handover","From":"EARFCN 5230, Physical Cell ID )"
            R"(16","To":"EARFCN 1300, Physical Cell ID 17","Section":"LTE/Serving Cell"})"
            "\n"
            R"({"Time":null,"Elapsed":1.500,"Kind":"handover","From":"EARFCN 5230, Physical Cell ID )"
            R"(16","To":"EARFCN 1300, Physical Cell ID 17","Section":"LTE/Serving Cell"})"
            "\n");
}

TEST(EventWriter, OfSeveralCapturesEachLineNamesItsOwnButForText) {
  EXPECT_EQ(eventTableHeader(EventColumns::WithCapture), "Capture,Time,Kind,From,To,Section,Elapsed\n");
  EXPECT_EQ(written(EventFormat::Csv, "a,b").substr(0, 30), "\"a,b\",2024-03-01T14:05:09.250Z");
  EXPECT_EQ(written(EventFormat::Json, "a\"b").substr(0, 26), R"({"Capture":"a\"b","Time":")");
  EXPECT_EQ(written(EventFormat::Text, "a").substr(0, 24), "2024-03-01T14:05:09.250Z");
}

TEST(EventWriter, NoTextCanControlATerminal) {
  const DisplayEvent event{{1709301909, 0}, EventKind::Registration, "LTE/Registration", "\x1B[2J", "a\nb"};
  EXPECT_EQ(written(EventFormat::Text, {}, event).substr(77, 22), "\\u001B[2J -> a\\u000Ab\n");
}

}  // namespace
}  // namespace varnel

#include "programs/varnel-decode/GenerationWriters.h"

#include <gmock/gmock.h>

#include <memory>
#include <stdexcept>

#include "base/Dictionary.h"

namespace varnel {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};

class GenerationWritersTest : public ::testing::Test {
 protected:
  std::string written() const {
    std::string text(static_cast<std::size_t>(std::ftell(file.get())), '\0');
    std::rewind(file.get());
    EXPECT_EQ(std::fread(text.data(), 1, text.size(), file.get()), text.size());
    return text;
  }

  static Generation generation(Value display) { return {{1709301909, 250'000'000}, std::move(display)}; }
  static Value cell(const std::string& level) {
    Value section = Value::ofDictionary();
    section.dictionary()->set("Level", level);
    Value display = Value::ofDictionary();
    display.dictionary()->set("Cell", section);
    return display;
  }

  std::unique_ptr<std::FILE, CloseFile> file{std::tmpfile()};
  NumberFormats formats;
};

TEST_F(GenerationWritersTest, EveryDisplayIsALineWithItsTime) {
  EveryDisplay writer(file.get(), {}, {}, formats);
  writer.take(generation(cell("-85 dBm")));
  writer.take(generation({}));
  EXPECT_EQ(written(),
            "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":\"-85 dBm\"}}}\n"
            "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":\"(unknown)\"}\n");
}

TEST_F(GenerationWritersTest, OfSeveralCapturesEachLineNamesItsOwn) {
  EveryDisplay(file.get(), "a\"b", {}, formats).take(generation(cell("")));
  ValueTable(file.get(), {"Cell/Level"}, "a\"b", {}, formats).take(generation(cell("x")));
  EXPECT_EQ(written(),
            "{\"Capture\":\"a\\\"b\",\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":"
            "\"\"}}}\n"
            "\"a\"\"b\",2024-03-01T14:05:09.250Z,x\n");
}

TEST_F(GenerationWritersTest, HeaderNamesTimeAndPathsAsTheUserMayWriteThem) {
  EXPECT_EQ(csvHeader({"Cell/Level", "/Cell/ID"}, TableColumns::TimeAndValues, {}),
            "Time,Cell/Level,Cell/ID\n");
  EXPECT_EQ(csvHeader({"a,b", "c\"d"}, TableColumns::CaptureTimeAndValues, {}),
            "Capture,Time,\"a,b\",\"c\"\"d\"\n");
}

TEST_F(GenerationWritersTest, CommaQuoteAndLineEndsAreQuotedAndNothingElse) {
  ValueTable table(file.get(), {"Cell/Level"}, {}, {}, formats);
  for (const char* level : {"a,b", "a\"b", "a\nb", "a\rb", " a;b'c\t", "", "\""})
    table.take(generation(cell(level)));
  EXPECT_EQ(written(),
            "2024-03-01T14:05:09.250Z,\"a,b\"\n"
            "2024-03-01T14:05:09.250Z,\"a\"\"b\"\n"
            "2024-03-01T14:05:09.250Z,\"a\nb\"\n"
            "2024-03-01T14:05:09.250Z,\"a\rb\"\n"
            "2024-03-01T14:05:09.250Z, a;b'c\t\n"
            "2024-03-01T14:05:09.250Z,\n"
            "2024-03-01T14:05:09.250Z,\"\"\"\"\n");
}

TEST_F(GenerationWritersTest, OtherControlCharactersAreEscapes) {
  ValueTable(file.get(), {"Cell/Level"}, "a\x1B", {}, formats).take(generation(cell("b\x7F\xC2\x80,\t")));
  EXPECT_EQ(written(), "a\\u001B,2024-03-01T14:05:09.250Z,\"b\\u007F\\u0080,\t\"\n");
  EXPECT_EQ(csvHeader({"c\x9"}, TableColumns::TimeAndValues, {}), "Time,c\t\n");
  EXPECT_EQ(csvHeader({"c\x01"}, TableColumns::TimeAndValues, {}), "Time,c\\u0001\n");
}

TEST_F(GenerationWritersTest, AbsentValuesAndSectionsAreEmptyFields) {
  ValueTable(file.get(), {"Cell", "Cell/Level", "Cell/None", "None/Level", ""}, {}, {}, formats)
      .take(generation(cell("7")));
  EXPECT_EQ(written(), "2024-03-01T14:05:09.250Z,,7,,,\n");
}

TEST_F(GenerationWritersTest, SortedKeysAreNamedWithoutTheirOrder) {
  Value display = cell("7");
  display.dictionary()->set("_sorted", "");
  display.dictionary()->set("10;Name", "n");
  ValueTable(file.get(), {"Name", "10;Name"}, {}, {}, formats).take(generation(display));
  EXPECT_EQ(written(), "2024-03-01T14:05:09.250Z,n,\n");
}

TEST_F(GenerationWritersTest, AnOutputThatTakesNothingIsAnError) {
  const std::unique_ptr<std::FILE, CloseFile> full(std::fopen("/dev/full", "w"));
  EXPECT_THROW(EveryDisplay(full.get(), {}, {}, formats).take(generation(cell(""))), std::runtime_error);
}

constexpr WritingStyle plainNumbers{ValuesAs::Numbers, Displays::All};
constexpr WritingStyle changedTexts{ValuesAs::Texts, Displays::Changed};
constexpr WritingStyle changedNumbers{ValuesAs::Numbers, Displays::Changed};

TEST_F(GenerationWritersTest, NumbersStandInFieldsWithTheirUnitInTheHeader) {
  formats.add("Cell", "Level", real("%4.2f dBm"));
  EXPECT_EQ(
      csvHeader({"Cell/Level", "/Cells[ID=a/b]/Level", "Cell/ID"}, TableColumns::TimeAndValues, formats),
      "Time,Cell/Level [dBm],Cells[ID=a/b]/Level,Cell/ID\n");
  ValueTable table(file.get(), {"Cell/Level", "/Cell/Level"}, {}, plainNumbers, formats);
  for (const char* level : {"-93.50 dBm", "Not Present", "", "(unknown)", "7", "+2.00 dBm"})
    table.take(generation(cell(level)));
  EXPECT_EQ(written(),
            "2024-03-01T14:05:09.250Z,-93.50,-93.50\n"
            "2024-03-01T14:05:09.250Z,Not Present,Not Present\n"
            "2024-03-01T14:05:09.250Z,,\n"
            "2024-03-01T14:05:09.250Z,,\n"
            "2024-03-01T14:05:09.250Z,7,7\n"
            "2024-03-01T14:05:09.250Z,2.00,2.00\n");
}

TEST_F(GenerationWritersTest, NumbersOfJsonAreAsTheyAreShownAndUnitsStandApart) {
  formats.add("Cell", "Level", real("%4.2f dBm"));
  EveryDisplay writer(file.get(), {}, plainNumbers, formats);
  Value display = cell("-93.50 dBm");
  display.dictionary()->get("Cell").dictionary()->set("State", "Idle");
  display.dictionary()->get("Cell").dictionary()->set("Empty", "");
  writer.take(generation(display));
  writer.take(generation(cell("")));
  writer.take(generation({}));
  EXPECT_EQ(
      written(),
      "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":-93.50,\"State\":\"Idle\"}},"
      "\"Units\":{\"Cell\":{\"Level\":\"dBm\"}}}\n"
      "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{}},\"Units\":{}}\n"
      "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{},\"Units\":{}}\n");
}

TEST_F(GenerationWritersTest, OfChangesTheFirstLineIsWholeAndTheNextArePatches) {
  formats.add("Cell", "Level", real("%4.2f dBm"));
  EveryDisplay writer(file.get(), "a", changedNumbers, formats);
  for (const char* level : {"1.00 dBm", "1.00 dBm", "2.00 dBm", "", "", "none"})
    writer.take(generation(cell(level)));
  const std::string start =
      "{\"Capture\":\"a\",\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":";
  EXPECT_EQ(written(), start + "1.00}},\"Units\":{\"Cell\":{\"Level\":\"dBm\"}}}\n" +  //
                           start + "2.00}}}\n" +                                       //
                           start + "null}},\"Units\":{\"Cell\":null}}\n" +             //
                           start + "\"none\"}},\"Units\":{\"Cell\":{\"Level\":\"dBm\"}}}\n");
}

TEST_F(GenerationWritersTest, ADisplayThatChangesInPlaceIsHeldAgainstWhatItWas) {
  EveryDisplay writer(file.get(), {}, changedTexts, formats);
  const Value display = cell("a");
  writer.take(generation(display));
  display.dictionary()->get("Cell").dictionary()->set("Level", "b");
  writer.take(generation(display));
  EXPECT_EQ(written(),
            "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":\"a\"}}}\n"
            "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":\"b\"}}}\n");
}

TEST_F(GenerationWritersTest, RowsWhoseValuesAreThoseOfTheRowBeforeAreNoChanges) {
  ValueTable table(file.get(), {"Cell/Level"}, "a", changedTexts, formats);
  for (const char* level : {"", "", "x", "x", "", "x"}) table.take(generation(cell(level)));
  EXPECT_EQ(written(),
            "a,2024-03-01T14:05:09.250Z,\n"
            "a,2024-03-01T14:05:09.250Z,x\n"
            "a,2024-03-01T14:05:09.250Z,\n"
            "a,2024-03-01T14:05:09.250Z,x\n");
}

TEST(SeenPaths, APathIsSeenOnceADisplayHasAValueThere) {
  Value display = Value::ofDictionary();
  display.dictionary()->set("A", "1");
  display.dictionary()->set("B", Value::ofArray());
  const TechnologyGuess guess;
  SeenPaths seen({"/A", "B", "C", "A"}, guess);
  EXPECT_THAT(seen.unseen(), ElementsAre("/A", "B", "C", "A"));
  seen.take({{}, display});
  EXPECT_THAT(seen.unseen(), ElementsAre("B", "C"));
  display.dictionary()->set("B", "2");
  display.dictionary()->set("C", "3");
  seen.take({{}, display});
  EXPECT_THAT(seen.unseen(), IsEmpty());
}

}  // namespace
}  // namespace varnel

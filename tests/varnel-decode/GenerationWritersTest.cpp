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
};

TEST_F(GenerationWritersTest, EveryDisplayIsALineWithItsTime) {
  EveryDisplay writer(file.get(), {});
  writer.take(generation(cell("-85 dBm")));
  writer.take(generation({}));
  EXPECT_EQ(written(),
            "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":\"-85 dBm\"}}}\n"
            "{\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":\"(unknown)\"}\n");
}

TEST_F(GenerationWritersTest, OfSeveralCapturesEachLineNamesItsOwn) {
  EveryDisplay(file.get(), "a\"b").take(generation(cell("")));
  ValueTable(file.get(), {"Cell/Level"}, "a\"b").take(generation(cell("x")));
  EXPECT_EQ(written(),
            "{\"Capture\":\"a\\\"b\",\"Time\":\"2024-03-01T14:05:09.250Z\",\"Display\":{\"Cell\":{\"Level\":"
            "\"\"}}}\n"
            "\"a\"\"b\",2024-03-01T14:05:09.250Z,x\n");
}

TEST_F(GenerationWritersTest, HeaderNamesTimeAndPathsAsTheUserMayWriteThem) {
  EXPECT_EQ(csvHeader({"Cell/Level", "/Cell/ID"}, TableColumns::TimeAndValues), "Time,Cell/Level,Cell/ID\n");
  EXPECT_EQ(csvHeader({"a,b", "c\"d"}, TableColumns::CaptureTimeAndValues),
            "Capture,Time,\"a,b\",\"c\"\"d\"\n");
}

TEST_F(GenerationWritersTest, CommaQuoteAndLineEndsAreQuotedAndNothingElse) {
  ValueTable table(file.get(), {"Cell/Level"}, {});
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
  ValueTable(file.get(), {"Cell/Level"}, "a\x1B").take(generation(cell("b\x7F\xC2\x80,\t")));
  EXPECT_EQ(written(), "a\\u001B,2024-03-01T14:05:09.250Z,\"b\\u007F\\u0080,\t\"\n");
  EXPECT_EQ(csvHeader({"c\x9"}, TableColumns::TimeAndValues), "Time,c\t\n");
  EXPECT_EQ(csvHeader({"c\x01"}, TableColumns::TimeAndValues), "Time,c\\u0001\n");
}

TEST_F(GenerationWritersTest, AbsentValuesAndSectionsAreEmptyFields) {
  ValueTable(file.get(), {"Cell", "Cell/Level", "Cell/None", "None/Level", ""}, {})
      .take(generation(cell("7")));
  EXPECT_EQ(written(), "2024-03-01T14:05:09.250Z,,7,,,\n");
}

TEST_F(GenerationWritersTest, SortedKeysAreNamedWithoutTheirOrder) {
  Value display = cell("7");
  display.dictionary()->set("_sorted", "");
  display.dictionary()->set("10;Name", "n");
  ValueTable(file.get(), {"Name", "10;Name"}, {}).take(generation(display));
  EXPECT_EQ(written(), "2024-03-01T14:05:09.250Z,n,\n");
}

TEST_F(GenerationWritersTest, AnOutputThatTakesNothingIsAnError) {
  const std::unique_ptr<std::FILE, CloseFile> full(std::fopen("/dev/full", "w"));
  EXPECT_THROW(EveryDisplay(full.get(), {}).take(generation(cell(""))), std::runtime_error);
}

TEST(SeenPaths, APathIsSeenOnceADisplayHasAValueThere) {
  Value display = Value::ofDictionary();
  display.dictionary()->set("A", "1");
  display.dictionary()->set("B", Value::ofArray());
  SeenPaths seen({"/A", "B", "C", "A"});
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

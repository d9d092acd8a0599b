#include "programs/shared/NumberStream.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/programs/trends/TrendHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class NumberStreamTest : public TrendHarness {
 protected:
  // What the reader tells, a line each.
  std::vector<std::string> told;
  std::string bytes;
  NumberStreamWriter writer{[this](std::string_view written) { bytes += written; }};
  NumberStreamReader reader{{
      .begin = [this](bool dated) { told.emplace_back(dated ? "dated" : "not dated"); },
      .generation =
          [this](Time time, std::span<const ValueHistory::Reading> readings) {
            std::string line = "display at " + std::to_string(time.seconds);
            for (const auto& found : readings) {
              line.append(", ").append(found.key.substr(found.nameStart, found.nameLength));
              line.append(" ")
                  .append(std::to_string(std::lround(found.sample.value() * 10)))
                  .append(" ")
                  .append(found.unit);
            }
            told.push_back(line);
          },
      .event = [this](DisplayEvent event) { told.push_back(textOf(event)); },
      .progress = [this](double share) { told.push_back(std::to_string(std::lround(share * 100)) + " %"); },
      .end = [this](const std::string& why) { told.push_back("end: " + why); },
  }};

  void writeAll() {
    writer.begin(true);
    writer.generation({100, 0}, std::vector{reading(level, "dBm", "-85.5"), reading(quality, "dB", "-9")});
    writer.event({{101, 5}, EventKind::Handover, "LTE/Serving Cell", "PCI 1", "PCI 2"});
    writer.progress(0.5);
    writer.generation({102, 0}, std::vector{reading(level, "dBm", "-86")});
    writer.end("torn");
  }
};

TEST_F(NumberStreamTest, TellsWhatWasWritten) {
  writeAll();
  EXPECT_TRUE(reader.take(bytes));
  EXPECT_THAT(told, ElementsAre("dated", "display at 100, RSRP -855 dBm, RSRQ -90 dB",
                                "handover, LTE/Serving Cell: PCI 1 -> PCI 2", "50 %",
                                "display at 102, RSRP -860 dBm", "end: torn"));
}

TEST_F(NumberStreamTest, TheSameInSinglePieces) {
  writeAll();
  for (const char byte : bytes) ASSERT_TRUE(reader.take({&byte, 1}));
  EXPECT_EQ(told.size(), 6U);
}

TEST_F(NumberStreamTest, BytesCutOffTellNothingWrong) {
  writeAll();
  EXPECT_TRUE(reader.take(std::string_view(bytes).substr(0, bytes.size() - 1)));
  EXPECT_EQ(told.size(), 5U);
}

TEST_F(NumberStreamTest, OtherBytesAreRefused) {
  EXPECT_FALSE(reader.take("Xabcdefgh"));
  EXPECT_FALSE(reader.take(bytes));
  EXPECT_THAT(told, IsEmpty());
}

TEST_F(NumberStreamTest, EachSingleWrongByteIsTakenOrRefused) {
  writeAll();
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    for (const int change : {1, 0x80, 0xff}) {
      std::string wrong = bytes;
      wrong[i] = static_cast<char>(wrong[i] ^ change);
      NumberStreamReader other({.begin = [](bool) {},
                                .generation = [](Time, auto) {},
                                .event = [](const DisplayEvent&) {},
                                .progress = [](double) {},
                                .end = [](const std::string&) {}});
      other.take(wrong);
    }
  }
}

}  // namespace
}  // namespace varnel

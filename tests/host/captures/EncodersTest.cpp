#include "host/captures/PcapEncoders.h"
#include "host/captures/StreamEncoders.h"
#include "tests/host/captures/CaptureFiles.h"

namespace varnel {
namespace {

using testing::ElementsAre;

using namespace example;

Bytes copyOf(ByteView bytes) { return {bytes.begin(), bytes.end()}; }

CaptureRecord recordOf(const KeptRecord& record) {
  return {record.time, record.dating, record.message, record.subscription};
}

class Encoders : public CaptureFiles {
 protected:
  static Bytes encoded(CaptureEncoder& encoder, const std::vector<KeptRecord>& records) {
    Bytes bytes = copyOf(encoder.beginning());
    for (const KeptRecord& record : records) {
      const ByteView more = encoder.encode(recordOf(record));
      bytes.insert(bytes.end(), more.begin(), more.end());
    }
    return bytes;
  }

  template <class Encoder>
  std::vector<KeptRecord> again(const std::vector<KeptRecord>& records) const {
    Encoder encoder;
    const CaptureReading reading = readBytes(encoded(encoder, records));
    EXPECT_FALSE(reading.error) << *reading.error;
    EXPECT_EQ(encoder.leftOut(), 0u);
    return reading.records;
  }
};

TEST_F(Encoders, AFrameIsWrittenAsAPortSendsIt) {
  FramedWriter writer;
  EXPECT_EQ(encoded(writer, {datedRecord, undatedRecordOfTwo}), joined({datedFrame, undatedFrame}));
}

TEST_F(Encoders, RecordsAreWrittenEndToEnd) {
  RecordStreamWriter writer;
  EXPECT_EQ(encoded(writer, {datedRecord, undatedRecordOfTwo}), joined({dated, undated}));
}

TEST_F(Encoders, AServersMillisecondsGiveWayToTheRecordsTime) {
  Bytes counted = dated;
  const Bytes milliseconds{0x10, 0x27, 0, 0, 0, 0, 0, 0};  // 10,000
  std::copy(milliseconds.begin(), milliseconds.end(), counted.begin() + 4);
  RecordStreamWriter writer;
  EXPECT_EQ(encoded(writer, {{datedTime, message(counted)}}), dated);
}

TEST_F(Encoders, AModemsTimeIsKeptWhenThePcapRecordHasAnother) {
  RecordStreamWriter writer;
  EXPECT_EQ(encoded(writer, {{{1800000000, 0}, message(dated)}}), dated);
}

TEST_F(Encoders, ARecordsLengthIsItsOwnInTheEnd) {
  Bytes wrong = dated;
  wrong[0] = 17;
  RecordStreamWriter writer;
  EXPECT_EQ(encoded(writer, {{datedTime, message(wrong)}}), dated);
}

TEST_F(Encoders, MessagesThatAreNoRecordsOfAModemAreLeftOutAndCounted) {
  FramedWriter frames;
  RecordStreamWriter records;
  const std::vector<KeptRecord> without{
      {datedTime, joined({{0xFF}, dated})},     {datedTime, {}},           {datedTime, {0x01}},
      {datedTime, firstOf(message(dated), 12)}, {datedTime, {0x81, 0x01}}, {datedTime, Bytes(70'000, 1)}};
  EXPECT_EQ(encoded(frames, without), Bytes{});
  EXPECT_EQ(frames.leftOut(), 6u);
  EXPECT_EQ(encoded(records, without), Bytes{});
  EXPECT_EQ(records.leftOut(), 6u);
}

TEST_F(Encoders, PcapHasNanosecondsAndTheLinkType) {
  PcapWriter writer;
  EXPECT_EQ(
      encoded(writer, {{{0x65432101, 0x1234}, {0xAA, 0xBB}}}),
      (Bytes{0x4D, 0x3C, 0xB2, 0xA1, 2,    0,    4,    0,    0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0x10, 0,   147, 0,
             0,    0,    0x01, 0x21, 0x43, 0x65, 0x34, 0x12, 0, 0, 2, 0, 0, 0, 2, 0, 0, 0, 0xAA, 0xBB}));
}

TEST_F(Encoders, PcapngNamesTheTechnologyInItsInterface) {
  PcapngWriter writer("kalvi-lte");
  const CaptureReading reading = readBytes(encoded(writer, {datedRecord, {{1709301910, 7}, {1, 2, 3}}}));
  EXPECT_EQ(reading.technology, "kalvi-lte");
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, KeptRecord{{1709301910, 7}, {1, 2, 3}}));
}

TEST_F(Encoders, PcapngIsWhatItsStandardSays) {
  PcapngWriter writer("ab");
  // 1 s and 2 ns are 0x3B9ACA02 ns.
  EXPECT_EQ(
      encoded(writer, {{{1, 2}, {9, 8, 7}}}),
      (Bytes{0x0A, 0x0D, 0x0D, 0x0A, 28,   0,  0, 0,  0x4D, 0x3C, 0x2B, 0x1A, 1, 0,  0, 0,  0xFF, 0xFF, 0xFF,
             0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 28, 0, 0,  0,    1,    0,    0,    0, 40, 0, 0,  0,    147,  0,
             0,    0,    0,    0,    0,    0,  3, 0,  2,    0,    'a',  'b',  0, 0,  9, 0,  1,    0,    9,
             0,    0,    0,    0,    0,    0,  0, 40, 0,    0,    0,    6,    0, 0,  0, 36, 0,    0,    0,
             0,    0,    0,    0,    0,    0,  0, 0,  0x02, 0xCA, 0x9A, 0x3B, 3, 0,  0, 0,  3,    0,    0,
             0,    9,    8,    7,    0,    36, 0, 0,  0}));
}

TEST_F(Encoders, FramesThatBecomeRecordsPcapAndFramesAgainKeepEveryRecordAndItsTime) {
  std::vector<KeptRecord> records;
  for (unsigned i = 0; i < 300; ++i) {
    Bytes record(12 + i, static_cast<std::uint8_t>(0x70 + i % 20));
    const std::uint64_t units = i % 2 ? 1'114'669'687'600 : 1600, time = (units + i) << 16 | (i * 163);
    const std::uint64_t header = (12 + i) | 0xB0C00000u;
    for (unsigned byte = 0; byte < 4; ++byte) record[byte] = static_cast<std::uint8_t>(header >> 8 * byte);
    for (unsigned byte = 0; byte < 8; ++byte) record[4 + byte] = static_cast<std::uint8_t>(time >> 8 * byte);
    records.push_back({{}, message(record)});
  }
  FramedWriter writer;
  Bytes frames;
  for (KeptRecord& record : records)
    frames = joined(
        {std::move(frames), example::frame(joined({{0x10, 0, record.message[1], record.message[2]},
                                                   {record.message.begin() + 1, record.message.end()}}))});
  const CaptureReading first = readBytes(frames);
  ASSERT_EQ(first.records.size(), 300u);
  for (std::size_t i = 0; i < records.size(); ++i) ASSERT_EQ(first.records[i].message, records[i].message);
  const auto asRecords = again<RecordStreamWriter>(first.records);
  EXPECT_EQ(asRecords, first.records);
  const auto asPcap = again<PcapWriter>(asRecords);
  ASSERT_EQ(asPcap.size(), 300u);
  FramedWriter last;
  EXPECT_EQ(encoded(last, asPcap), frames);
}

}  // namespace
}  // namespace varnel

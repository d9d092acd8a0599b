#include <fcntl.h>
#include <unistd.h>
#include <zlib.h>

#include <thread>

#include "host/captures/PcapEncoders.h"
#include "tests/host/captures/CaptureFiles.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

using namespace example;

class Streams : public CaptureFiles {};

Bytes packed(const Bytes& bytes) {
  z_stream stream{};
  EXPECT_EQ(::deflateInit2(&stream, 9, Z_DEFLATED, 16 + MAX_WBITS, 8, Z_DEFAULT_STRATEGY), Z_OK);
  Bytes result(bytes.size() + 1000);
  Bytes input = bytes;
  stream.next_in = input.data();
  stream.avail_in = static_cast<uInt>(input.size());
  stream.next_out = result.data();
  stream.avail_out = static_cast<uInt>(result.size());
  EXPECT_EQ(::deflate(&stream, Z_FINISH), Z_STREAM_END);
  result.resize(stream.total_out);
  ::deflateEnd(&stream);
  return result;
}

// A phone's own log file: its header's length (inclusive), version, flag, one identifier.
Bytes logFileHeader(std::uint8_t flag) {
  Bytes header(26, 0xAB);
  const Bytes begin{26, 0, 0, 0, 1, flag, 1, 0, 0, 0};
  std::copy(begin.begin(), begin.end(), header.begin());
  return header;
}

TEST_F(Streams, FramesAreUnescapedAndTellTimeAndSubscription) {
  const CaptureReading reading = readBytes(joined({datedFrame, undatedFrame}));
  EXPECT_FALSE(reading.error);
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, undatedRecordOfTwo));
  EXPECT_EQ(reading.leftOut, LeftOut{});
}

TEST_F(Streams, FramesThatHoldNoRecordAreCountedByKind) {
  Bytes unsound = datedFrame;
  unsound[7] ^= 1;
  const CaptureReading reading = readBytes(joined(
      {{0x7E}, datedFrame, unsound, answerFrame, debugFrame, encryptedFrame, brokenFrame, undatedFrame}));
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, undatedRecordOfTwo));
  EXPECT_EQ(reading.leftOut, (LeftOut{.badChecksum = 1, .otherCommands = 2, .encrypted = 1, .broken = 1}));
  EXPECT_EQ(reading.leftOut.frames(), 5u);
}

TEST_F(Streams, AFrameMayBeginWithAFrameEndAndEmptyOnesAreNone) {
  const CaptureReading reading = readBytes(joined({{0x7E}, datedFrame, {0x7E, 0x7E}, undatedFrame, {0x7E}}));
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, undatedRecordOfTwo));
  EXPECT_EQ(reading.leftOut, LeftOut{});
}

TEST_F(Streams, TheFirstAndTheLastFrameMayBeTorn) {
  const Bytes end(datedFrame.begin() + 9, datedFrame.end());
  const CaptureReading reading = readBytes(joined({end, undatedFrame, datedFrame, firstOf(datedFrame, 9)}));
  EXPECT_FALSE(reading.error);
  EXPECT_THAT(reading.records, ElementsAre(undatedRecordOfTwo, datedRecord));
  EXPECT_EQ(reading.leftOut, LeftOut{.torn = 2});
}

TEST_F(Streams, NoneIsLostBehindAFrameThatBreaksOff) {
  // Another frame begins inside, without a frame end between them. Both together are one unsound frame.
  const CaptureReading reading =
      readBytes(joined({undatedFrame, firstOf(datedFrame, 12), datedFrame, undatedFrame, datedFrame}));
  EXPECT_THAT(reading.records, ElementsAre(undatedRecordOfTwo, undatedRecordOfTwo, datedRecord));
  EXPECT_EQ(reading.leftOut, LeftOut{.badChecksum = 1});
}

TEST_F(Streams, WhatIsTooShortOrTooLongForAFrameIsNoise) {
  const CaptureReading reading = readBytes(
      joined({datedFrame, {0x55, 0xAA, 0x7E}, undatedFrame, Bytes(1'000'000, 'x'), {0x7E}, datedFrame}));
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, undatedRecordOfTwo, datedRecord));
  EXPECT_EQ(reading.leftOut, LeftOut{.noiseBytes = 1'000'002});
}

TEST_F(Streams, ARecordMayBeAsLongAsItsLengthCanSay) {
  Bytes record(0xFFFF, 0x7D);
  const Bytes header{0xFF, 0xFF, 0x7F, 0xB1, 0x00, 0x60, 0x30, 0xA3, 0x7D, 0x87, 0x03, 0x01};
  std::copy(header.begin(), header.end(), record.begin());
  const Bytes contents = joined({{0x98, 0x01, 0, 0, 1, 0, 0, 0, 0x10, 0, 0xFF, 0xFF}, record});
  const CaptureReading reading = readBytes(joined({undatedFrame, example::frame(contents)}));
  ASSERT_EQ(reading.records.size(), 2u);
  EXPECT_EQ(reading.records[1].message, joined({{0x81, 0x01, 0x01}, record}));
  EXPECT_EQ(reading.records[1].subscription, 1);
}

TEST_F(Streams, SubscriptionsOutsideAByteAreNone) {
  for (const Bytes& number : {Bytes{0, 0, 0, 0}, Bytes{0xFF, 0xFF, 0xFF, 0xFF}}) {
    const Bytes contents = joined({{0x98, 0x01, 0, 0}, number, datedContents});
    EXPECT_THAT(readBytes(example::frame(contents)).records, ElementsAre(datedRecord));
  }
}

TEST_F(Streams, LengthsMayStandInPlaceOfEscapesAndChecksums) {
  const CaptureReading reading = readBytes(
      joined({lengthFrame(datedContents), lengthFrame({0x79, 0x01}), lengthFrame(undatedContents)}));
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, undatedRecordOfTwo));
  EXPECT_EQ(reading.leftOut, LeftOut{.otherCommands = 1});
}

TEST_F(Streams, ALengthFrameThatBreaksOffLosesNoOther) {
  const Bytes frame = lengthFrame(datedContents);
  const CaptureReading reading =
      readBytes(joined({Bytes(frame.begin() + 5, frame.end()), lengthFrame(undatedContents),
                        firstOf(frame, 11), frame, frame, firstOf(frame, 4)}));
  EXPECT_THAT(reading.records, ElementsAre(undatedRecordOfTwo, datedRecord, datedRecord));
  EXPECT_EQ(reading.leftOut, LeftOut{.torn = 3});
}

TEST_F(Streams, APhonesOwnLogFileHasAHeaderBeforeEither) {
  const std::vector<KeptRecord> records{datedRecord, undatedRecordOfTwo};
  CaptureReading reading = readBytes(joined({logFileHeader(1), datedFrame, undatedFrame}));
  EXPECT_EQ(reading.records, records);
  EXPECT_EQ(reading.leftOut, LeftOut{});
  reading = readBytes(joined({logFileHeader(0), lengthFrame(datedContents), lengthFrame(undatedContents)}));
  EXPECT_EQ(reading.records, records);
  EXPECT_EQ(reading.leftOut, LeftOut{});
}

TEST_F(Streams, TheHeadersLengthNeedNotCountItself) {
  Bytes header = logFileHeader(1);
  header[0] = 22;
  const CaptureReading reading = readBytes(joined({header, datedFrame}));
  EXPECT_THAT(reading.records, ElementsAre(datedRecord));
  EXPECT_EQ(reading.leftOut, LeftOut{});
}

TEST_F(Streams, RecordsMayStandEndToEnd) {
  const CaptureReading reading = readBytes(joined({dated, undated, dated, undated}));
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, undatedRecord, datedRecord, undatedRecord));
  EXPECT_EQ(reading.leftOut, LeftOut{});
}

TEST_F(Streams, ARecordWhoseLengthCannotBeEndsTheRecords) {
  Bytes broken = dated;
  broken[0] = 11;
  const CaptureReading reading = readBytes(joined({dated, undated, dated, broken, undated}));
  EXPECT_FALSE(reading.error);
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, undatedRecord, datedRecord));
  EXPECT_EQ(reading.leftOut, (LeftOut{.broken = 1, .noiseBytes = 29}));
}

TEST_F(Streams, TheBinaryLogsOfAViewerHaveIntervalsWithoutTheirFirstByte) {
  const Bytes typed = message(dated), prefixed = joined({{0x81, 0x02, 0x01}, undated});
  // A server's message: 3,000 ms after the modem's start.
  const Bytes server{0x0D, 0x00, 0x02, 0x00, 0xB8, 0x0B, 0, 0, 0, 0, 0, 0, 0x3C};
  const Bytes serverMessage = joined({{0xFF}, server});
  const CaptureReading reading =
      readBytes(joined({versionReport(), dated, typed, prefixed,  // an interval
                        Bytes{prefixed.begin() + 1, prefixed.end()}, serverMessage, server, typed}));
  EXPECT_FALSE(reading.error);
  const KeptRecord countedOfTwo{countedTime, prefixed, Dating::Unknown, 2},
      serverRecord{{315964803, 0}, serverMessage, Dating::Unknown};
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, datedRecord, countedOfTwo, countedOfTwo, serverRecord,
                                           serverRecord, datedRecord));
  EXPECT_EQ(reading.leftOut, LeftOut{});
}

TEST_F(Streams, InABinaryLogEveryRecordWhoseLengthIsItsOwnIsFound) {
  Bytes tooShort = message(dated);
  tooShort[1] = 9;  // no record is that short
  const CaptureReading reading = readBytes(joined(
      {versionReport(), dated, tooShort, message(dated), message(undated), {1, 2, 3}, message(dated)}));
  const KeptRecord countedRecord{countedTime, message(undated), Dating::Unknown};
  EXPECT_THAT(reading.records, ElementsAre(datedRecord, datedRecord, countedRecord, datedRecord));
  EXPECT_EQ(reading.leftOut, (LeftOut{.broken = 2, .noiseBytes = 20}));
}

TEST_F(Streams, GzipMayBeAroundThem) {
  const Bytes plain = joined({datedFrame, undatedFrame});
  EXPECT_THAT(readBytes(packed(plain)).records, ElementsAre(datedRecord, undatedRecordOfTwo));
  // Two pieces with a torn frame between them.
  const Bytes first = firstOf(plain, 40), second(plain.begin() + 40, plain.end());
  EXPECT_THAT(readBytes(joined({packed(first), packed(second)})).records,
              ElementsAre(datedRecord, undatedRecordOfTwo));
}

TEST_F(Streams, OfGzipThatIsCutOffAllComesThatCameBefore) {
  Bytes plain;
  for (int i = 0; i < 20'000; ++i) {
    Bytes contents = datedContents;
    contents[16] = static_cast<std::uint8_t>(i * 7919 >> 4);
    contents[18] = static_cast<std::uint8_t>(i * 104'729 >> 7);
    plain = joined({plain.empty() ? Bytes{} : Bytes{}, std::move(plain), example::frame(contents)});
    if (plain.size() > 200'000) break;
  }
  const Bytes whole = packed(plain);
  const CaptureReading reading = readBytes(firstOf(whole, whole.size() / 2));
  EXPECT_FALSE(reading.error);
  EXPECT_GT(reading.records.size(), 1000u);
  EXPECT_LE(reading.leftOut.torn, 1u);
}

TEST_F(Streams, DamagedGzipIsAnErrorBehindWhatCameBefore) {
  Bytes bytes = packed(joined({datedFrame, undatedFrame}));
  bytes[10] = 0xFF;  // no kind of block
  const CaptureReading reading = readBytes(bytes);
  ASSERT_TRUE(reading.error);
  EXPECT_EQ(*reading.error, path() + " is damaged: what gzip has packed cannot be unpacked any further");
}

TEST_F(Streams, WhatIsNoCaptureIsToldInASentence) {
  const auto errorOf = [&](const Bytes& bytes) { return readBytes(bytes).error.value_or("none"); };
  const std::string text = "This is no capture, whatever its name says.\n";
  EXPECT_EQ(errorOf({}), path() + " is empty, and so no capture");
  EXPECT_EQ(
      errorOf({text.begin(), text.end()}),
      path() + " holds text, no capture; a capture is what a modem's diagnostic port sends, byte for byte");
  EXPECT_EQ(errorOf({0x89, 'P', 'N', 'G', 13, 10, 26, 10, 0, 0}), path() + " holds a picture, no capture");
  EXPECT_EQ(errorOf({0x28, 0xB5, 0x2F, 0xFD, 0, 0}), path() + " is packed; unpack it first, with zstd -d");
  EXPECT_EQ(errorOf(packed({})), path() + ", unpacked, is empty, and so no capture");
  EXPECT_EQ(errorOf(packed(packed(datedFrame))), path() + " is packed twice; unpack it once, with gzip -d");
  EXPECT_EQ(errorOf(Bytes(1000, 0)),
            path() +
                " is no capture that is known: neither pcap, nor frames of a diagnostic port, nor log "
                "records; was all of it copied, from its first byte on?");
  const std::string folder = std::filesystem::path(path()).parent_path().string();
  EXPECT_EQ(readCapture(folder).error.value_or("none"), folder + " is a folder; name a capture in it");
  EXPECT_EQ(readCapture(path("missing")).error.value_or("none"),
            "cannot open " + path("missing") + ": No such file or directory");
}

struct Golden {
  const char* name;
  Bytes bytes;
  std::vector<std::size_t> ends;  // of the records
  std::size_t begin = 0;          // of the first record
};

std::vector<Golden> goldens() {
  const Bytes lengthDated = lengthFrame(datedContents), lengthUndated = lengthFrame(undatedContents);
  return {
      {"framed", joined({datedFrame, undatedFrame}), {26, 54}},
      {"length-framed", joined({lengthDated, lengthUndated}), {25, 55}},
      {"header, framed", joined({logFileHeader(1), datedFrame, undatedFrame}), {52, 80}},
      {"header, length-framed", joined({logFileHeader(0), lengthDated, lengthUndated}), {51, 81}},
      {"records", joined({dated, undated}), {16, 29}},
      {"binary log", joined({versionReport(), dated, message(undated)}), {177, 191}, 161},
  };
}

TEST_F(Streams, OfEveryTruncationAllWholeRecordsComeOrItIsNoCapture) {
  for (const Golden& golden : goldens()) {
    SCOPED_TRACE(golden.name);
    ASSERT_EQ(golden.bytes.size(), golden.ends.back());
    for (std::size_t length = 0; length <= golden.bytes.size(); ++length) {
      const CaptureReading reading = readMemory(firstOf(golden.bytes, length));
      const auto whole = static_cast<std::size_t>(
          std::ranges::count_if(golden.ends, [&](std::size_t end) { return end <= length; }));
      EXPECT_EQ(reading.records.size(), whole) << length;
      EXPECT_FALSE(whole > 0 && reading.error) << length << reading.error.value_or("");
      // The rest of a record is a torn record.
      const bool isCutWithin =
          !reading.error && length != golden.begin && !std::ranges::count(golden.ends, length);
      EXPECT_EQ(reading.leftOut.torn + reading.leftOut.broken, isCutWithin ? 1u : 0u) << length;
    }
  }
}

TEST_F(Streams, TenThousandMutantsAreReadToTheirEnd) {
  std::uint64_t random = 20240301;
  const auto next = [&] { return random = random * 6364136223846793005 + 1442695040888963407; };
  const std::vector<Golden> all = goldens();
  for (int i = 0; i < 10'000; ++i) {
    const Golden& golden = all[static_cast<std::size_t>(i) % all.size()];
    Bytes bytes = joined({golden.bytes, golden.bytes, golden.bytes});
    for (std::uint64_t count = 1 + (next() >> 33) % 4; count > 0; --count)
      bytes[(next() >> 33) % bytes.size()] = static_cast<std::uint8_t>(next() >> 40);
    if (i % 3 == 0) bytes.erase(bytes.begin() + static_cast<std::ptrdiff_t>((next() >> 33) % bytes.size()));
    const CaptureReading reading = readMemory(bytes);
    std::size_t size = 0;
    for (const KeptRecord& record : reading.records) {
      ASSERT_LT(record.time.nanoseconds, 1'000'000'000);
      ASSERT_GE(record.message.size(), 13u);
      size += record.message.size();
    }
    // No byte is part of two records. A framed record gains at most its log type and its prefix.
    ASSERT_LE(size, bytes.size() + 3 * reading.records.size()) << i;
    ASSERT_THAT(reading.error.value_or("memory"), testing::AllOf(HasSubstr("memory"), Not(HasSubstr("\n"))));
  }
}

// The bytes with one to four bytes changed.
template <class Random>
Bytes mutantOf(Bytes bytes, Random& random) {
  for (std::uint64_t count = 1 + (random() >> 33) % 4; count > 0; --count)
    bytes[(random() >> 33) % bytes.size()] = static_cast<std::uint8_t>(random() >> 40);
  return bytes;
}

Bytes sixRecordsBy(CaptureEncoder& encoder) {
  const ByteView beginning = encoder.beginning();
  Bytes bytes(beginning.begin(), beginning.end());
  for (int i = 0; i < 6; ++i) {
    const ByteView more = encoder.encode({datedTime, Dating::Known, datedRecord.message, {}});
    bytes.insert(bytes.end(), more.begin(), more.end());
  }
  return bytes;
}

TEST_F(Streams, TenThousandMutantsOfPcapAndGzipAreReadToTheirEnd) {
  std::uint64_t state = 20240302;
  auto random = [&] { return state = state * 6364136223846793005 + 1442695040888963407; };
  PcapWriter pcap;
  PcapngWriter pcapng("kalvi-lte");
  const Bytes originals[] = {sixRecordsBy(pcap), sixRecordsBy(pcapng),
                             packed(joined({datedFrame, undatedFrame, datedFrame}))};
  EXPECT_EQ(readMemory(originals[0]).records.size(), 6u);
  EXPECT_EQ(readMemory(originals[1]).records.size(), 6u);
  EXPECT_EQ(readMemory(originals[2]).records.size(), 3u);
  for (std::size_t i = 0; i < 10'000; ++i) {
    const Bytes bytes = mutantOf(originals[i % 3], random);
    const CaptureReading reading = readMemory(bytes);
    ASSERT_LE(reading.records.size(), 6u) << i;
    for (const KeptRecord& record : reading.records) ASSERT_LT(record.message.size(), 1000u) << i;
    ASSERT_THAT(reading.error.value_or("memory"), testing::AllOf(HasSubstr("memory"), Not(HasSubstr("\n"))));
  }
}

TEST_F(Streams, WhatComesFromAPipeComesOutAsSoonAsItIsWhole) {
  int ends[2];
  ASSERT_EQ(::pipe2(ends, O_CLOEXEC), 0);
  const auto send = [&](const Bytes& bytes) {
    ASSERT_EQ(::write(ends[1], bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
  };
  send(datedFrame);
  // It would wait forever if it needed more bytes.
  const auto capture = openCapture("/dev/fd/" + std::to_string(ends[0]));
  CaptureRecord record;
  ASSERT_TRUE(capture->next(record));
  EXPECT_EQ(kept(record), datedRecord);
  send(undatedFrame);
  ASSERT_TRUE(capture->next(record));
  EXPECT_EQ(kept(record), undatedRecordOfTwo);
  send(firstOf(datedFrame, 5));
  ::close(ends[1]);
  EXPECT_FALSE(capture->next(record));
  EXPECT_EQ(capture->leftOut(), LeftOut{.torn = 1});
  ::close(ends[0]);
}

TEST_F(Streams, AFileThatGrowsIsFollowed) {
  std::ofstream file(path(), std::ios::binary);
  const auto append = [&](const Bytes& bytes) {
    file.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    file.flush();
  };
  append(joined({datedFrame, firstOf(undatedFrame, 7)}));
  const auto capture = openCapture(path(), {.atEnd = AtEndOfFile::WaitForMore});
  CaptureRecord record;
  ASSERT_TRUE(capture->next(record));
  std::thread writer([&] { append({undatedFrame.begin() + 7, undatedFrame.end()}); });
  ASSERT_TRUE(capture->next(record));  // waits for it
  EXPECT_EQ(kept(record), undatedRecordOfTwo);
  writer.join();
}

}  // namespace
}  // namespace varnel

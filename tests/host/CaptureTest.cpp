#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <string>
#include <vector>

#include "host/CaptureWriter.h"
#include "tests/host/captures/CaptureFiles.h"

namespace varnel {
namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

// Builds files by hand, in either byte order.
class FileBytes {
 public:
  enum class Order { Little, Big };
  explicit FileBytes(Order order = Order::Little) : _order(order) {}

  FileBytes& u16(std::uint16_t number) { return put(number, 2); }
  FileBytes& u32(std::uint32_t number) { return put(number, 4); }
  FileBytes& raw(const Bytes& more) {
    bytes.insert(bytes.end(), more.begin(), more.end());
    return *this;
  }
  FileBytes& pcapHeader(std::uint32_t magic, std::uint32_t linkType = 147, std::uint32_t snapshot = 65535) {
    return u32(magic).u16(2).u16(4).u32(0).u32(0).u32(snapshot).u32(linkType);
  }
  FileBytes& pcapRecord(std::uint32_t seconds, std::uint32_t fraction, const Bytes& message) {
    const auto size = static_cast<std::uint32_t>(message.size());
    return u32(seconds).u32(fraction).u32(size).u32(size).raw(message);
  }
  FileBytes& pcapngHeader() {
    return u32(0x0A0D0D0A).u32(28).u32(0x1A2B3C4D).u16(1).u16(0).u32(~0u).u32(~0u).u32(28);
  }
  // With nanoseconds, and without a bound on the length.
  FileBytes& pcapngInterface(std::uint16_t linkType) {
    return u32(1).u32(32).u16(linkType).u16(0).u32(0).u16(9).u16(1).raw({9, 0, 0, 0}).u16(0).u16(0).u32(32);
  }
  FileBytes& pcapngPacket(std::uint64_t time, const Bytes& fourBytes) {
    return u32(6)
        .u32(36)
        .u32(0)
        .u32(static_cast<std::uint32_t>(time >> 32))
        .u32(static_cast<std::uint32_t>(time))
        .u32(4)
        .u32(4)
        .raw(fourBytes)
        .u32(36);
  }

  Bytes bytes;

 private:
  FileBytes& put(std::uint32_t number, unsigned width) {
    for (unsigned i = 0; i < width; ++i) {
      const unsigned shift = 8 * (_order == Order::Little ? i : width - 1 - i);
      bytes.push_back(static_cast<std::uint8_t>(number >> shift));
    }
    return *this;
  }

  Order _order;
};

constexpr std::uint32_t microsecondMagic = 0xA1B2C3D4, nanosecondMagic = 0xA1B23C4D;

void expectOneLineAboutTheFile(const CaptureReading& reading, const std::string& file) {
  ASSERT_TRUE(reading.error);
  EXPECT_THAT(*reading.error, HasSubstr(file));
  EXPECT_THAT(*reading.error, Not(HasSubstr("\n")));
}

class PcapFiles : public CaptureFiles {
 protected:
  // Where the parts of a file with two records end.
  struct Ends {
    std::size_t header, firstRecord, whole;
  };

  // A file that ends between two parts is sound. The first record stays in any case.
  void expectTruncationsAreErrors(const Bytes& whole, const Ends& ends) const {
    ASSERT_EQ(whole.size(), ends.whole);
    for (std::size_t length = 0; length < whole.size(); ++length) {
      const CaptureReading reading = readBytes(firstOf(whole, length));
      EXPECT_EQ(reading.records.size(), length < ends.firstRecord ? 0u : 1u) << length;
      if (length == ends.header || length == ends.firstRecord)
        EXPECT_FALSE(reading.error) << length;
      else
        expectOneLineAboutTheFile(reading, path());
    }
  }
};

TEST_F(PcapFiles, MicrosecondsInLittleEndian) {
  const CaptureReading reading =
      readBytes(FileBytes().pcapHeader(microsecondMagic).pcapRecord(1700000000, 250000, {1, 2, 3}).bytes);
  EXPECT_FALSE(reading.error);
  EXPECT_EQ(reading.records, (std::vector<KeptRecord>{{{1700000000, 250000000}, {1, 2, 3}}}));
}

TEST_F(PcapFiles, NanosecondsInBigEndian) {
  const CaptureReading reading = readBytes(FileBytes(FileBytes::Order::Big)
                                               .pcapHeader(nanosecondMagic)
                                               .pcapRecord(1700000000, 123456789, {9})
                                               .pcapRecord(1700000001, 0, {})
                                               .bytes);
  EXPECT_FALSE(reading.error);
  EXPECT_EQ(reading.records,
            (std::vector<KeptRecord>{{{1700000000, 123456789}, {9}}, {{1700000001, 0}, {}}}));
}

TEST_F(PcapFiles, NextGenerationFilesInBothByteOrders) {
  for (const auto order : {FileBytes::Order::Little, FileBytes::Order::Big}) {
    // 1,700,000,000.5 s in nanoseconds
    const CaptureReading reading = readBytes(FileBytes(order)
                                                 .pcapngHeader()
                                                 .pcapngInterface(147)
                                                 .pcapngPacket(1700000000500000000, {5, 6, 7, 8})
                                                 .bytes);
    EXPECT_FALSE(reading.error) << *reading.error;
    EXPECT_EQ(reading.records, (std::vector<KeptRecord>{{{1700000000, 500000000}, {5, 6, 7, 8}}}));
  }
}

TEST_F(PcapFiles, ACaptureWithoutRecordsIsFine) {
  const CaptureReading reading = readBytes(FileBytes().pcapHeader(microsecondMagic).bytes);
  EXPECT_FALSE(reading.error);
  EXPECT_TRUE(reading.records.empty());
}

TEST_F(PcapFiles, ASubSecondPartOfMoreThanASecondIsCarried) {
  const CaptureReading reading = readBytes(FileBytes()
                                               .pcapHeader(microsecondMagic)
                                               .pcapRecord(100, 1500000, {1})
                                               .pcapRecord(100, 1000000, {2})
                                               .pcapRecord(100, 0xFFFFFFFF, {3})
                                               .bytes);
  ASSERT_EQ(reading.records.size(), 3u);
  EXPECT_EQ(reading.records[0].time, (Time{101, 500000000}));
  EXPECT_EQ(reading.records[1].time, (Time{101, 0}));
  EXPECT_GE(reading.records[2].time.nanoseconds, 0);
  EXPECT_LT(reading.records[2].time.nanoseconds, 1000000000);
}

TEST_F(PcapFiles, AnotherLinkTypeIsAnError) {
  const CaptureReading reading = readBytes(FileBytes().pcapHeader(microsecondMagic, 1).bytes);
  expectOneLineAboutTheFile(reading, path());
  EXPECT_THAT(*reading.error,
              EndsWith(" holds Ethernet frames (link type 1), but captures of the log channel have link type "
                       "147 (USER0); capture what the modem's diagnostic port sends"));
  expectOneLineAboutTheFile(readBytes(FileBytes().pcapngHeader().pcapngInterface(1).bytes), path());
}

TEST_F(PcapFiles, EveryTruncationIsAnErrorThatKeepsWhatCameBefore) {
  const Bytes whole = FileBytes()
                          .pcapHeader(microsecondMagic)    // 24 bytes
                          .pcapRecord(1, 0, {1, 2, 3})     // up to 43
                          .pcapRecord(2, 0, {4, 5, 6, 7})  // up to 63
                          .bytes;
  expectTruncationsAreErrors(whole, {.header = 24, .firstRecord = 43, .whole = 63});
}

TEST_F(PcapFiles, EveryTruncationOfANextGenerationFileIsAnError) {
  const Bytes whole = FileBytes()
                          .pcapngHeader()                 // 28 bytes
                          .pcapngInterface(147)           // up to 60
                          .pcapngPacket(1, {1, 2, 3, 4})  // up to 96
                          .pcapngPacket(2, {1, 2, 3, 4})  // up to 132
                          .bytes;
  expectTruncationsAreErrors(whole, {.header = 60, .firstRecord = 96, .whole = 132});
}

TEST_F(PcapFiles, ARecordThatWasCutShortIsAnError) {
  const CaptureReading reading = readBytes(FileBytes()
                                               .pcapHeader(microsecondMagic)
                                               .pcapRecord(1, 0, {1})
                                               .u32(2)
                                               .u32(0)
                                               .u32(2)
                                               .u32(300)
                                               .raw({1, 2})
                                               .bytes);
  EXPECT_EQ(reading.records.size(), 1u);
  expectOneLineAboutTheFile(reading, path());
  EXPECT_THAT(*reading.error,
              EndsWith(", record 2: only 2 of 300 bytes were captured; capture again without a "
                       "snapshot length"));
}

TEST_F(PcapFiles, ARecordMayBeLongerThanTheFilesSnapshotLength) {
  const Bytes large(1'048'576, 0x5A);
  for (const auto order : {FileBytes::Order::Little, FileBytes::Order::Big}) {
    const CaptureReading reading =
        readBytes(FileBytes(order).pcapHeader(microsecondMagic, 147, 65535).pcapRecord(1, 0, large).bytes);
    EXPECT_FALSE(reading.error) << *reading.error;
    ASSERT_EQ(reading.records.size(), 1u);
    EXPECT_TRUE(reading.records[0].message == large);
  }
}

TEST_F(PcapFiles, ARecordOfMoreThanAMebibyteIsLeftOutAndTold) {
  const Bytes tooLarge(1'048'577, 0x5A);
  for (const auto order : {FileBytes::Order::Little, FileBytes::Order::Big}) {
    const CaptureReading reading = readBytes(FileBytes(order)
                                                 .pcapHeader(microsecondMagic)
                                                 .pcapRecord(1, 0, {1})
                                                 .pcapRecord(2, 0, tooLarge)
                                                 .pcapRecord(3, 0, {3})
                                                 .bytes);
    EXPECT_FALSE(reading.error) << *reading.error;
    EXPECT_EQ(reading.records, (std::vector<KeptRecord>{{{1, 0}, {1}}, {{3, 0}, {3}}}));
    EXPECT_EQ(reading.told, (std::vector<std::string>{
                                path() + ", record 2 is left out: its 1048577 bytes are more than a message "
                                         "may have, 1 MiB"}));
  }
}

TEST_F(PcapFiles, SecondsAreUnsigned) {
  const CaptureReading reading =
      readBytes(FileBytes().pcapHeader(microsecondMagic).pcapRecord(0xFFFFFFFF, 0, {1}).bytes);
  EXPECT_EQ(reading.records, (std::vector<KeptRecord>{{{4294967295, 0}, {1}}}));
}

TEST_F(PcapFiles, MessagesOfTheAirInterfaceAreCalledSo) {
  // Ethernet, IPv4 and UDP to port 4729.
  Bytes packet(60);
  packet[12] = 0x08;
  packet[14] = 0x45;
  packet[23] = 17;
  packet[36] = 0x12;
  packet[37] = 0x79;
  const CaptureReading reading =
      readBytes(FileBytes().pcapHeader(microsecondMagic, 1).pcapRecord(1, 0, packet).bytes);
  ASSERT_TRUE(reading.error);
  EXPECT_EQ(*reading.error,
            path() +
                " holds messages of the air interface, sent over a network (link type 1), but "
                "captures of the log channel have link type 147 (USER0); capture what the "
                "modem's diagnostic port sends");
}

TEST_F(PcapFiles, ForeignFilesAreErrors) {
  expectOneLineAboutTheFile(readBytes({}), path());
  expectOneLineAboutTheFile(readBytes(Bytes(100, 'a')), path());
  expectOneLineAboutTheFile(readCapture(path("missing.pcap")), path("missing.pcap"));
  EXPECT_THAT(*readCapture(path("missing.pcap")).error, EndsWith(": No such file or directory"));
  expectOneLineAboutTheFile(readCapture(std::filesystem::temp_directory_path().string()),
                            std::filesystem::temp_directory_path().string());
}

TEST_F(PcapFiles, ADashIsStandardInput) {
  readBytes(FileBytes().pcapHeader(microsecondMagic).pcapRecord(7, 8, {9}).bytes);
  const int kept = ::dup(STDIN_FILENO);
  const int file = ::open(path().c_str(), O_RDONLY);
  ::dup2(file, STDIN_FILENO);
  const CaptureReading reading = readCapture("-");
  ::dup2(kept, STDIN_FILENO);
  ::close(file);
  ::close(kept);
  EXPECT_FALSE(reading.error);
  EXPECT_EQ(reading.records, (std::vector<KeptRecord>{{{7, 8000}, {9}}}));
}

TEST_F(PcapFiles, WhatIsWrittenIsReadBack) {
  const Bytes large(1'048'576, 0x5A);
  {
    CaptureWriter writer(path());
    writer.write({1700000000, 999999999}, Bytes{1, 2, 3});
    // The record is available at once.
    EXPECT_EQ(readCapture(path()).records.size(), 1u);
    writer.write({1700000001, 0}, {});
    writer.write({1700000001, 1}, large);
  }
  const CaptureReading reading = readCapture(path());
  EXPECT_FALSE(reading.error);
  EXPECT_TRUE(reading.records ==
              (std::vector<KeptRecord>{
                  {{1700000000, 999999999}, {1, 2, 3}}, {{1700000001, 0}, {}}, {{1700000001, 1}, large}}));
}

TEST_F(PcapFiles, TheWriterWritesNanosecondsAndTheLinkType) {
  CaptureWriter(path()).write({1, 2}, Bytes{3});
  const std::string header = contentsOf(path());
  ASSERT_EQ(header.size(), 41u);
  EXPECT_THAT(header, StartsWith(std::string("\x4D\x3C\xB2\xA1\x02\x00\x04\x00", 8)));
  EXPECT_EQ(header.substr(20, 4), std::string("\x93\x00\x00\x00", 4));
}

TEST_F(PcapFiles, TheWriterNamesTheTechnologyInPcapng) {
  CaptureWriter(path(), ExistingRecording::Refused, "kalvi-lte").write({1, 2}, Bytes{3});
  EXPECT_EQ(openCapture(path())->technology(), "kalvi-lte");
  EXPECT_EQ(readCapture(path()).records, (std::vector<KeptRecord>{{{1, 2}, {3}}}));
}

TEST_F(PcapFiles, AFileThatCannotBeWrittenIsAnError) {
  EXPECT_THROW(CaptureWriter(path("no/such/folder.pcap")), std::runtime_error);
  EXPECT_THROW(CaptureWriter("/dev/full").write({1, 2}, Bytes{3}), std::runtime_error);
}

}  // namespace
}  // namespace varnel

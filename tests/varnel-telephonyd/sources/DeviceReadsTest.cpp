#include "programs/varnel-telephonyd/sources/DeviceReads.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using Device = DeviceReads::Device;

class DeviceReadsTest : public testing::Test {
 protected:
  DeviceReadsTest() { _reads.begin(Device::Other); }
  // The stream's bytes in one read.
  std::string take(const Bytes& read) {
    std::string stream;
    _reads.take(read, [&](ByteView bytes) { stream.append(bytes.begin(), bytes.end()); });
    return stream;
  }

  LeftOut _counts;
  DeviceReads _reads{_counts};
};

const Bytes abAndC{32, 0, 0, 0, 2, 0, 0, 0, 2, 0, 0, 0, 'a', 'b', 1, 0, 0, 0, 'c'};

TEST_F(DeviceReadsTest, ASerialLineGivesTheStream) {
  _reads.begin(Device::SerialLine);
  EXPECT_EQ(take(abAndC).size(), abAndC.size());
}

TEST_F(DeviceReadsTest, AnotherDeviceMayGiveTheStreamToo) {
  EXPECT_EQ(take({'a', 'b'}), "ab");
  EXPECT_EQ(take(abAndC).size(), abAndC.size());
}

// A kind, a number of buffers, and a length that no message has.
TEST_F(DeviceReadsTest, WhatOnlyBeginsLikeAMessageIsTheStream) {
  for (const Bytes& first :
       {Bytes{32, 0, 0, 1}, Bytes{32, 0, 0, 0, 0, 0, 0, 0}, Bytes{32, 0, 0, 0, 1, 0, 1, 0},
        Bytes{32, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0}, Bytes{32, 0, 0, 0, 1, 0, 0, 0, 1, 0, 16, 0}}) {
    _reads.begin(Device::Other);
    std::string stream;
    for (const std::uint8_t byte : first) stream += take({byte});
    EXPECT_EQ(stream, std::string(first.begin(), first.end()));
  }
}

TEST_F(DeviceReadsTest, AMessageHasSeveralBuffersAndAReadHasSeveralMessages) {
  Bytes read = abAndC;
  read.insert(read.end(), {32, 0, 0, 0, 0, 0, 0, 0});
  read.insert(read.end(), {32, 0, 0, 0, 2, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0, 'd'});
  EXPECT_EQ(take(read), "abcd");
  EXPECT_EQ(take(abAndC), "abc");
  EXPECT_EQ(_counts.noiseBytes, 0u);
}

TEST_F(DeviceReadsTest, AMessageMayComeInAnyPieces) {
  for (std::size_t size = 1; size < abAndC.size(); ++size) {
    _reads.begin(Device::Other);
    std::string stream;
    for (std::size_t begin = 0; begin < 2 * abAndC.size(); begin += size) {
      Bytes piece;
      for (std::size_t i = begin; i < std::min(begin + size, 2 * abAndC.size()); ++i)
        piece.push_back(abAndC[i % abAndC.size()]);
      stream += take(piece);
    }
    EXPECT_EQ(stream, "abcabc") << size;
    EXPECT_EQ(_counts.noiseBytes, 0u) << size;
  }
}

TEST_F(DeviceReadsTest, AReadOfAnotherKindIsLeftOutAndTheNextOneIsTaken) {
  EXPECT_EQ(take(abAndC), "abc");
  EXPECT_EQ(take({33, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0, 'x'}), "");
  EXPECT_EQ(take(abAndC), "abc");
  EXPECT_EQ(_counts.noiseBytes, 13u);
}

TEST_F(DeviceReadsTest, NumbersThatCannotBeRightEndTheRead) {
  EXPECT_EQ(take(abAndC), "abc");
  EXPECT_EQ(take({32, 0, 0, 0, 0xFF, 0xFF, 0xFF, 0xFF, 1, 0, 0, 0, 'x'}), "");
  EXPECT_EQ(_counts.noiseBytes, 9u);
  EXPECT_EQ(take({32, 0, 0, 0, 1, 0, 0, 0, 0xFF, 0xFF, 0xFF, 0xFF, 'x'}), "");
  EXPECT_EQ(_counts.noiseBytes, 14u);
  EXPECT_EQ(take(abAndC), "abc");
}

TEST_F(DeviceReadsTest, AnyBytesAreTakenInsideTheirBounds) {
  std::minstd_rand random(3);
  take(abAndC);
  std::uint64_t in = 0, out = 0;
  for (int i = 0; i < 20'000; ++i) {
    Bytes read(random() % 60);
    for (std::uint8_t& byte : read) byte = random() % 4 == 0 ? 32 : random() % 3;
    in += read.size();
    out += take(read).size();
  }
  EXPECT_LE(out + _counts.noiseBytes, in);
  EXPECT_GT(out, 0u);
}

}  // namespace
}  // namespace varnel

#include "LogGenerator/Radios/LTE/RandomAccess.h"

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/PayloadBuilder.h"
#include "tests/support/DecoderHarness.h"

namespace varnel::lte {
namespace {

using LTERandomAccessTest = RowsDecoderTest<RandomAccess, 0xB061>;

constexpr std::size_t start = 4;  // of the first subpacket

/// A packet of version 1 with one subpacket. The bytes that no field takes are not 0.
PayloadBuilder subpacket(std::uint32_t logCode, std::uint8_t id, std::uint8_t version, std::uint16_t size) {
  return PayloadBuilder(logCode, start + size)
      .fill(0xA5)
      .u8(0, 1)
      .u8(1, 1)
      .u8(start, id)
      .u8(start + 1, version)
      .u16(start + 2, size);
}

PayloadBuilder configuration() {
  return subpacket(0xB061, 3, 2, 28)
      .u16(start + 4, static_cast<std::uint16_t>(-104))
      .u8(start + 6, 2)
      .u8(start + 9, 10)
      .u16(start + 10, 320)
      .u16(start + 15, static_cast<std::uint16_t>(-7))
      .u8(start + 19, 9)
      .u16(start + 21, 837)
      .u8(start + 25, 6)
      .u8(start + 26, 5);
}

PayloadBuilder reason() {
  return subpacket(0xB061, 5, 1, 20)
      .u8(start + 4, 2)
      .u8(start + 11, 1)
      .u8(start + 12, 63)
      .u8(start + 16, 141)
      .u16(start + 17, 65523);
}

// The attempt begins at one offset of the subpacket, the response at another one.
PayloadBuilder attempt(std::uint8_t version, std::uint16_t size, std::size_t attemptStart,
                       std::size_t responseStart) {
  return subpacket(0xB062, 6, version, size)
      .u8(start + attemptStart, 3)
      .u8(start + attemptStart + 1, 0)
      .u8(start + attemptStart + 2, 1)
      .u8(start + attemptStart + 4, 17)
      .u16(start + responseStart, 960)
      .u16(start + responseStart + 3, 61234)
      .u16(start + responseStart + 5, 1282);
}
PayloadBuilder attempt2() { return attempt(2, 40, 4, 12); }

// 1282 x 78.1 m is 100124.2 m.
constexpr std::string_view ofAttempt =
    R"(Attempt: "3", Result: "Success", Contention: "Yes", Preamble: "17", Backoff: "960 ms", )"
    R"(Temporary C-RNTI: "61234", Timing Advance: "1282", Distance: "100124 m"})";

TEST_F(LTERandomAccessTest, Subpacket3OfVersion2IsTheConfiguration) {
  decode(configuration().bytes());
  EXPECT_EQ(
      shown(),
      R"({Version: "3.2", Preamble Initial Power: "-104 dBm", Power Ramping: "2 dB", )"
      R"(Maximum Preamble Transmissions: "10", Contention Resolution Timer: "320 ms", P-Max: "-7 dBm", )"
      R"(PRACH Configuration: "9", Root Sequence: "837", Maximum Message 3 Transmissions: "6", )"
      R"(Response Window: "5"})");
}

TEST_F(LTERandomAccessTest, Subpacket5OfVersion1IsTheReason) {
  decode(reason().bytes());
  EXPECT_EQ(shown(), R"({Version: "5.1", Reason: "Uplink Data", Contention: "Yes", Preamble: "63", )"
                     R"(Path Loss: "141 dB", C-RNTI: "65523"})");
}

TEST_F(LTERandomAccessTest, EachReasonHasItsText) {
  const char* const texts[] = {R"("Connection Request")", R"("Radio Link Failure")", R"("Uplink Data")",
                               R"("Downlink Data")",      R"("Handover")",           R"-("Unknown (5)")-"};
  for (std::uint8_t value = 0; value < 6; ++value) {
    decode(reason().u8(start + 4, value).bytes());
    EXPECT_EQ(shown("Reason"), texts[value]);
  }
}

TEST_F(LTERandomAccessTest, AnAccessWithoutContentionIsSaidToBe) {
  decode(reason().u8(start + 11, 0).bytes());
  EXPECT_EQ(shown("Contention"), R"("No")");
  decode(attempt2().u8(start + 6, 0).bytes(), 0xB062);
  EXPECT_EQ(shown("Contention"), R"("No")");
}

TEST_F(LTERandomAccessTest, Subpacket6OfVersion2IsAnAttempt) {
  decode(attempt2().bytes(), 0xB062);
  EXPECT_EQ(shown(), R"({Version: "6.2", )" + std::string(ofAttempt));
}

TEST_F(LTERandomAccessTest, Subpackets6OfVersions3And49HaveTwoBytesMoreInFront) {
  decode(attempt(3, 42, 6, 14).bytes(), 0xB062);
  EXPECT_EQ(shown(), R"({Version: "6.3", )" + std::string(ofAttempt));
  section.dictionary()->truncate(0);
  decode(attempt(49, 44, 6, 14).bytes(), 0xB062);
  EXPECT_EQ(shown(), R"({Version: "6.49", )" + std::string(ofAttempt));
}

TEST_F(LTERandomAccessTest, Subpacket6OfVersion50HasThreeBytesMoreBehindThePreamble) {
  decode(attempt(50, 47, 6, 17).bytes(), 0xB062);
  EXPECT_EQ(shown(), R"({Version: "6.50", )" + std::string(ofAttempt));
}

TEST_F(LTERandomAccessTest, EachResultHasItsText) {
  const char* const texts[] = {R"("Success")",       R"("Failure at Message 2")",
                               R"-("Unknown (2)")-", R"-("Unknown (3)")-",
                               R"("Aborted")",       R"-("Unknown (5)")-"};
  for (std::uint8_t value = 0; value < 6; ++value) {
    decode(attempt2().u8(start + 5, value).bytes(), 0xB062);
    EXPECT_EQ(shown("Result"), texts[value]);
  }
}

TEST_F(LTERandomAccessTest, AFailureAtMessage2HasNoResponse) {
  decode(attempt2().bytes(), 0xB062);
  decode(attempt2().u8(start + 5, 1).bytes(), 0xB062);
  EXPECT_EQ(shown(),
            R"({Version: "6.2", Attempt: "3", Result: "Failure at Message 2", Contention: "Yes", )"
            R"(Preamble: "17", Backoff: "", Temporary C-RNTI: "", Timing Advance: "", Distance: ""})");
}

TEST_F(LTERandomAccessTest, ADistanceIsRounded) {
  const auto distanceOf = [&](std::uint16_t timingAdvance) {
    decode(attempt2().u16(start + 17, timingAdvance).bytes(), 0xB062);
    return shown("Distance");
  };
  EXPECT_EQ(distanceOf(0), R"("0 m")");
  EXPECT_EQ(distanceOf(1), R"("78 m")");    // 78.1 m
  EXPECT_EQ(distanceOf(7), R"("547 m")");   // 546.7 m
  EXPECT_EQ(distanceOf(12), R"("937 m")");  // 937.2 m
}

TEST_F(LTERandomAccessTest, BothSubpacketsOfAPacketAreShown) {
  Bytes packet = configuration().u8(1, 2).bytes();
  const Bytes second = reason().bytes();
  packet.insert(packet.end(), second.begin() + 13 + start, second.end());
  decode(packet);
  EXPECT_EQ(shown("P-Max"), R"("-7 dBm")");
  EXPECT_EQ(shown("Reason"), R"("Uplink Data")");
  EXPECT_EQ(shown("Version"), R"("5.1")");
}

TEST_F(LTERandomAccessTest, TheRootSequenceHasTenBitsAndTheConfigurationSix) {
  decode(PayloadBuilder(0xB166, 4).u8(0, 3).u16(2, 0xFC00 | 341).bytes(), 0xB166);
  EXPECT_EQ(shown(), R"({Version: "3", Root Sequence: "341", PRACH Configuration: "63"})");
  decode(PayloadBuilder(0xB166, 4).u8(0, 3).u16(2, 0x03FF).bytes(), 0xB166);
  EXPECT_EQ(shown(), R"({Version: "3", Root Sequence: "1023", PRACH Configuration: "0"})");
}

TEST_F(LTERandomAccessTest, ATransmittedPreambleHasItsPower) {
  decode(PayloadBuilder(0xB167, 28)
             .u8(0, 5)
             .u32(4, 0xFFFF'FFC0 | 21)
             .u8(8, 0xFB)
             .s32(24, -5)
             .u16(20, 61)
             .bytes(),
         0xB167);
  EXPECT_EQ(shown(), R"({Version: "5", Preamble: "21", Transmit Power: "-5 dBm", RA-RNTI: "61"})");
}

TEST_F(LTERandomAccessTest, AResponseHasTheTimingAdvance) {
  decode(PayloadBuilder(0xB168, 12)
             .u8(0, 1)
             .u16(4, 0xC000 | 9 << 10 | 511)
             .u16(6, 0xF800 | 6)
             .u32(8, 0xFF00'00FF | 4321 << 8)
             .bytes(),
         0xB168);
  EXPECT_EQ(shown(),
            R"({Version: "1", System Frame Number: "511", Subframe: "9", Timing Advance: "6", )"
            R"(Distance: "469 m", Temporary C-RNTI: "4321"})");  // 468.6 m
}

TEST_F(LTERandomAccessTest, Message4HasItsFrame) {
  decode(PayloadBuilder(0xB16A, 6).u8(0, 1).u16(4, 0xC000 | 7 << 10 | 1022).bytes(), 0xB16A);
  EXPECT_EQ(shown(), R"({Version: "1", System Frame Number: "1022", Subframe: "7"})");
}

TEST_F(LTERandomAccessTest, OtherVersionsAreNotKnown) {
  const auto versionOf = [&](const Bytes& packet, std::uint32_t logCode) {
    section.dictionary()->truncate(0);
    decode(packet, logCode);
    return shown();
  };
  EXPECT_EQ(versionOf(subpacket(0xB061, 3, 1, 28).bytes(), 0xB061), R"-({Version: "3.1 (not known)"})-");
  EXPECT_EQ(versionOf(subpacket(0xB061, 5, 2, 20).bytes(), 0xB061), R"-({Version: "5.2 (not known)"})-");
  EXPECT_EQ(versionOf(subpacket(0xB062, 6, 4, 40).bytes(), 0xB062), R"-({Version: "6.4 (not known)"})-");
  EXPECT_EQ(versionOf(PayloadBuilder(0xB166, 4).u8(0, 1).bytes(), 0xB166), R"-({Version: "1 (not known)"})-");
  EXPECT_EQ(versionOf(PayloadBuilder(0xB167, 28).u8(0, 1).bytes(), 0xB167),
            R"-({Version: "1 (not known)"})-");
}

TEST_F(LTERandomAccessTest, ShorterPacketsShowNothing) {
  expectIgnoredBelow(13 + start + 28, configuration().bytes(), 0xB061, {});
  expectIgnoredBelow(13 + start + 20, reason().bytes(), 0xB061, {});
  expectIgnoredBelow(13 + start + 40, attempt2().bytes(), 0xB062, {});
  expectIgnoredBelow(13 + 4, PayloadBuilder(0xB166, 4).u8(0, 3).bytes(), 0xB166, {});
  expectIgnoredBelow(13 + 28, PayloadBuilder(0xB167, 28).u8(0, 5).bytes(), 0xB167, {});
  expectIgnoredBelow(13 + 12, PayloadBuilder(0xB168, 12).u8(0, 1).bytes(), 0xB168, {});
  expectIgnoredBelow(13 + 6, PayloadBuilder(0xB16A, 6).u8(0, 1).bytes(), 0xB16A, {});
}

TEST_F(LTERandomAccessTest, SubpacketsThatAreTooSmallShowNothing) {
  expectIgnored(subpacket(0xB061, 3, 2, 27).bytes(), 0xB061, {});
  expectIgnored(subpacket(0xB061, 5, 1, 19).bytes(), 0xB061, {});
  expectIgnored(subpacket(0xB062, 6, 2, 25).bytes(), 0xB062, {});
  expectIgnored(subpacket(0xB062, 6, 3, 27).bytes(), 0xB062, {});
  expectIgnored(subpacket(0xB062, 6, 49, 27).bytes(), 0xB062, {});
  expectIgnored(subpacket(0xB062, 6, 50, 30).bytes(), 0xB062, {});
}

TEST_F(LTERandomAccessTest, NumbersHaveUnits) {
  NumberFormats formats;
  SectionFormats ofSection(formats, "Random Access");
  decoder.listNumberFormats(ofSection);
  EXPECT_EQ(formats.under("Random Access/Distance").unit(), "m");
  EXPECT_EQ(formats.under("Random Access/Backoff").unit(), "ms");
  EXPECT_EQ(formats.under("Random Access/Transmit Power").unit(), "dBm");
  EXPECT_EQ(formats.under("Random Access/Path Loss").unit(), "dB");
}

}  // namespace
}  // namespace varnel::lte

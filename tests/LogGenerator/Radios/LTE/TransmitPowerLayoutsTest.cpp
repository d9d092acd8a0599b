#include <gtest/gtest.h>

#include "LogGenerator/Radios/LTE/TransmitPower.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

constexpr std::uint32_t transmissionCode = 0xB139, sharedCode = 0xB16E, controlCode = 0xB16F;

DecoderAlone<TransmitPower> newDecoder() { return DecoderAlone<TransmitPower>(); }
const LayoutRules rules(newDecoder);

TextOf power(unsigned width) { return signedNumber("%lld dBm", width); }
TextOf loss() { return plainNumber("%lld dB"); }

constexpr BitRun transmissionCount{1, 9, 5};
std::size_t transmissionStride(std::uint32_t version) { return version == 43 ? 64 : 68; }

// One record.
DescribedLayout transmissionLayout(std::uint32_t version) {
  const std::size_t record = 8;
  return {
      .logCode = transmissionCode,
      .version = {version},
      .size = record + transmissionStride(version),
      .minimum = record + 28,
      .fields = {{"PUSCH Power", {record + 24, 0, 7}, 21, power(7)},
                 {"Transport Block Size", wordAt(record + (version == 43 ? 12 : 8)), 4101, plainNumber()}},
      .fixed = {{transmissionCount, 1}}};
}

DescribedLayout sharedLayout(std::uint32_t version) {
  const std::size_t first = 4, second = 8, third = 12;
  DescribedLayout layout{
      .logCode = sharedCode, .version = {version}, .size = 16, .minimum = 16, .fixed = {{byteAt(3), 1}}};
  const bool hasBlocks = version != 4;
  layout.fields = {{"PUSCH Power", {first, version == 25 ? 17u : 14u, 8}, 0xF5, power(8)},
                   {"Transport Block Size", {second, hasBlocks ? 8u : 0u, 14}, 4101, plainNumber()},
                   {"PUSCH Path Loss", {second, hasBlocks ? 22u : 14u, 8}, 101, loss()},
                   {"PUSCH Actual Power", {third, hasBlocks ? 15u : 5u, 8}, 0xF3, power(8)}};
  if (hasBlocks) layout.fields.push_back({"PUSCH Resource Blocks", {second, 0, 8}, 25, plainNumber()});
  if (version == 25) layout.fields.push_back({"Maximum Power", {third, 23, 8}, 23, power(8)});
  return layout;
}

DescribedLayout controlLayout(std::uint32_t version) {
  return {.logCode = controlCode,
          .version = {version},
          .size = 16,
          .minimum = 16,
          .fields = {{"PUCCH Power", {4, 14, 8}, 0xF5, power(8)},
                     {"PUCCH Path Loss", {8, 11, 8}, 101, loss()},
                     {"PUCCH Actual Power", {12, 16, 8}, 0xF3, power(8)}},
          .fixed = {{byteAt(3), 1}}};
}

std::vector<DescribedLayout> layouts() {
  return {transmissionLayout(43), transmissionLayout(102), sharedLayout(4),  sharedLayout(5),
          sharedLayout(25),       controlLayout(4),        controlLayout(24)};
}

TEST(LTETransmitPowerLayouts, EachFieldMovesItsRowsOnly) {
  for (DescribedLayout layout : layouts()) {
    // Losses above 127 dB are nobody's.
    for (const FieldRow& field : std::vector(layout.fields))
      if (field.path.ends_with("Path Loss"))
        layout.fixed.push_back({{field.run.byte, field.run.firstBit + 7, 1}, 0});
    rules.expectEachFieldByItself(layout);
  }
}

TEST(LTETransmitPowerLayouts, KnownVersionsShowTheirNumber) {
  for (const DescribedLayout& layout : layouts()) rules.expectVersionKnown(layout);
}

TEST(LTETransmitPowerLayouts, NothingPastTheEndIsShown) {
  for (const DescribedLayout& layout : layouts()) rules.expectNothingPastTheEnd(layout);
}

TEST(LTETransmitPowerLayouts, OtherVersionsAreNotKnown) {
  rules.expectOtherVersionsUnknown(transmissionLayout(43), {43, 102});
  rules.expectOtherVersionsUnknown(sharedLayout(5), {4, 5, 25});
  rules.expectOtherVersionsUnknown(controlLayout(4), {4, 24});
}

TEST(LTETransmitPowerLayouts, ThePowerOfSevenBitsIsSigned) {
  for (const std::uint32_t version : {43, 102}) {
    for (int value = -64; value < 64; ++value) {
      Bytes payload = transmissionLayout(version).payload();
      put(payload, {32, 0, 7}, static_cast<std::uint32_t>(value));
      auto decoder = newDecoder();
      decoder.decode(transmissionCode, payload);
      EXPECT_EQ(decoder.text("PUSCH Power"), printed("%d dBm", value));
    }
  }
}

// Records whose powers are 1, 2, 3 dBm, with a number of records.
Bytes withRecords(const DescribedLayout& layout, std::size_t records, unsigned count) {
  const std::size_t start = layout.logCode == transmissionCode ? 8 : 4;
  const Bytes one = layout.payload();
  Bytes payload(one.begin(), one.begin() + static_cast<std::ptrdiff_t>(start));
  const FieldRow& powerField = layout.fields.front();
  const std::size_t stride = one.size() - start;
  for (std::size_t record = 0; record < records; ++record) {
    payload.insert(payload.end(), one.begin() + static_cast<std::ptrdiff_t>(start), one.end());
    BitRun run = powerField.run;
    run.byte += record * stride;
    put(payload, run, record + 1);
  }
  put(payload, layout.fixed.front().run, count);
  return payload;
}
std::string powerOf(const DescribedLayout& layout, const Bytes& payload) {
  auto decoder = newDecoder();
  decoder.decode(layout.logCode, payload);
  return decoder.text(layout.fields.front().path);
}

TEST(LTETransmitPowerLayouts, TheLastRecordIsShown) {
  for (const DescribedLayout& layout : layouts()) {
    SCOPED_TRACE(layout.name());
    EXPECT_EQ(powerOf(layout, withRecords(layout, 3, 3)), "3 dBm");
    EXPECT_EQ(powerOf(layout, withRecords(layout, 3, 2)), "2 dBm");
    EXPECT_EQ(powerOf(layout, withRecords(layout, 3, 1)), "1 dBm");
    EXPECT_EQ(powerOf(layout, withRecords(layout, 31, 31)), "31 dBm");
  }
}

TEST(LTETransmitPowerLayouts, WithoutARecordNothingIsShown) {
  for (const DescribedLayout& layout : layouts()) {
    SCOPED_TRACE(layout.name());
    EXPECT_EQ(powerOf(layout, withRecords(layout, 3, 0)), "");
    EXPECT_EQ(powerOf(layout, withRecords(layout, 0, 0)), "");
    EXPECT_EQ(powerOf(layout, withRecords(layout, 0, 3)), "");
  }
}

// A count that lies may cost the packet, but nothing from past its end is shown.
TEST(LTETransmitPowerLayouts, RecordsPastTheEndAreNotShown) {
  for (const DescribedLayout& layout : layouts()) {
    SCOPED_TRACE(layout.name());
    const unsigned most = layout.logCode == transmissionCode ? 31 : 255;
    for (const unsigned count : {4u, 10u, most}) {
      const std::string shown = powerOf(layout, withRecords(layout, 3, count));
      EXPECT_TRUE(shown == "3 dBm" || shown.empty()) << shown << " of " << count;
    }
    const Bytes whole = withRecords(layout, 3, 3);
    for (std::size_t size = 0; size < whole.size(); ++size) {
      const std::string shown =
          powerOf(layout, Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)));
      EXPECT_TRUE(shown.empty() || shown == "1 dBm" || shown == "2 dBm" || shown == "3 dBm") << shown;
    }
  }
}

TEST(LTETransmitPowerLayouts, SharedAndControlChannelsKeepTheirOwnRows) {
  auto decoder = newDecoder();
  decoder.decode(sharedCode, sharedLayout(25).payload());
  decoder.decode(controlCode, controlLayout(24).payload());
  Rows expected = sharedLayout(25).rowsOf(sharedLayout(25).payload());
  for (const auto& [path, text] : controlLayout(24).rowsOf(controlLayout(24).payload()))
    expected[path] = text;
  EXPECT_EQ(differences(expected, decoder.rows()), "");
  EXPECT_EQ(decoder.version(), "24");
}

TEST(LTETransmitPowerLayouts, SharedChannelInLiterals) {
  auto decoder = newDecoder();
  PacketBuilder words(0, 13 + 16);
  words.u8(13, 25).u8(16, 1);
  words.u32(17, 1u | 1000u << 3 | 9u << 13 | 0xF9u << 17 | 1u << 25);
  words.u32(21, 50u | 3000u << 8 | 110u << 22);
  words.u32(25, 0x3FFu | 1u << 10 | 22u << 15 | 24u << 23);
  const Bytes packet = words.bytes();
  decoder.decode(sharedCode, Bytes(packet.begin() + 13, packet.end()));
  EXPECT_EQ(differences({{"PUSCH Power", "-7 dBm"},
                         {"PUSCH Resource Blocks", "50"},
                         {"Transport Block Size", "3000"},
                         {"PUSCH Path Loss", "110 dB"},
                         {"PUSCH Actual Power", "22 dBm"},
                         {"Maximum Power", "24 dBm"}},
                        decoder.rows()),
            "");
}

}  // namespace
}  // namespace varnel::lte

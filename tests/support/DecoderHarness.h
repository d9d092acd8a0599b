#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/Packet.h"
#include "tests/support/Describe.h"
#include "tests/support/RecordingLog.h"

namespace varnel {

/// What a row shows for a raw value of 0 and for each of its bits alone, the lowest first. The bits are one
/// run that starts at a bit of a byte of the packet and goes on upwards.
struct BitTexts {
  std::string_view label;
  std::size_t byte;
  unsigned firstBit;
  std::string_view ofZero;
  std::vector<std::string_view> ofBits;
};

/// `BitTexts::ofBits` of plain decimal numbers.
inline const std::vector<std::string_view> unsignedByteBits = {"1", "2", "4", "8", "16", "32", "64", "128"};
inline const std::vector<std::string_view> unsignedWordBits = {
    "1",   "2",   "4",    "8",    "16",   "32",   "64",    "128",
    "256", "512", "1024", "2048", "4096", "8192", "16384", "32768"};
inline const std::vector<std::string_view> signedLongBits = {
    "1",        "2",        "4",        "8",         "16",        "32",        "64",         "128",
    "256",      "512",      "1024",     "2048",      "4096",      "8192",      "16384",      "32768",
    "65536",    "131072",   "262144",   "524288",    "1048576",   "2097152",   "4194304",    "8388608",
    "16777216", "33554432", "67108864", "134217728", "268435456", "536870912", "1073741824", "-2147483648"};

/// What `described` makes of an array of such elements.
inline std::string listOf(std::initializer_list<const char*> rows) {
  std::string text;
  for (const char* row : rows) text += (text.empty() ? "" : ", ") + std::string(row);
  return "[" + text + "]";
}

/// A decoder with what it would share with others in its index.
template <class Decoder>
Decoder madeAlone([[maybe_unused]] CellMonitorReader& cellMonitor) {
  if constexpr (std::is_constructible_v<Decoder, CellMonitorReader&>) {
    return Decoder(cellMonitor);
  } else {
    return Decoder();
  }
}

/// A section decoder with a section, and the log of what it does. Its packets have the log code unless
/// another one is said.
template <class Decoder, std::uint32_t itsLogCode>
class DecoderHarness : public testing::Test {
 protected:
  explicit DecoderHarness(Value emptySection) : section(std::move(emptySection)) {
    decoder.updateSectionRef(section);
    log.take();
  }

  void decode(const Bytes& packet, std::uint32_t logCode = itsLogCode) {
    decoder.updateWithData_logCode(Packet(packet), logCode);
  }

  /// The lines that a decoder without a section logs for the packet.
  std::vector<std::string> linesWithoutSection(const Bytes& packet, std::uint32_t logCode = itsLogCode) {
    log.take();
    auto sectionless = madeAlone<Decoder>(cellMonitor);
    sectionless.updateWithData_logCode(Packet(packet), logCode);
    return log.takeTexts();
  }

  /// The whole section.
  std::string shown() const { return described(section); }
  /// One row of the section or, of a list section, of its first cell.
  std::string shown(std::string_view label) const {
    const Dictionary* rows = section.dictionary();
    if (section.array() && !section.array()->empty()) rows = section.array()->front().dictionary();
    return rows ? described(rows->get(label)) : "no rows";
  }
  /// How many rows a list section has.
  std::size_t rowCount() const { return section.array()->size(); }

  /// Fills the section with what no packet makes.
  void putOldContent() {
    if (Array* rows = section.array()) {
      *rows = {"old", "older"};
    } else {
      *section.dictionary() = {};
      section.dictionary()->set("Old", "row");
    }
  }
  std::string oldContent() const { return section.array() ? R"(["old", "older"])" : R"({Old: "row"})"; }

  /// Expects the packet to change nothing in a filled section and to log these lines only.
  void expectIgnored(const Bytes& packet, std::uint32_t logCode, const std::vector<std::string>& lines) {
    putOldContent();
    log.take();
    decode(packet, logCode);
    EXPECT_EQ(shown(), oldContent()) << packet.size() << " bytes, log code " << logCode;
    EXPECT_EQ(log.takeTexts(), lines) << packet.size() << " bytes, log code " << logCode;
  }

  /// Expects what is left of the packet at every length below the minimum to change nothing in a filled
  /// section and to log these lines only.
  void expectIgnoredBelow(std::size_t minimum, const Bytes& packet, std::uint32_t logCode,
                          const std::vector<std::string>& lines) {
    for (std::size_t size = 0; size < minimum; ++size) {
      expectIgnored(Bytes(packet.data(), packet.data() + size), logCode, lines);
    }
  }

  /// Decodes what is left of the packet at every shorter length, each time into a section of old content.
  /// The check gets the length and the lines that were logged.
  template <class Check>
  void forEachTruncation(const Bytes& packet, Check check, std::uint32_t logCode = itsLogCode) {
    for (std::size_t size = packet.size(); size-- > 0;) {
      SCOPED_TRACE(std::to_string(size) + " bytes");
      putOldContent();
      log.take();
      decode(Bytes(packet.data(), packet.data() + size), logCode);
      check(size, log.takeTexts());
    }
  }

  /// Sets each bit of the packet's bytes from the first up to, but not with, the end, one at a time. Each row
  /// must show the text of the bit if that is its own, else the text of 0.
  void expectTextsOfSingleBits(const Bytes& packet, std::size_t first, std::size_t end,
                               const std::vector<BitTexts>& rows, std::uint32_t logCode = itsLogCode) {
    for (std::size_t bit = 8 * first; bit < 8 * end; ++bit) {
      Bytes changed = packet;
      changed[bit / 8] = static_cast<std::uint8_t>(changed[bit / 8] ^ 1u << bit % 8);
      decode(changed, logCode);
      for (const BitTexts& row : rows) {
        const std::size_t runStart = 8 * row.byte + row.firstBit;
        const bool isItsOwn = bit >= runStart && bit - runStart < row.ofBits.size();
        EXPECT_EQ(shown(row.label), quoted(isItsOwn ? row.ofBits[bit - runStart] : row.ofZero))
            << row.label << " when bit " << bit % 8 << " of byte " << bit / 8 << " is set";
      }
    }
  }

  /// Puts each value into a byte of the packet. The row must show the text that `textOf` gives for it.
  template <class TextOf>
  void expectTextOfEachByte(Bytes packet, std::size_t byte, std::string_view label, TextOf textOf,
                            std::uint32_t logCode = itsLogCode) {
    for (unsigned value = 0; value < 256; ++value) {
      packet.at(byte) = static_cast<std::uint8_t>(value);
      decode(packet, logCode);
      EXPECT_EQ(shown(label), quoted(textOf(value))) << label << " of " << value;
    }
  }
  /// The texts of the values from 0 on; all greater values show `beyond`.
  void expectTableOfByte(const Bytes& packet, std::size_t byte, std::string_view label,
                         const std::vector<std::string_view>& texts, std::string_view beyond,
                         std::uint32_t logCode = itsLogCode) {
    const auto textOf = [&](unsigned value) { return value < texts.size() ? texts[value] : beyond; };
    expectTextOfEachByte(packet, byte, label, textOf, logCode);
  }

  RecordingLog log;
  CellMonitorReader cellMonitor;
  Decoder decoder = madeAlone<Decoder>(cellMonitor);
  Value section;
};

/// For a section of rows: a dictionary.
template <class Decoder, std::uint32_t itsLogCode>
class RowsDecoderTest : public DecoderHarness<Decoder, itsLogCode> {
 protected:
  RowsDecoderTest() : DecoderHarness<Decoder, itsLogCode>(Value::ofDictionary()) {}
};

/// For a list section: an array with a dictionary a cell.
template <class Decoder, std::uint32_t itsLogCode>
class ListDecoderTest : public DecoderHarness<Decoder, itsLogCode> {
 protected:
  ListDecoderTest() : DecoderHarness<Decoder, itsLogCode>(Value::ofArray()) {}
};

}  // namespace varnel

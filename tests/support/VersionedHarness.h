#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <functional>
#include <iterator>
#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "LogGenerator/MessageFate.h"
#include "LogGenerator/Packet.h"
#include "LogGenerator/PacketVersion.h"
#include "base/Dictionary.h"
#include "base/Time.h"
#include "base/Value.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {

/// A little-endian run of bits. The byte counts from the payload's first.
struct BitRun {
  std::size_t byte;
  unsigned firstBit, width;

  std::size_t firstOfPayload() const { return 8 * byte + firstBit; }
  bool holds(std::size_t bitOfPayload) const {
    return bitOfPayload >= firstOfPayload() && bitOfPayload - firstOfPayload() < width;
  }
};
constexpr BitRun byteAt(std::size_t byte) { return {byte, 0, 8}; }
constexpr BitRun wordAt(std::size_t byte) { return {byte, 0, 16}; }
constexpr BitRun longAt(std::size_t byte) { return {byte, 0, 32}; }

/// The number in a run; bits past the end are 0. Goes bit by bit, unlike the decoders.
inline std::uint64_t numberIn(ByteView bytes, BitRun run) {
  std::uint64_t number = 0;
  for (unsigned bit = 0; bit < run.width; ++bit) {
    const std::size_t at = run.firstOfPayload() + bit;
    if (at / 8 < bytes.size() && (bytes[at / 8] >> at % 8 & 1u) != 0) number |= std::uint64_t{1} << bit;
  }
  return number;
}
inline void put(Bytes& bytes, BitRun run, std::uint64_t number) {
  for (unsigned bit = 0; bit < run.width; ++bit) {
    const std::size_t at = run.firstOfPayload() + bit;
    const auto mask = static_cast<std::uint8_t>(1u << at % 8);
    std::uint8_t& byte = bytes.at(at / 8);
    byte = static_cast<std::uint8_t>((number >> bit & 1u) != 0 ? byte | mask : byte & ~mask);
  }
}

/// What the row shows, from the number in its run. "" is an absent row; `anyText` fits every text.
using TextOf = std::function<std::string(std::uint64_t number)>;
inline constexpr const char* anyText = "*";

template <class... Numbers>
std::string printed(const char* format, Numbers... numbers) {
  char text[128];
  std::snprintf(text, sizeof text, format, numbers...);
  return text;
}
inline std::int64_t signedNumber(std::uint64_t number, unsigned width) {
  const auto wide = static_cast<std::int64_t>(number);
  return number >> (width - 1) == 0 ? wide : wide - (std::int64_t{1} << width);
}
/// The number itself. Where a row of 32 bits may be signed, the topmost bit fits every text.
inline TextOf plainNumber(const char* format = "%lld") {
  return [format](std::uint64_t number) {
    const bool maybeNegative = number >= 0x80000000u && number <= 0xFFFFFFFFu;
    return maybeNegative ? anyText : printed(format, static_cast<long long>(number));
  };
}
inline TextOf signedNumber(const char* format, unsigned width) {
  return [format, width](std::uint64_t number) {
    return printed(format, static_cast<long long>(signedNumber(number, width)));
  };
}
/// The number divided, and then reduced.
inline TextOf level(const char* format, double divisor, double summand) {
  return
      [=](std::uint64_t number) { return printed(format, static_cast<double>(number) / divisor + summand); };
}
inline TextOf rsrpText() { return level("%.2f dBm", 16, -180); }
inline TextOf rsrqText() { return level("%.2f dB", 16, -30); }
inline TextOf rssiText() { return level("%.2f dBm", 16, -110); }
inline TextOf snrText() { return level("%.1f dB", 10, -20); }
/// The text of the number's place; greater ones fit `beyond`, where %lld is the number.
inline TextOf choiceOf(std::vector<std::string> texts, const char* beyond = "Unknown (%lld)") {
  return [texts = std::move(texts), beyond](std::uint64_t number) {
    return number < texts.size() ? texts[number] : printed(beyond, static_cast<long long>(number));
  };
}
inline std::string lteBandwidthText(std::uint64_t resourceBlocks) {
  switch (resourceBlocks) {
    case 6:
      return "1.4 MHz";
    case 15:
      return "3 MHz";
    case 25:
      return "5 MHz";
    case 50:
      return "10 MHz";
    case 75:
      return "15 MHz";
    case 100:
      return "20 MHz";
    default:
      return "Unknown";
  }
}
/// Three octets of 3GPP TS 24.008, 10.5.1.3.
inline std::string plmnText(std::uint64_t octets) {
  const auto nibble = [&](unsigned index) { return static_cast<unsigned>(octets >> 4 * index & 0xF); };
  const bool hasThird = nibble(3) != 15;
  for (const unsigned index : {0u, 1u, 2u, 4u, 5u})
    if (nibble(index) > 9) return "";
  if (hasThird && nibble(3) > 9) return "";
  std::string text = printed("%u%u%u-%u%u", nibble(0), nibble(1), nibble(2), nibble(4), nibble(5));
  return hasThird ? text + std::to_string(nibble(3)) : text;
}

/// The texts of a section by their paths, as "RSRP" or "Cells/0/RSRP". An entry of the section itself that
/// is empty is left out, but not one of a record.
using Rows = std::map<std::string, std::string>;

inline void addRows(Rows& rows, const std::string& path, const Value& value) {
  if (const Dictionary* entries = value.dictionary()) {
    for (const auto& [key, entry] : *entries) addRows(rows, path.empty() ? key : path + "/" + key, entry);
  } else if (const Array* records = value.array()) {
    for (std::size_t index = 0; index < records->size(); ++index)
      addRows(rows, path + "/" + std::to_string(index), (*records)[index]);
  } else if (const std::string* text = value.string()) {
    const bool isOfRecord = path.find('/') != std::string::npos;
    if (isOfRecord || !text->empty()) rows[path] = *text;
  } else {
    rows[path] = described(value);
  }
}

/// One line per path that differs; empty when the rows are as expected.
inline std::string differences(const Rows& expected, const Rows& shown) {
  std::string text;
  for (const auto& [path, wanted] : expected) {
    const auto found = shown.find(path);
    if (wanted == anyText || (found != shown.end() && found->second == wanted)) continue;
    text += path + " shows " + (found == shown.end() ? "nothing" : varnel::quoted(found->second)) + ", not " +
            varnel::quoted(wanted) + "\n";
  }
  for (const auto& [path, found] : shown)
    if (!expected.contains(path)) text += path + " shows " + varnel::quoted(found) + ", not nothing\n";
  return text;
}

/// 2020-09-13 12:26:40 UTC.
inline constexpr Time versionedTestTime{1600000000, 0};
inline constexpr const char* versionedTestTimeText = "2020-09-13 12:26:40 +0000";

/// A whole packet with this payload.
inline Bytes packetOf(std::uint32_t logCode, ByteView payload) {
  Bytes packet = PacketBuilder(logCode, Packet::headerSize + payload.size()).bytes();
  std::copy(payload.begin(), payload.end(), packet.begin() + Packet::headerSize);
  return packet;
}

/// A decoder with a section of its own, as the display's template has it: an empty version, and an empty list
/// when it has a name.
template <class Decoder>
class DecoderAlone {
 public:
  template <class... Arguments>
  explicit DecoderAlone(const std::string& list = {}, Arguments... arguments) : _decoder(arguments...) {
    _section.dictionary()->set("Version", "");
    if (!list.empty()) _section.dictionary()->set(list, Value::ofArray());
    _decoder.updateSectionRef(_section);
  }

  void decode(std::uint32_t logCode, ByteView payload, Time time = versionedTestTime) {
    decodePacket(logCode, packetOf(logCode, payload), time);
  }
  void decodePacket(std::uint32_t logCode, const Bytes& packet, Time time = versionedTestTime) {
    _decoder.section().setTime(time);
    _decoder.updateWithData_logCode(Packet(packet), logCode);
  }
  MessageFate fateOf(std::uint32_t logCode, ByteView payload) const {
    const Bytes packet = packetOf(logCode, payload);
    return _decoder.fateOf(Packet(packet), logCode);
  }

  /// All rows but "Version".
  Rows rows() const {
    Rows all;
    addRows(all, "", _section);
    all.erase("Version");
    return all;
  }
  std::string version() const { return text("Version"); }
  std::string text(const std::string& path) const {
    Rows all;
    addRows(all, "", _section);
    const auto found = all.find(path);
    return found == all.end() ? "" : found->second;
  }
  std::string everything() const { return described(_section); }
  Decoder& decoder() { return _decoder; }
  const Value& section() const { return _section; }
  /// A new decoder takes over the section, as after a reconnection, and decodes the packet.
  void decodeByAnother(std::uint32_t logCode, ByteView payload, Time time = versionedTestTime) {
    Decoder another;
    another.section().setTime(time);
    another.updateSectionRef(_section);
    const Bytes packet = packetOf(logCode, payload);
    another.updateWithData_logCode(Packet(packet), logCode);
  }
  /// What is decoded without a section is lost.
  static void decodeWithoutSection(std::uint32_t logCode, ByteView payload) {
    Decoder unbound;
    unbound.section().setTime(versionedTestTime);
    const Bytes packet = packetOf(logCode, payload);
    unbound.updateWithData_logCode(Packet(packet), logCode);
    unbound.prepareDisplay(versionedTestTime);
  }

 private:
  Decoder _decoder;
  Value _section = Value::ofDictionary();
};

/// A row, the bits it comes from, and the number that the packet of the layout has there.
struct FieldRow {
  std::string path;
  BitRun run;
  std::uint64_t number;
  TextOf text;
};
/// A row that comes from more than one run. It replaces a field of the same path.
struct DerivedRow {
  std::string path;
  std::function<std::string(ByteView payload)> text;
};
/// Bits that no test moves: they say how the rest is read, or their other values are nobody's.
struct FixedRun {
  BitRun run;
  std::uint64_t number;
};

/// One version of a packet as its description has it, and a packet of it. Bits that no row has are 5A.
struct DescribedLayout {
  std::uint32_t logCode = 0;
  PacketVersion version{};
  /// Of the payload: what the packet has, and below what nothing may be shown.
  std::size_t size = 0, minimum = 0;
  std::vector<FieldRow> fields{};
  std::vector<DerivedRow> derived{};
  std::vector<FixedRun> fixed{};
  /// Whether anything of a payload is shown.
  std::function<bool(ByteView payload)> isPlausible = [](ByteView) { return true; };

  bool isNR() const { return logCode >= 0xB800; }
  BitRun versionRun() const { return isNR() ? longAt(0) : byteAt(0); }

  Bytes payload() const {
    Bytes bytes(size, 0x5A);
    put(bytes, versionRun(), version.number);
    for (const FieldRow& field : fields) put(bytes, field.run, field.number);
    for (const FixedRun& run : fixed) put(bytes, run.run, run.number);
    return bytes;
  }
  Rows rowsOf(ByteView bytes) const {
    Rows rows;
    if (!isPlausible(bytes)) return rows;
    const auto add = [&](const std::string& path, const std::string& text) {
      rows.erase(path);
      if (!text.empty()) rows[path] = text;
    };
    for (const FieldRow& field : fields) add(field.path, field.text(numberIn(bytes, field.run)));
    for (const DerivedRow& row : derived) add(row.path, row.text(bytes));
    return rows;
  }
  bool isFixed(std::size_t bit) const {
    if (versionRun().holds(bit)) return true;
    for (const FixedRun& run : fixed)
      if (run.run.holds(bit)) return true;
    return false;
  }
  std::string name() const { return printed("0x%X ", logCode) + version.text(); }
};

/// The layout in a subpacket, whose offsets counted from the subpacket's first byte, as the only one of its
/// packet. The packet has version 1.
inline DescribedLayout inSubpacket(DescribedLayout layout, std::uint8_t id, std::uint8_t version) {
  constexpr std::size_t before = 4;
  for (FieldRow& field : layout.fields) field.run.byte += before;
  for (FixedRun& run : layout.fixed) run.run.byte += before;
  for (DerivedRow& row : layout.derived)
    row.text = [text = row.text](ByteView payload) { return text(payload.subspan(before)); };
  if (layout.isPlausible)
    layout.isPlausible = [plausible = layout.isPlausible](ByteView payload) {
      return plausible(payload.subspan(before));
    };
  layout.fixed.insert(layout.fixed.end(),
                      {{byteAt(1), 1}, {byteAt(4), id}, {byteAt(5), version}, {wordAt(6), layout.size}});
  layout.version = {1, id, version};
  layout.size += before;
  layout.minimum += before;
  return layout;
}

/// The only subpacket of the packet.
inline Bytes subpacketOf(ByteView payload) { return Bytes(payload.begin() + 4, payload.end()); }
/// A packet of version 1 with these subpackets, as they are.
inline Bytes packetOfSubpackets(const std::vector<Bytes>& subpackets) {
  Bytes payload = {1, static_cast<std::uint8_t>(subpackets.size()), 0xEE, 0xEE};
  for (const Bytes& subpacket : subpackets) payload.insert(payload.end(), subpacket.begin(), subpacket.end());
  return payload;
}

/// The rules that every layout of a decoder has to follow. `make` returns a new decoder.
template <class Make>
class LayoutRules {
 public:
  explicit LayoutRules(Make make) : _make(std::move(make)) {}

  /// The packet shows what its description says, and each of its bits alone moves the rows it belongs to and
  /// no other one.
  void expectEachFieldByItself(const DescribedLayout& layout) const {
    SCOPED_TRACE(layout.name());
    const Bytes base = layout.payload();
    expectRows(layout, base, "the packet as it is");
    for (std::size_t bit = 0; bit < 8 * layout.size; ++bit) {
      if (layout.isFixed(bit)) continue;
      Bytes changed = base;
      changed[bit / 8] = static_cast<std::uint8_t>(changed[bit / 8] ^ 1u << bit % 8);
      expectRows(layout, changed, printed("bit %zu of byte %zu of the payload is turned", bit % 8, bit / 8));
    }
  }

  /// The version is shown and counts as decoded.
  void expectVersionKnown(const DescribedLayout& layout) const {
    SCOPED_TRACE(layout.name());
    auto decoder = _make();
    decoder.decode(layout.logCode, layout.payload());
    decoder.decodeWithoutSection(layout.logCode, layout.payload());
    EXPECT_EQ(decoder.version(), layout.version.text());
    EXPECT_EQ(decoder.fateOf(layout.logCode, layout.payload()),
              (MessageFate{MessageFate::Outcome::Decoded, layout.logCode}));
  }

  /// What is cut off is not shown: below the minimum nothing changes, and above it a row shows what it showed
  /// of the whole packet, or nothing.
  void expectNothingPastTheEnd(const DescribedLayout& layout) const {
    SCOPED_TRACE(layout.name());
    const Bytes whole = layout.payload();
    const Rows expected = layout.rowsOf(whole);
    for (std::size_t size = 0; size <= whole.size(); ++size) {
      SCOPED_TRACE(printed("%zu of %zu bytes of the payload", size, whole.size()));
      // The size of a cut subpacket passes the end.
      const bool isLost = layout.version.subpacket != 0 && size < whole.size();
      expectCut(layout, expected, Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)),
                isLost ? 0 : size);
    }
    for (std::size_t size = 0; size < Packet::headerSize; ++size) {
      auto decoder = _make();
      const std::string before = decoder.everything();
      const Bytes packet = packetOf(layout.logCode, whole);
      decoder.decodePacket(layout.logCode,
                           Bytes(packet.begin(), packet.begin() + static_cast<std::ptrdiff_t>(size)));
      EXPECT_EQ(decoder.everything(), before) << "a packet of " << size << " bytes";
    }
  }

  /// The same for a subpacket that says that it is shorter, with and without other bytes behind it.
  void expectNothingPastTheSubpacketsEnd(const DescribedLayout& layout) const {
    SCOPED_TRACE(layout.name());
    const Bytes whole = layout.payload();
    const Rows expected = layout.rowsOf(whole);
    for (std::size_t size = 0; size + 4 <= whole.size(); ++size) {
      SCOPED_TRACE(printed("a subpacket of %zu of %zu bytes", size, whole.size() - 4));
      Bytes cut = whole;
      put(cut, wordAt(6), size);
      expectCut(layout, expected, cut, size + 4);
      if (size >= 4) cut.resize(4 + size);
      expectCut(layout, expected, cut, size + 4);
    }
    for (const std::size_t size : {whole.size() - 3, std::size_t{65535}}) {
      SCOPED_TRACE(printed("a subpacket of %zu bytes", size));
      Bytes lying = whole;
      put(lying, wordAt(6), size);
      expectCut(layout, expected, lying, 0);
    }
  }

  /// The packet is decoded into a section that shows something else: at every length below the minimum the
  /// section stays as it is, its version too.
  void expectUnchangedBelowMinimum(const DescribedLayout& layout, const DescribedLayout& shownBefore) const {
    SCOPED_TRACE(layout.name() + " after " + shownBefore.name());
    const Bytes whole = layout.payload();
    for (std::size_t size = 0; size < layout.minimum; ++size) {
      auto decoder = _make();
      decoder.decode(shownBefore.logCode, shownBefore.payload());
      const std::string before = decoder.everything();
      decoder.decode(layout.logCode, Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)));
      EXPECT_EQ(decoder.everything(), before) << size << " bytes of the payload";
    }
  }

  /// All versions but these show that they are not known, and change nothing else.
  void expectOtherVersionsUnknown(const DescribedLayout& layout,
                                  const std::vector<std::uint32_t>& known) const {
    SCOPED_TRACE(layout.name());
    std::vector<std::uint32_t> tried;
    for (std::uint32_t number = 0; number < 256; ++number) tried.push_back(number);
    if (layout.isNR())
      for (const std::uint32_t number : {0x100u, 0x10003u, 0x10000u, 0x20001u, 0x2000Bu, 0x20008u, 0x30001u,
                                         0x30004u, 0x40000u, 0x1030000u, 0xFFFFFFFFu})
        tried.push_back(number);
    for (const std::uint32_t number : tried) {
      if (std::find(known.begin(), known.end(), number) != known.end()) continue;
      Bytes payload = layout.payload();
      put(payload, layout.versionRun(), number);
      expectUnknown(layout, payload, {number});
    }
  }
  /// The same for the versions of the layout's subpacket.
  void expectOtherSubpacketVersionsUnknown(const DescribedLayout& layout,
                                           const std::vector<std::uint32_t>& known) const {
    SCOPED_TRACE(layout.name());
    for (std::uint32_t number = 0; number < 256; ++number) {
      if (std::find(known.begin(), known.end(), number) != known.end()) continue;
      Bytes payload = layout.payload();
      payload[5] = static_cast<std::uint8_t>(number);
      expectUnknown(layout, payload, {1, layout.version.subpacket, static_cast<std::uint8_t>(number)});
    }
  }

 private:
  void expectRows(const DescribedLayout& layout, const Bytes& payload, const std::string& what) const {
    auto decoder = _make();
    decoder.decode(layout.logCode, payload);
    EXPECT_EQ(differences(layout.rowsOf(payload), decoder.rows()), "") << what;
  }

  void expectCut(const DescribedLayout& layout, const Rows& whole, const Bytes& payload,
                 std::size_t reach) const {
    auto decoder = _make();
    const std::string before = decoder.everything();
    decoder.decode(layout.logCode, payload);
    if (reach < layout.minimum) {
      EXPECT_EQ(differences({}, decoder.rows()), "");
    } else if (reach >= layout.size) {
      EXPECT_EQ(differences(whole, decoder.rows()), "");
    } else {
      for (const auto& [path, text] : decoder.rows()) {
        const auto found = whole.find(path);
        EXPECT_TRUE(found != whole.end() && (found->second == text || found->second == anyText))
            << path << " shows " << text << " but is not in the packet";
      }
    }
  }

  void expectUnknown(const DescribedLayout& layout, const Bytes& payload,
                     const PacketVersion& version) const {
    auto decoder = _make();
    decoder.decode(layout.logCode, layout.payload());
    const Rows before = decoder.rows();
    decoder.decode(layout.logCode, payload);
    EXPECT_EQ(differences(before, decoder.rows()), "") << version.text();
    EXPECT_EQ(decoder.version(), version.text() + " (not known)");
    const MessageFate fate = decoder.fateOf(layout.logCode, payload);
    EXPECT_EQ(fate.outcome, MessageFate::Outcome::UnknownVersion) << version.text();
    EXPECT_EQ(fate.logCode, layout.logCode);
    ASSERT_TRUE(fate.version.has_value()) << version.text();
    EXPECT_EQ(fate.version->text(), version.text());
  }

  Make _make;
};

}  // namespace varnel

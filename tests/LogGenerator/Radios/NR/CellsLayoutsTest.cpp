#include <gtest/gtest.h>

#include "LogGenerator/Radios/NR/Cells.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::nr {
namespace {

constexpr std::uint32_t code = 0xB97F;

DecoderAlone<Cells> newDecoder() { return DecoderAlone<Cells>("Layers"); }
const LayoutRules rules(newDecoder);

std::string frequency(std::uint64_t number) {
  if (number > 3279165) return "";
  const auto steps = static_cast<std::int64_t>(number);
  const std::int64_t frequency_khz = steps < 600000    ? 5 * steps
                                     : steps < 2016667 ? 3000000 + 15 * (steps - 600000)
                                                       : 24250080 + 60 * (steps - 2016667);
  return printed("%.3f MHz", static_cast<double>(frequency_khz) / 1000);
}
TextOf nrLevel(const char* unit) {
  return [unit](std::uint64_t number) {
    if (number == 0) return std::string();
    return printed("%.2f ", static_cast<double>(signedNumber(number, 32)) / 128) + unit;
  };
}
std::uint64_t negative(int number) { return static_cast<std::uint32_t>(-number); }

struct Version {
  std::uint32_t number;
  std::size_t countAt, periodAt, firstLayer, layer, beam;

  bool isWide() const { return layer == 40; }
};
constexpr std::size_t cellSize = 16;
const std::vector<Version> versions = {
    {0x20006, 4, 5, 8, 32, 44},  {0x20007, 4, 5, 16, 32, 44}, {0x20009, 8, 9, 20, 32, 44},
    {0x2000A, 8, 9, 20, 32, 84}, {0x30000, 8, 9, 20, 40, 84},
};
const std::vector<std::uint32_t> versionNumbers = {0x20006, 0x20007, 0x20009, 0x2000A, 0x30000};
std::size_t cellCountAt(const Version& version) { return version.isWide() ? 5 : 4; }
std::size_t servingIndexAt(const Version& version) { return version.isWide() ? 8 : 5; }

// One layer with one cell with one beam.
DescribedLayout layoutOf(const Version& version) {
  const std::size_t layer = version.firstLayer, cell = layer + version.layer, beam = cell + cellSize;
  DescribedLayout made{.logCode = code,
                       .version = {version.number},
                       .size = beam + version.beam,
                       .minimum = layer + (version.isWide() ? 28 : 20),
                       .fixed = {{byteAt(version.countAt), 1},
                                 {byteAt(layer + cellCountAt(version)), 1},
                                 {byteAt(layer + servingIndexAt(version)), 0},
                                 {byteAt(cell + 4), 1}}};
  const auto add = [&](const std::string& path, BitRun run, std::uint64_t number, TextOf text) {
    made.fields.push_back({path, run, number, std::move(text)});
  };
  const BitRun channel = longAt(layer), servingCell = wordAt(layer + 6), cellIdentity = wordAt(cell);
  const std::string inLayer = "Layers/0/", inCell = inLayer + "Cells/0/", inBeam = inCell + "Beams/0/";
  add("SSB Period", byteAt(version.periodAt), 20, plainNumber());
  add(inLayer + "NR-ARFCN", channel, 641281, plainNumber());
  add(inLayer + "Frequency", channel, 641281, frequency);
  if (version.isWide()) add(inLayer + "Carrier", byteAt(layer + 4), 3, plainNumber());
  add(inLayer + "Serving Cell", servingCell, 301, plainNumber());
  add(inLayer + "SSB", {layer + (version.isWide() ? 9 : 8), 0, 4}, 5, plainNumber());
  const unsigned antennas = version.isWide() ? 4 : 2;
  for (unsigned antenna = 0; antenna < antennas; ++antenna)
    add(inLayer + "RSRP Rx" + std::to_string(antenna), longAt(layer + 12 + 4 * antenna),
        negative(11000 + static_cast<int>(antenna) * 77), nrLevel("dBm"));
  add(inCell + "Physical Cell ID", cellIdentity, 301, plainNumber());
  add(inCell + "System Frame Number", wordAt(cell + 2), 713, plainNumber());
  add(inCell + "RSRP", longAt(cell + 8), negative(11501), nrLevel("dBm"));
  add(inCell + "RSRQ", longAt(cell + 12), negative(1401), nrLevel("dB"));
  add(inBeam + "SSB", {beam, 0, 4}, 6, plainNumber());
  add(inBeam + "RSRP Rx0", longAt(beam + 20), negative(11601), nrLevel("dBm"));
  add(inBeam + "RSRP Rx1", longAt(beam + 24), negative(11703), nrLevel("dBm"));
  const std::size_t filtered = beam + (version.beam == 84 ? 68 : 28);
  if (version.beam == 84) {
    add(inBeam + "RSRQ Rx0", longAt(beam + 28), negative(1503), nrLevel("dB"));
    add(inBeam + "RSRQ Rx1", longAt(beam + 32), negative(1605), nrLevel("dB"));
  }
  add(inBeam + "Filtered RSRP", longAt(filtered), negative(11803), nrLevel("dBm"));
  add(inBeam + "Filtered RSRQ", longAt(filtered + 4), negative(1701), nrLevel("dB"));
  add(inBeam + "L2 Filtered RSRP", longAt(filtered + 8), negative(11905), nrLevel("dBm"));
  add(inBeam + "L2 Filtered RSRQ", longAt(filtered + 12), negative(1803), nrLevel("dB"));
  made.isPlausible = [=](ByteView payload) {
    return numberIn(payload, channel) <= 3279165 && numberIn(payload, servingCell) <= 1007 &&
           numberIn(payload, cellIdentity) <= 1007;
  };
  return made;
}

// The packet whose implausible numbers no test makes.
DescribedLayout plausibleOnly(const Version& version) {
  DescribedLayout layout = layoutOf(version);
  const std::size_t cell = version.firstLayer + version.layer;
  // 641281 is 0x9C901.
  layout.fixed.push_back({{version.firstLayer, 21, 11}, 0});
  layout.fixed.push_back({{version.firstLayer + 6, 10, 6}, 0});
  layout.fixed.push_back({{cell, 10, 6}, 0});
  return layout;
}

TEST(NRCellsLayouts, EachFieldMovesItsRowsOnly) {
  for (const Version& version : versions) rules.expectEachFieldByItself(plausibleOnly(version));
}

TEST(NRCellsLayouts, ImplausibleNumbersAreNotShown) {
  for (const Version& version : versions) {
    const DescribedLayout layout = layoutOf(version);
    const std::size_t layer = version.firstLayer, cell = layer + version.layer;
    const auto rowsOf = [&](BitRun run, std::uint64_t number) {
      Bytes payload = layout.payload();
      put(payload, run, number);
      auto decoder = newDecoder();
      decoder.decode(code, payload);
      Rows rows = decoder.rows();
      rows.erase("SSB Period");
      return rows;
    };
    SCOPED_TRACE(layout.name());
    EXPECT_EQ(rowsOf(longAt(layer), 3279165).at("Layers/0/NR-ARFCN"), "3279165");
    EXPECT_EQ(differences({}, rowsOf(longAt(layer), 3279166)), "");
    EXPECT_EQ(differences({}, rowsOf(longAt(layer), 0xFFFFFFFF)), "");
    EXPECT_EQ(rowsOf(wordAt(layer + 6), 1007).at("Layers/0/Serving Cell"), "1007");
    for (const std::uint64_t number : {1008, 65534}) {
      EXPECT_FALSE(rowsOf(wordAt(layer + 6), number).contains("Layers/0/Serving Cell")) << number;
      EXPECT_FALSE(rowsOf(wordAt(cell), number).contains("Layers/0/Cells/0/Physical Cell ID")) << number;
    }
  }
}

TEST(NRCellsLayouts, Cell65535IsNoServingCell) {
  for (const Version& version : versions) {
    const DescribedLayout layout = layoutOf(version);
    Bytes payload = layout.payload();
    Rows expected = layout.rowsOf(payload);
    put(payload, wordAt(version.firstLayer + 6), 65535);
    expected.erase("Layers/0/Serving Cell");
    auto decoder = newDecoder();
    decoder.decode(code, payload);
    EXPECT_EQ(differences(expected, decoder.rows()), "") << layout.name();
  }
}

TEST(NRCellsLayouts, LevelsOf0AreLeftOut) {
  for (const Version& version : versions) {
    const DescribedLayout layout = layoutOf(version);
    for (const FieldRow& field : layout.fields) {
      if (field.path.find("RSR") == std::string::npos) continue;
      Bytes payload = layout.payload();
      Rows expected = layout.rowsOf(payload);
      put(payload, field.run, 0);
      expected.erase(field.path);
      auto decoder = newDecoder();
      decoder.decode(code, payload);
      EXPECT_EQ(differences(expected, decoder.rows()), "") << layout.name() << " " << field.path;
    }
  }
}

TEST(NRCellsLayouts, KnownVersionsShowTheirNumber) {
  for (const Version& version : versions) rules.expectVersionKnown(layoutOf(version));
  auto decoder = newDecoder();
  decoder.decode(code, layoutOf(versions[3]).payload());
  EXPECT_EQ(decoder.version(), "2.10");
}

TEST(NRCellsLayouts, OtherVersionsAreNotKnown) {
  for (const Version& version : versions) rules.expectOtherVersionsUnknown(layoutOf(version), versionNumbers);
}

TEST(NRCellsLayouts, NothingPastTheEndIsShown) {
  for (const Version& version : versions) {
    DescribedLayout layout = layoutOf(version);
    layout.minimum = version.periodAt;
    rules.expectNothingPastTheEnd(layout);
  }
}

// A layer with these cells, which have these numbers of beams.
struct Layer {
  std::vector<unsigned> beams;
  unsigned count, servingIndex = 0;
};
Bytes packet(const Version& version, const std::vector<Layer>& layers, unsigned count) {
  Bytes payload(version.firstLayer);
  put(payload, longAt(0), version.number);
  put(payload, byteAt(version.countAt), count);
  unsigned cellNumber = 100;
  for (const Layer& layer : layers) {
    const std::size_t at = payload.size();
    payload.resize(at + version.layer);
    put(payload, longAt(at), 500000 + cellNumber);
    put(payload, wordAt(at + 6), 65535);
    put(payload, byteAt(at + cellCountAt(version)), layer.count);
    put(payload, byteAt(at + servingIndexAt(version)), layer.servingIndex);
    for (const unsigned beams : layer.beams) {
      const std::size_t cell = payload.size();
      payload.resize(cell + cellSize + beams * version.beam);
      put(payload, wordAt(cell), cellNumber++);
      put(payload, byteAt(cell + 4), beams);
      for (unsigned beam = 0; beam < beams; ++beam)
        put(payload, wordAt(cell + cellSize + beam * version.beam), beam + 1);
    }
  }
  return payload;
}
// "100: 1 2 | 101:", the cells and beams of each layer.
std::string treeOf(const Bytes& payload) {
  auto decoder = newDecoder();
  decoder.decode(code, payload);
  std::string tree;
  for (const Value& layer : *decoder.section().dictionary()->get("Layers").array()) {
    if (!tree.empty()) tree += " | ";
    tree += "layer";
    const Array* cells = layer.dictionary()->get("Cells").array();
    if (!cells) continue;
    for (const Value& cell : *cells) {
      tree += " " + *cell.dictionary()->get("Physical Cell ID").string() + "(";
      const Array* beams = cell.dictionary()->get("Beams").array();
      if (beams)
        for (const Value& beam : *beams) tree += *beam.dictionary()->get("SSB").string();
      tree += ")";
    }
  }
  return tree;
}

TEST(NRCellsLayouts, LayersCellsAndBeamsFollowEachOther) {
  for (const Version& version : versions) {
    SCOPED_TRACE(version.number);
    EXPECT_EQ(treeOf(packet(version, {{{2, 0}, 2}, {{}, 0}, {{1, 3, 1}, 3}}, 3)),
              "layer 100(12) 101() | layer | layer 102(1) 103(123) 104(1)");
  }
}

TEST(NRCellsLayouts, TheNumberOfCellsMayStandAtTheServingIndex) {
  for (const Version& version : versions) {
    SCOPED_TRACE(version.number);
    const auto treeOfCounts = [&](unsigned count, unsigned servingIndex) {
      return treeOf(packet(version, {{{1, 2}, count, servingIndex}}, 1));
    };
    EXPECT_EQ(treeOfCounts(2, 0), "layer 100(1) 101(12)");
    EXPECT_EQ(treeOfCounts(2, 1), "layer 100(1) 101(12)");
    EXPECT_EQ(treeOfCounts(2, 255), "layer 100(1) 101(12)");
    EXPECT_EQ(treeOfCounts(0, 2), "layer 100(1) 101(12)");
    EXPECT_EQ(treeOfCounts(255, 2), "layer 100(1) 101(12)");
    EXPECT_EQ(treeOfCounts(255, 1), "layer 100(1)");
    EXPECT_EQ(treeOfCounts(0, 0), "layer");
    EXPECT_EQ(treeOfCounts(0, 255), "layer");
    EXPECT_EQ(treeOfCounts(1, 2), "layer 100(1)");
  }
}

TEST(NRCellsLayouts, CountsAreUpperBoundsOnly) {
  for (const Version& version : versions) {
    SCOPED_TRACE(version.number);
    const std::vector<Layer> layers = {{{1, 1}, 2}};
    for (const unsigned count : {1u, 2u, 255u})
      EXPECT_EQ(treeOf(packet(version, layers, count)), "layer 100(1) 101(1)") << count;
    EXPECT_EQ(treeOf(packet(version, layers, 0)), "");
    for (const unsigned count : {3u, 254u})
      EXPECT_EQ(treeOf(packet(version, {{{1, 1}, count}}, 1)), "layer 100(1) 101(1)") << count;
    Bytes lying = packet(version, layers, 1);
    for (const unsigned beams : {2u, 255u}) {
      put(lying, byteAt(lying.size() - version.beam - 12), beams);
      EXPECT_EQ(treeOf(lying), "layer 100(1) 101(1)") << beams;
    }
  }
}

TEST(NRCellsLayouts, EveryCutOfATreeShowsItsBeginning) {
  for (const Version& version : versions) {
    const Bytes whole = packet(version, {{{2, 1}, 2}, {{1}, 1}}, 2);
    auto complete = newDecoder();
    complete.decode(code, whole);
    const Rows rows = complete.rows();
    for (std::size_t size = 0; size < whole.size(); ++size) {
      auto decoder = newDecoder();
      decoder.decode(code, Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)));
      for (const auto& [path, text] : decoder.rows()) {
        ASSERT_TRUE(rows.contains(path)) << size << " bytes: " << path;
        EXPECT_EQ(rows.at(path), text) << size << " bytes: " << path;
      }
      // The last beam is not there.
      EXPECT_EQ(decoder.text("Layers/1/Cells/0/Beams/0/SSB"), "") << size;
    }
  }
}

TEST(NRCellsLayouts, APacketReplacesTheLayersBefore) {
  auto decoder = newDecoder();
  decoder.decode(code, packet(versions[4], {{{1}, 1}, {{2}, 1}}, 2));
  decoder.decode(code, packet(versions[0], {{{1}, 1}}, 1));
  EXPECT_EQ(decoder.section().dictionary()->get("Layers").array()->size(), 1u);
  decoder.decode(code, packet(versions[4], {}, 0));
  EXPECT_EQ(decoder.section().dictionary()->get("Layers").array()->size(), 0u);
}

TEST(NRCellsLayouts, Version3InLiterals) {
  Bytes payload(20 + 40 + 16 + 84);
  PacketBuilder words(0, 13 + payload.size());
  words.u32(13, 0x30000).u8(21, 1).u8(22, 3);
  const std::size_t layer = 33, cell = 73, beam = 89;
  words.u32(layer, 2071667).u8(layer + 4, 1).u8(layer + 5, 255).u16(layer + 6, 500).u8(layer + 8, 1);
  words.u8(layer + 9, 0x12).u32(layer + 12, 0xFFFFCE00);
  words.u16(cell, 500)
      .u16(cell + 2, 1023)
      .u8(cell + 4, 1)
      .u32(cell + 8, 0xFFFFCDC0)
      .u32(cell + 12, 0xFFFFFA80);
  words.u16(beam, 0x32).u32(beam + 20, 0xFFFFCE00).u32(beam + 28, 0xFFFFFA7F).u32(beam + 68, 0xFFFFCE01);
  words.u32(beam + 80, 0xFFFFFF80);
  const Bytes bytes = words.bytes();
  auto decoder = newDecoder();
  decoder.decode(code, Bytes(bytes.begin() + 13, bytes.end()));
  // 24250.08 MHz + 60 kHz x 55000; -12800 / 128, -12864 / 128, -1408 / 128, -1409 / 128, -12799 / 128.
  EXPECT_EQ(differences({{"SSB Period", "3"},
                         {"Layers/0/NR-ARFCN", "2071667"},
                         {"Layers/0/Frequency", "27550.080 MHz"},
                         {"Layers/0/Carrier", "1"},
                         {"Layers/0/Serving Cell", "500"},
                         {"Layers/0/SSB", "2"},
                         {"Layers/0/RSRP Rx0", "-100.00 dBm"},
                         {"Layers/0/Cells/0/Physical Cell ID", "500"},
                         {"Layers/0/Cells/0/System Frame Number", "1023"},
                         {"Layers/0/Cells/0/RSRP", "-100.50 dBm"},
                         {"Layers/0/Cells/0/RSRQ", "-11.00 dB"},
                         {"Layers/0/Cells/0/Beams/0/SSB", "2"},
                         {"Layers/0/Cells/0/Beams/0/RSRP Rx0", "-100.00 dBm"},
                         {"Layers/0/Cells/0/Beams/0/RSRQ Rx0", "-11.01 dB"},
                         {"Layers/0/Cells/0/Beams/0/Filtered RSRP", "-99.99 dBm"},
                         {"Layers/0/Cells/0/Beams/0/L2 Filtered RSRQ", "-1.00 dB"}},
                        decoder.rows()),
            "");
}

}  // namespace
}  // namespace varnel::nr

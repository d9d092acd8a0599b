#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "LogGenerator/Radios/Channels.h"
#include "tests/support/VersionedHarness.h"

namespace varnel {

/// The frequency and the band of an EARFCN, as rows show them.
inline std::string lteDownlinkText(std::uint64_t earfcn) {
  const auto channel = channels::lteDownlink(static_cast<std::uint32_t>(earfcn));
  return channel ? printed("%.1f MHz", channel->frequency_khz / 1000.0) : "";
}
inline std::string lteBandText(std::uint64_t earfcn) {
  const auto channel = channels::lteDownlink(static_cast<std::uint32_t>(earfcn));
  return channel ? std::to_string(channel->band) : "";
}

/// Where a version of the measurements of serving cells (0xB193, subpacket 25) has its values. The bytes of
/// the fields count from the cell's first.
struct MeasurementDescription {
  unsigned version;
  unsigned channelWidth;
  std::size_t first, stride;
  unsigned countWidth;  ///< of the number of cells at byte 8; 0: there is one cell, and no number
  std::size_t cellWord, frameWord;
  bool hasServing;  ///< serving index and flag in the cell's word
  unsigned antennas;
  std::size_t extent;  ///< of a cell, up to its last field
  std::vector<FieldRow> levels;

  std::size_t sizeOf(unsigned cells) const { return first + cells * stride; }
};

namespace measurements {

// Numbers that differ, with more than one bit each.
inline FieldRow rsrp(const char* label, std::size_t byte, unsigned bit, unsigned number,
                     double summand = -180) {
  return {label, {byte, bit, 12}, number, level("%.2f dBm", 16, summand)};
}
inline FieldRow rsrq(const char* label, std::size_t byte, unsigned bit, unsigned number) {
  return {label, {byte, bit, 10}, number, rsrqText()};
}
inline FieldRow rssi(const char* label, std::size_t byte, unsigned bit, unsigned number) {
  return {label, {byte, bit, 11}, number, rssiText()};
}
inline FieldRow snr(const char* label, std::size_t byte, unsigned bit, unsigned number) {
  return {label, {byte, bit, 9}, number, snrText()};
}
inline FieldRow projectedSIR(std::size_t byte) {
  return {"Projected SIR", longAt(byte), 0xFFFFFF73, [](std::uint64_t number) {
            return printed("%.2f dB", static_cast<double>(signedNumber(number, 32)) / 16);
          }};
}
inline FieldRow rsrqAfterCancellation(std::size_t byte) {
  return {"RSRQ after Cancellation", longAt(byte), 0x123, [](std::uint64_t number) {
            return number >> 31 != 0 ? std::string(anyText)
                                     : printed("%.2f dB", static_cast<double>(number) / 16 - 30);
          }};
}

/// Two antennas: seven words from `words` on, and the word of SNR.
inline std::vector<FieldRow> ofTwoAntennas(std::size_t words, std::size_t snrWord) {
  return {rsrp("RSRP Rx0", words, 10, 1301),     rsrp("RSRP Rx1", words + 4, 12, 1277),
          rsrp("RSRP", words + 8, 12, 1301),     rsrq("RSRQ Rx0", words + 12, 12, 309),
          rsrq("RSRQ Rx1", words + 16, 0, 277),  rsrq("RSRQ", words + 16, 20, 310),
          rssi("RSSI Rx0", words + 20, 10, 691), rssi("RSSI Rx1", words + 20, 21, 678),
          rssi("RSSI", words + 24, 0, 699),      snr("SNR Rx0", snrWord, 0, 291),
          snr("SNR Rx1", snrWord, 9, 259)};
}

/// Four antennas: RSRP of antennas 0 to 2 from `words` on, the word of antenna 3 and those behind it from
/// `next` on. No SNR when its word is 0.
inline std::vector<FieldRow> ofFourAntennas(std::size_t words, std::size_t next, std::size_t snrWord) {
  std::vector<FieldRow> rows = {
      rsrp("RSRP Rx0", words, 10, 1301),     rsrp("RSRP Rx1", words + 4, 12, 1277),
      rsrp("RSRP Rx2", words + 8, 12, 1254), rsrp("RSRP Rx3", next, 0, 1123),
      rsrp("RSRP", next, 12, 661, -140),     rsrp("Filtered RSRP", next + 4, 12, 1310),
      rsrq("RSRQ Rx0", next + 8, 0, 309),    rsrq("RSRQ Rx1", next + 8, 20, 277),
      rsrq("RSRQ Rx2", next + 12, 10, 251),  rsrq("RSRQ Rx3", next + 12, 20, 234),
      rsrq("RSRQ", next + 16, 0, 310),       rsrq("Filtered RSRQ", next + 16, 20, 317),
      rssi("RSSI Rx0", next + 20, 0, 691),   rssi("RSSI Rx1", next + 20, 11, 678),
      rssi("RSSI Rx2", next + 24, 0, 653),   rssi("RSSI Rx3", next + 24, 11, 619),
      rssi("RSSI", next + 28, 0, 699)};
  if (snrWord != 0) {
    const FieldRow snrs[] = {snr("SNR Rx0", snrWord, 0, 291), snr("SNR Rx1", snrWord, 9, 259),
                             snr("SNR Rx2", snrWord + 4, 0, 231), snr("SNR Rx3", snrWord + 4, 9, 215)};
    rows.insert(rows.end(), std::begin(snrs), std::end(snrs));
  }
  return rows;
}

}  // namespace measurements

inline std::vector<MeasurementDescription> measurementDescriptions() {
  using namespace measurements;
  const auto with = [](std::vector<FieldRow> rows, std::size_t sir, std::size_t cancellation) {
    rows.push_back(projectedSIR(sir));
    rows.push_back(rsrqAfterCancellation(cancellation));
    return rows;
  };
  std::vector<FieldRow> version22 = {
      rsrp("RSRP Rx0", 16, 10, 1301), rsrp("RSRP Rx1", 20, 12, 1277), rsrp("RSRP", 28, 12, 1301),
      rsrq("RSRQ Rx0", 32, 12, 309),  rsrq("RSRQ Rx1", 36, 0, 277),   rsrq("RSRQ", 40, 10, 310),
      rssi("RSSI Rx0", 44, 10, 691),  rssi("RSSI Rx1", 44, 21, 678),  rssi("RSSI", 52, 0, 699),
      snr("SNR Rx0", 76, 0, 291),     snr("SNR Rx1", 76, 9, 259)};
  // In versions 4 and 7 the cell's bytes count from the subpacket's first.
  return {
      {4, 16, 0, 80, 0, 6, 8, true, 2, 68, ofTwoAntennas(16, 64)},
      {7, 32, 0, 84, 0, 8, 12, true, 2, 72, ofTwoAntennas(20, 68)},
      {18, 32, 8, 88, 0, 0, 4, true, 2, 68, ofTwoAntennas(16, 64)},
      {19, 32, 12, 88, 16, 0, 4, true, 2, 88, with(ofTwoAntennas(16, 64), 80, 84)},
      {22, 32, 12, 112, 16, 0, 4, true, 2, 104, with(version22, 96, 100)},
      {24, 32, 12, 92, 16, 0, 4, true, 2, 88, with(ofTwoAntennas(16, 64), 80, 84)},
      {35, 32, 12, 124, 16, 0, 4, true, 4, 108, with(ofFourAntennas(16, 28, 80), 100, 104)},
      {36, 32, 12, 128, 16, 0, 4, true, 4, 112, with(ofFourAntennas(16, 28, 80), 104, 108)},
      {40, 32, 12, 132, 16, 0, 4, true, 4, 116, with(ofFourAntennas(16, 32, 84), 108, 112)},
      {48, 32, 16, 140, 16, 0, 4, true, 4, 124, with(ofFourAntennas(16, 32, 92), 116, 120)},
      {50, 32, 16, 140, 16, 0, 4, true, 4, 124, with(ofFourAntennas(16, 32, 92), 116, 120)},
      {60, 32, 12, 148, 32, 8, 12, false, 4, 148, with(ofFourAntennas(24, 40, 0), 140, 144)},
  };
}
inline std::vector<std::uint32_t> measurementVersions() {
  return {4, 7, 18, 19, 22, 24, 35, 36, 40, 48, 50, 60};
}
inline MeasurementDescription measurementDescription(unsigned version) {
  for (const MeasurementDescription& layout : measurementDescriptions())
    if (layout.version == version) return layout;
  return {};
}

inline constexpr std::uint32_t measurementCode = 0xB193;
inline constexpr std::uint64_t measuredChannel = 3050, measuredCell = 301;

/// What one subpacket with one cell shows, with no rows yet. The bytes count from the subpacket's first.
inline DescribedLayout measurementCase(const MeasurementDescription& layout) {
  DescribedLayout made{
      .logCode = measurementCode, .size = layout.sizeOf(1), .minimum = layout.first + layout.extent};
  if (layout.countWidth != 0) made.fixed = {{{8, 0, layout.countWidth}, 1}};
  const BitRun channel{4, 0, layout.channelWidth}, cell{layout.first + layout.cellWord, 0, 9};
  made.fields = {};
  made.isPlausible = [=](ByteView subpacket) {
    return numberIn(subpacket, channel) <= 262143 && numberIn(subpacket, cell) <= 503;
  };
  return made;
}
inline BitRun channelRun(const MeasurementDescription& layout) { return {4, 0, layout.channelWidth}; }
inline BitRun cellRun(const MeasurementDescription& layout) { return {layout.first + layout.cellWord, 0, 9}; }
inline BitRun servingIndexRun(const MeasurementDescription& layout) {
  return {layout.first + layout.cellWord, 9, 3};
}
inline BitRun isServingRun(const MeasurementDescription& layout) {
  return {layout.first + layout.cellWord, 12, 1};
}
inline FieldRow shifted(FieldRow field, std::size_t bytes, const std::string& before = {}) {
  field.run.byte += bytes;
  field.path = before + field.path;
  return field;
}

/// A subpacket of several cells with these identities; the levels are those of the layout. The number of
/// cells is as given, whatever there are.
struct DescribedCell {
  unsigned cell, servingIndex, isServing;
  int rsrp = -1;  ///< the number of the combined RSRP, where it is not negative
};
inline Bytes measurementSubpacket(const MeasurementDescription& layout,
                                  const std::vector<DescribedCell>& cells, std::uint64_t count,
                                  std::uint64_t channel = measuredChannel) {
  Bytes bytes(layout.sizeOf(static_cast<unsigned>(cells.size())), 0x5A);
  bytes.at(0) = 25;
  bytes.at(1) = static_cast<std::uint8_t>(layout.version);
  put(bytes, wordAt(2), bytes.size());
  put(bytes, channelRun(layout), channel);
  if (layout.countWidth != 0) put(bytes, {8, 0, layout.countWidth}, count);
  std::size_t start = layout.first;
  for (const DescribedCell& cell : cells) {
    for (const FieldRow& field : layout.levels) {
      const bool isCombined = field.path == "RSRP" && cell.rsrp >= 0;
      put(bytes, shifted(field, start).run,
          isCombined ? static_cast<std::uint64_t>(cell.rsrp) : field.number);
    }
    const std::size_t word = start + layout.cellWord;
    put(bytes, {word, 0, 9}, cell.cell);
    if (layout.hasServing) {
      put(bytes, {word, 9, 3}, cell.servingIndex);
      put(bytes, {word, 12, 1}, cell.isServing);
    }
    start += layout.stride;
  }
  return bytes;
}

}  // namespace varnel

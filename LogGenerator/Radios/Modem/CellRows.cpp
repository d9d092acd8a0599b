#include "LogGenerator/Radios/Modem/CellRows.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstddef>

#include "LogGenerator/Radios/ChannelText.h"
#include "LogGenerator/Radios/Channels.h"
#include "LogGenerator/Radios/Modem/ReportReader.h"
#include "platform/ModemReport.h"

namespace varnel::modem {

namespace {

using enum CellRow::Kind;

constexpr std::size_t mostCells = 256;

constexpr Format power = real("%.2f dBm"), ratio = real("%.2f dB"), signalToNoise = real("%.1f dB"),
                 share = real("%.2f%%");

constexpr std::int64_t bitsOf(unsigned count) { return (std::int64_t{1} << count) - 1; }

// ---- Numbers with a text of their own ----

std::string lteFrequency(std::int64_t earfcn) {
  return channels::lteDownlinkFrequency(static_cast<std::uint32_t>(earfcn));
}
std::string lteBand(std::int64_t earfcn) { return channels::lteBand(static_cast<std::uint32_t>(earfcn)); }
std::string nrFrequency(std::int64_t nrArfcn) {
  return channels::nrFrequency(static_cast<std::uint32_t>(nrArfcn));
}

std::string list(const channels::BandNumbers& bands, std::string_view before) {
  std::string text;
  for (const std::uint16_t band : bands)
    text.append(text.empty() ? "" : ", ").append(before).append(std::to_string(band));
  return text;
}

// The number alone does not tell which of several bands is meant.
std::string nrBands(std::int64_t nrArfcn) {
  const auto frequency_khz = channels::nrFrequency_khz(static_cast<std::uint32_t>(nrArfcn));
  return frequency_khz ? list(channels::nrDownlinkBands(*frequency_khz), "n") : std::string();
}

std::string umtsBands(std::int64_t uarfcn) {
  const auto channel = channels::umtsDownlink(static_cast<std::uint32_t>(uarfcn));
  return channel ? list(channel->bands, "") : std::string();
}

std::string umtsFrequency(std::int64_t uarfcn) {
  const auto channel = channels::umtsDownlink(static_cast<std::uint32_t>(uarfcn));
  Formatter formatter;
  return channel ? std::string(
                       formatter.text(channels::frequencyFormat, channels::megahertz(channel->frequency_khz)))
                 : std::string();
}

// "20 MHz", "1.4 MHz".
std::string bandwidth(std::int64_t bandwidth_khz) {
  std::array<char, 32> room;
  const auto end = std::to_chars(room.begin(), room.end(), static_cast<double>(bandwidth_khz) / 1000,
                                 std::chars_format::fixed)
                       .ptr;
  return std::string(room.begin(), end).append(" MHz");
}

// The upper 20 of 28 bits are those of the base station.
std::string baseStation(std::int64_t cellIdentity) { return std::to_string(cellIdentity >> 8); }
std::string sector(std::int64_t cellIdentity) { return std::to_string(cellIdentity & 0xFF); }

// ---- The rows ----

constexpr CellRow networkRow{.label = "PLMN", .kind = Network};
constexpr CellRow locationArea{"Location Area Code", Whole, modemReport::locationAreaCode, 0, bitsOf(16)};

constexpr CellRow identity(unsigned bits) {
  return {"Cell Identity", Whole, modemReport::cellIdentity, 0, bitsOf(bits)};
}
constexpr CellRow trackingArea(unsigned bits) {
  return {"Tracking Area Code", Whole, modemReport::trackingAreaCode, 0, bitsOf(bits)};
}
constexpr CellRow physicalCell(std::int64_t most) {
  return {"Physical Cell ID", Whole, modemReport::physicalCellIdentity, 0, most};
}

constexpr CellRow bandwidthRow{"Downlink Bandwidth",      Whole, modemReport::bandwidth, 1, 400000, bandwidth,
                               &channels::bandwidthFormat};
constexpr CellRow timingAdvance{"Timing Advance", Whole, modemReport::timingAdvance, 0, bitsOf(16)};

constexpr CellRow level(std::string_view label, std::string_view key, std::int64_t least, std::int64_t most,
                        const Format& format) {
  return {.label = label, .kind = Level, .key = key, .least = least, .most = most, .format = &format};
}
constexpr CellRow rsrp = level("RSRP", modemReport::rsrp, -200, 50, power),
                  rsrq = level("RSRQ", modemReport::rsrq, -100, 100, ratio),
                  sinr = level("SINR", modemReport::sinr, -100, 100, signalToNoise),
                  rssi = level("RSSI", modemReport::rssi, -200, 50, power),
                  rscp = level("RSCP", modemReport::rscp, -200, 50, power),
                  ecIo = level("EcIo", modemReport::ecIo, -100, 100, ratio),
                  pathLoss = level("Path Loss", modemReport::pathLoss, 0, 300, ratio),
                  errorRate = level("Error Rate", modemReport::errorRate, 0, 100, share);

constexpr std::int64_t largestEARFCN = 262143, largestNRARFCN = 3279165, largestUARFCN = 16383;

constexpr CellRow lteRows[] = {
    networkRow,
    trackingArea(16),
    identity(28),
    {"eNB", Whole, modemReport::cellIdentity, 0, bitsOf(28), baseStation},
    {"Cell", Whole, modemReport::cellIdentity, 0, bitsOf(28), sector},
    {"EARFCN", Whole, modemReport::earfcn, 0, largestEARFCN},
    {"Band", Whole, modemReport::earfcn, 0, largestEARFCN, lteBand},
    {"Downlink Frequency", Whole, modemReport::earfcn, 0, largestEARFCN, lteFrequency,
     &channels::frequencyFormat},
    bandwidthRow,
    physicalCell(503),
    timingAdvance,
    rsrp,
    rsrq,
    sinr,
    rssi,
    errorRate,
};
constexpr CellRow nrRows[] = {
    networkRow,
    trackingArea(24),
    identity(36),
    {"NR-ARFCN", Whole, modemReport::nrArfcn, 0, largestNRARFCN},
    {"Band", Whole, modemReport::nrArfcn, 0, largestNRARFCN, nrBands},
    {"Downlink Frequency", Whole, modemReport::nrArfcn, 0, largestNRARFCN, nrFrequency,
     &channels::nrFrequencyFormat},
    bandwidthRow,
    physicalCell(1007),
    timingAdvance,
    rsrp,
    rsrq,
    sinr,
    rssi,
    errorRate,
};
constexpr CellRow umtsRows[] = {
    networkRow,
    locationArea,
    identity(28),
    {"UARFCN", Whole, modemReport::uarfcn, 0, largestUARFCN},
    {"Band", Whole, modemReport::uarfcn, 0, largestUARFCN, umtsBands},
    {"Downlink Frequency", Whole, modemReport::uarfcn, 0, largestUARFCN, umtsFrequency,
     &channels::frequencyFormat},
    {"Scrambling Code", Whole, modemReport::scramblingCode, 0, 511},
    rscp,
    ecIo,
    rssi,
    pathLoss,
    errorRate,
};
constexpr CellRow gsmRows[] = {
    networkRow,
    locationArea,
    identity(16),
    {"ARFCN", Whole, modemReport::arfcn, 0, 1023},
    {"BSIC", Whole, modemReport::baseStationIdentityCode, 0, 63},
    timingAdvance,
    rssi,
    errorRate,
};
constexpr CellRow cdmaRows[] = {
    {"System ID", Whole, modemReport::systemIdentity, 0, bitsOf(15)},
    {"Network ID", Whole, modemReport::networkIdentity, 0, bitsOf(16)},
    {"Base Station ID", Whole, modemReport::baseStationIdentity, 0, bitsOf(16)},
    {"PN", Whole, modemReport::pilotPN, 0, 511},
    rssi,
    ecIo,
    sinr,
    errorRate,
};

constexpr Radio allRadios[] = {
    {modemReport::lte, "LTE Cell", lteRows},        {modemReport::nr, "NR Cell", nrRows},
    {modemReport::umts, "UMTS Cell", umtsRows},     {modemReport::gsm, "GSM Cell", gsmRows},
    {modemReport::cdma2000, "CDMA Cell", cdmaRows},
};

bool holds(const Dictionary& entries, std::string_view key, std::string_view text) {
  const std::string* const found = entries.get(key).string();
  return found && *found == text;
}

}  // namespace

std::span<const Radio> radios() { return allRadios; }

std::string textOf(const Dictionary& cell, const CellRow& row, Formatter& formatter) {
  if (row.kind == Network) return network(cell);
  if (row.kind == Level) {
    const auto found = number(cell, row.key, static_cast<double>(row.least), static_cast<double>(row.most));
    return found ? std::string(formatter.text(*row.format, *found)) : std::string();
  }
  const auto found = wholeNumber(cell, row.key, row.least, row.most);
  if (!found) return {};
  return row.text ? row.text(*found) : std::to_string(*found);
}

void listFormats(const Radio& radio, SectionFormats& formats) {
  for (const CellRow& row : radio.rows)
    if (row.format) formats.add(row.label, *row.format);
}

std::span<const Value> cellsIn(const Dictionary& report) {
  const Array* const cells = report.get(modemReport::cells).array();
  if (!cells) return {};
  return std::span(*cells).first(std::min(cells->size(), mostCells));
}

const Radio* radioOf(const Dictionary& cell) {
  if (!isServing(cell) && !holds(cell, modemReport::cellType, modemReport::neighbor)) return nullptr;
  for (const Radio& radio : allRadios)
    if (holds(cell, modemReport::radioAccessTechnology, radio.name)) return &radio;
  return nullptr;
}

bool isServing(const Dictionary& cell) { return holds(cell, modemReport::cellType, modemReport::serving); }

const Dictionary* servingCellIn(const Dictionary& report, const Radio& radio) {
  const Dictionary* found = nullptr;
  forEachCell(report, [&](const Radio& itsRadio, const Dictionary& cell) {
    if (!found && &itsRadio == &radio && isServing(cell)) found = &cell;
  });
  return found;
}

}  // namespace varnel::modem

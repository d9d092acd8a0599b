#include "programs/varnel-telephonyd/live/ServerRecords.h"

#include <algorithm>
#include <cmath>
#include <string>
#include <string_view>

#include "LogGenerator/Radios/Channels.h"
#include "base/Dictionary.h"
#include "platform/ModemReport.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

using Radio = CellReading::Radio;

// In the cell monitor this number stands for a level that is not known.
constexpr std::int64_t unknownLevel = 32767;
constexpr std::size_t digitsOfCountry = 3;

void setNumber(Dictionary& entries, std::string_view key, std::optional<std::uint64_t> number) {
  if (number) entries.set(key, Value::ofInteger(static_cast<std::int64_t>(*number)));
}
void setReal(Dictionary& entries, std::string_view key, std::optional<double> number) {
  if (number) entries.set(key, Value::ofReal(*number));
}
void setText(Dictionary& entries, std::string_view key, const std::string& text) {
  if (!text.empty()) entries.set(key, text);
}

// ---- The cell monitor ----

std::string_view monitorNameOf(Radio radio) {
  switch (radio) {
    case Radio::GSM:
      return cellMonitor::gsm;
    case Radio::UMTS:
      return cellMonitor::umts;
    case Radio::LTE:
      return cellMonitor::lte;
    case Radio::NR:
    case Radio::CDMA2000:
      break;
  }
  return {};
}

// A serving cell of which only levels are known has no rows there.
bool isMonitored(const CellReading& cell) {
  return !monitorNameOf(cell.radio).empty() && (cell.area || cell.identity || cell.channel || cell.code);
}

Value wholeLevel(std::optional<double> level) {
  return Value::ofInteger(level ? std::lround(*level) : unknownLevel);
}

std::optional<std::uint64_t> bandOf(const CellReading& cell) {
  if (!cell.channel) return std::nullopt;
  if (cell.radio == Radio::LTE) {
    const auto channel = channels::lteDownlink(*cell.channel);
    return channel ? std::optional<std::uint64_t>(channel->band) : std::nullopt;
  }
  const auto channel = channels::umtsDownlink(*cell.channel);
  if (!channel || channel->bands.empty()) return std::nullopt;
  return channel->bands.mostSpecific();
}

void setNetwork(Dictionary& record, const std::string& network) {
  if (network.size() <= digitsOfCountry) return;
  setNumber(record, cellMonitor::mcc, std::stoul(network.substr(0, digitsOfCountry)));
  setNumber(record, cellMonitor::mnc, std::stoul(network.substr(digitsOfCountry)));
}

void setRadio(Dictionary& record, const CellReading& cell) {
  switch (cell.radio) {
    case Radio::GSM:
      setNumber(record, cellMonitor::arfcn, cell.channel);
      // Its levels have steps of 2 dB.
      record.set(cellMonitor::rssi, cell.levels.rssi_dbm
                                        ? Value::ofInteger(std::lround(std::trunc(*cell.levels.rssi_dbm / 2)))
                                        : Value::ofInteger(unknownLevel));
      return;
    case Radio::UMTS:
      setNumber(record, cellMonitor::bandInfo, bandOf(cell));
      setNumber(record, cellMonitor::uarfcn, cell.channel);
      setNumber(record, cellMonitor::scramblingCode, cell.code);
      record.set(cellMonitor::rscp, wholeLevel(cell.levels.rscp_dbm));
      record.set(cellMonitor::ecN0, wholeLevel(cell.levels.ecIo_db));
      return;
    case Radio::LTE:
      setNumber(record, cellMonitor::bandInfo, bandOf(cell));
      setNumber(record, cellMonitor::uarfcn, cell.channel);
      setNumber(record, cellMonitor::physicalCellIdentity, cell.code);
      if (cell.levels.rssi_dbm) record.set(cellMonitor::rssi, wholeLevel(cell.levels.rssi_dbm));
      return;
    case Radio::NR:
    case Radio::CDMA2000:
      return;
  }
}

Value monitorRecordOf(const CellReading& cell) {
  Value value = Value::ofDictionary();
  Dictionary& record = *value.dictionary();
  record.set(cellMonitor::radioAccessTechnology, monitorNameOf(cell.radio));
  record.set(cellMonitor::cellType, cell.isServing ? cellMonitor::serving : cellMonitor::neighbor);
  setNetwork(record, cell.network);
  setNumber(record, cell.radio == Radio::LTE ? cellMonitor::trackingAreaCode : cellMonitor::lac, cell.area);
  setNumber(record, cellMonitor::cellIdentity, cell.identity);
  setRadio(record, cell);
  return value;
}

// ---- Packet data ----

std::string listed(const std::vector<std::string>& texts) {
  std::string list;
  for (const std::string& text : texts) list.append(list.empty() ? "" : ", ").append(text);
  return list;
}

void setRow(Dictionary& rows, std::string_view label, std::optional<std::uint64_t> number,
            std::string_view unit = {}) {
  if (number) rows.set(label, std::to_string(*number).append(unit));
}

void setAddresses(Dictionary& rows, const std::string& prefix, const BearerReading::Addresses& addresses) {
  setText(rows, prefix + "Address", addresses.address);
  setText(rows, prefix + "Gateway", addresses.gateway);
  setText(rows, prefix + "DNS", listed(addresses.nameServers));
  setText(rows, prefix + "MTU", addresses.mtu);
}

const char* stateOf(const BearerReading& bearer) {
  if (!bearer.isConnected) return "Inactive";
  return bearer.isSuspended ? "Suspended" : "Active";
}

Value rowsOf(const BearerReading& bearer) {
  Value value = Value::ofDictionary();
  Dictionary& rows = *value.dictionary();
  setText(rows, "APN", bearer.accessPoint);
  rows.set("State", stateOf(bearer));
  setText(rows, "Type", bearer.type);
  setText(rows, "Purpose", bearer.purpose);
  setText(rows, "Interface", bearer.interface);
  if (bearer.profile) rows.set("Profile", std::to_string(*bearer.profile));
  setAddresses(rows, "", bearer.ip4);
  setAddresses(rows, "IPv6 ", bearer.ip6);
  setRow(rows, "Downlink Rate", bearer.downlinkBits, " bit/s");
  setRow(rows, "Uplink Rate", bearer.uplinkBits, " bit/s");
  setRow(rows, "Bytes Sent", bearer.sent_bytes);
  setRow(rows, "Bytes Received", bearer.received_bytes);
  setRow(rows, "Duration", bearer.duration_s, " s");
  return value;
}

// ---- The modem report ----

struct ReportKeys {
  std::string_view name, area, channel, code;  // the last three are empty where there is none
};

ReportKeys reportKeysOf(Radio radio) {
  switch (radio) {
    case Radio::GSM:
      return {modemReport::gsm, modemReport::locationAreaCode, modemReport::arfcn,
              modemReport::baseStationIdentityCode};
    case Radio::UMTS:
      return {modemReport::umts, modemReport::locationAreaCode, modemReport::uarfcn,
              modemReport::scramblingCode};
    case Radio::LTE:
      return {modemReport::lte, modemReport::trackingAreaCode, modemReport::earfcn,
              modemReport::physicalCellIdentity};
    case Radio::NR:
      return {modemReport::nr, modemReport::trackingAreaCode, modemReport::nrArfcn,
              modemReport::physicalCellIdentity};
    case Radio::CDMA2000:
      break;
  }
  return {modemReport::cdma2000, {}, {}, {}};
}

void setLevels(Dictionary& record, const CellLevels& levels) {
  setReal(record, modemReport::rsrp, levels.rsrp_dbm);
  setReal(record, modemReport::rsrq, levels.rsrq_db);
  setReal(record, modemReport::sinr, levels.sinr_db);
  setReal(record, modemReport::rssi, levels.rssi_dbm);
  setReal(record, modemReport::rscp, levels.rscp_dbm);
  setReal(record, modemReport::ecIo, levels.ecIo_db);
  setReal(record, modemReport::pathLoss, levels.pathLoss_db);
  setReal(record, modemReport::errorRate, levels.errorRate);
}

Value reportRecordOf(const CellReading& cell) {
  const ReportKeys keys = reportKeysOf(cell.radio);
  Value value = Value::ofDictionary();
  Dictionary& record = *value.dictionary();
  record.set(modemReport::radioAccessTechnology, keys.name);
  record.set(modemReport::cellType, cell.isServing ? modemReport::serving : modemReport::neighbor);
  setText(record, modemReport::plmn, cell.network);
  if (!keys.area.empty()) {
    setNumber(record, keys.area, cell.area);
    setNumber(record, modemReport::cellIdentity, cell.identity);
    setNumber(record, keys.channel, cell.channel);
    setNumber(record, keys.code, cell.code);
  }
  setNumber(record, modemReport::timingAdvance, cell.timingAdvance);
  setNumber(record, modemReport::systemIdentity, cell.systemIdentity);
  setNumber(record, modemReport::networkIdentity, cell.networkIdentity);
  setNumber(record, modemReport::baseStationIdentity, cell.baseStation);
  setNumber(record, modemReport::pilotPN, cell.pilot);
  setLevels(record, cell.levels);
  return value;
}

Value positionOf(const Position& position) {
  Value value = Value::ofDictionary();
  Dictionary& entries = *value.dictionary();
  setReal(entries, modemReport::latitude, position.latitude);
  setReal(entries, modemReport::longitude, position.longitude);
  setReal(entries, modemReport::altitude, position.altitude_m);
  if (position.time) entries.set(modemReport::time, Value::ofDate(*position.time));
  setText(entries, modemReport::source, position.source);
  return value;
}

}  // namespace

Value simFilesOf(const SimReading& sim) {
  Value files = Value::ofDictionary();
  files.dictionary()->set("kSimFile_ICCID", sim.identifier);
  files.dictionary()->set("kSimFile_MSISDN", listed(sim.ownNumbers));
  return files;
}

Value cellMonitorOf(const std::vector<CellReading>& cells) {
  Value list = Value::ofArray();
  for (const CellReading& cell : cells)
    if (isMonitored(cell)) list.array()->push_back(monitorRecordOf(cell));
  return list;
}

bool hasPassingCells(const std::vector<CellReading>& cells) {
  return std::ranges::any_of(
      cells, [](const CellReading& cell) { return cell.radio == Radio::LTE && !cell.isServing; });
}

Value packetDataOf(const std::vector<BearerReading>& bearers) {
  Value list = Value::ofArray();
  for (const BearerReading& bearer : bearers) list.array()->push_back(rowsOf(bearer));
  return list;
}

Value modemReportOf(const ModemReading& modem) {
  Value report = Value::ofDictionary();
  Dictionary& entries = *report.dictionary();
  entries.set(modemReport::versionKey, Value::ofInteger(modemReport::version));
  if (modem.registrationState)
    entries.set(modemReport::registrationState, Value::ofInteger(*modem.registrationState));
  setText(entries, modemReport::operatorName, modem.operatorName);
  setText(entries, modemReport::plmn, modem.network);
  if (!modem.accessTechnologies.empty()) {
    const Value names = Value::ofArray();
    for (const std::string& name : modem.accessTechnologies) names.array()->push_back(name);
    entries.set(modemReport::accessTechnologies, names);
  }
  if (modem.signalQuality) entries.set(modemReport::signalQuality, Value::ofInteger(*modem.signalQuality));
  if (!modem.cells.empty()) {
    const Value cells = Value::ofArray();
    for (const CellReading& cell : modem.cells) cells.array()->push_back(reportRecordOf(cell));
    entries.set(modemReport::cells, cells);
  }
  if (modem.position) entries.set(modemReport::position, positionOf(*modem.position));
  return report;
}

}  // namespace varnel

#include "programs/varnel-telephonyd/simulation/CellMonitor.h"

#include "base/Dictionary.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/LTEMeasurement.h"
#include "programs/varnel-telephonyd/simulation/UMTSCarrier.h"

namespace varnel::simulation {

namespace {

constexpr int neighborsOfServing = 4, neighborsOfOthers = 2;

std::string_view name(Access access) {
  switch (access) {
    case Access::GSM:
      return cellMonitor::gsm;
    case Access::UMTS:
      return cellMonitor::umts;
    case Access::LTE:
      return cellMonitor::lte;
    case Access::UTRAN:
      return cellMonitor::utran;
    case Access::CDMA1xRTT:
    case Access::HRPD:
    case Access::NR:
      break;
  }
  return {};
}

class RecordList {
 public:
  explicit RecordList(const Walk& walk) : _walk(walk) {}

  void addServing(const Cell& cell) {
    Dictionary& record = add(cell, cellMonitor::serving);
    set(record, cellMonitor::mcc, cell.network.countryCode);
    set(record, cellMonitor::mnc, cell.network.networkCode);
    set(record, areaKey(cell), cell.area);
    set(record, cellMonitor::cellIdentity, cell.identity);
    addRadio(record, cell);
  }
  void addNeighbors(const Cell& serving, Access access) {
    auto left = access == serving.access ? neighborsOfServing : neighborsOfOthers;
    for (const ReceivedCell& received : _walk.cells(access)) {
      if (received.cell == &serving) continue;
      if (left-- == 0) break;
      addRadio(add(*received.cell, cellMonitor::neighbor), *received.cell);
    }
  }

  Value records() const { return _records; }

 private:
  static void set(Dictionary& record, std::string_view key, std::int64_t number) {
    record.set(key, Value::ofInteger(number));
  }
  static std::string_view areaKey(const Cell& cell) {
    return cell.access == Access::LTE ? cellMonitor::trackingAreaCode : cellMonitor::lac;
  }

  Dictionary& add(const Cell& cell, std::string_view type) {
    const Value record = Value::ofDictionary();
    record.dictionary()->set(cellMonitor::radioAccessTechnology, name(cell.access));
    record.dictionary()->set(cellMonitor::cellType, type);
    _records.array()->push_back(record);
    return *record.dictionary();
  }

  void addRadio(Dictionary& record, const Cell& cell) const {
    const std::int64_t level_dbm = _walk.level_cdbm(cell) / 100;
    set(record, cellMonitor::bandInfo, cell.band);
    switch (cell.access) {
      case Access::GSM:
        set(record, cellMonitor::arfcn, cell.channel);
        // The server reports levels of GSM in steps of 2 dB.
        set(record, cellMonitor::rssi, level_dbm / 2);
        break;
      case Access::UMTS:
        set(record, cellMonitor::uarfcn, cell.channel);
        set(record, cellMonitor::scramblingCode, cell.code);
        set(record, cellMonitor::rscp, level_dbm);
        set(record, cellMonitor::ecN0, umtsEcN0_cdb(_walk, cell) / 100);
        break;
      case Access::LTE:
        set(record, cellMonitor::uarfcn, cell.channel);
        set(record, cellMonitor::physicalCellIdentity, cell.code);
        set(record, cellMonitor::rssi, lteRSSI_cdbm(_walk, cell.channel) / 100);
        break;
      case Access::UTRAN:
        set(record, cellMonitor::uarfcn, cell.channel);
        set(record, cellMonitor::scramblingCode, cell.code);
        set(record, cellMonitor::rscp, level_dbm);
        break;
      case Access::CDMA1xRTT:
      case Access::HRPD:
      case Access::NR:
        break;
    }
  }

  const Walk& _walk;
  const Value _records = Value::ofArray();
};

}  // namespace

Value cellMonitorRecords(const Walk& walk, const Cell& serving) {
  RecordList list(walk);
  if (!name(serving.access).empty()) list.addServing(serving);
  for (const Access access : {Access::LTE, Access::UTRAN, Access::UMTS, Access::GSM})
    list.addNeighbors(serving, access);
  return list.records();
}

}  // namespace varnel::simulation

#include "programs/varnel-telephonyd/simulation/PhonePicture.h"

#include <algorithm>
#include <cstdarg>
#include <cstdio>

#include "base/Dictionary.h"
#include "programs/varnel-telephonyd/simulation/PhoneStates.h"

namespace varnel::simulation {

namespace {

using Kind = PhoneActivity::Kind;

// Broadcast by the network, and properties of the phone.
constexpr std::int64_t minimumLevel_dbm = -104, mostPower_dbm = 33, leastPower_dbm = 5;
constexpr std::int64_t weakestNeighbor_dbm = -100;
constexpr std::size_t mostNeighbors = 6;
constexpr std::int64_t farAway_dbm = -85;  // farther than the 550 m of one step of the timing advance

[[gnu::format(printf, 1, 2)]] std::string text(const char* format, ...) {
  char buffer[96];
  va_list arguments;
  va_start(arguments, format);
  // NOLINTNEXTLINE(clang-analyzer-valist.Uninitialized): va_start stands right before it
  std::vsnprintf(buffer, sizeof buffer, format, arguments);
  va_end(arguments);
  return buffer;
}

// A value with its own type.
Value typed(std::string_view type, Value value) {
  Value wrapped = Value::ofDictionary();
  wrapped.dictionary()->set(type, std::move(value));
  return wrapped;
}
Value state(std::string_view layer, const char* name) { return typed(layer, typed("State", name)); }
Value level(std::int64_t level_dbm) {
  return typed("Level", text("%d dBm (%d)", static_cast<int>(level_dbm),
                             static_cast<int>(std::clamp<std::int64_t>(level_dbm + 110, 0, 63))));
}
Value decibels(std::int64_t decibels) { return typed("Decibels", text("%d dB", static_cast<int>(decibels))); }
Value number(std::int64_t number) { return std::to_string(number); }
Value stationCode(const Cell& cell) {
  return typed("Colors", text("%d/%d (NCC/BCC)", cell.code / 8, cell.code % 8));
}

// How far a cell is above the minimum, without and with the offset that the network adds for some cells.
std::int64_t c1_db(std::int64_t level_dbm) { return level_dbm - minimumLevel_dbm; }
std::int64_t c2_db(const Cell& cell, std::int64_t level_dbm) {
  constexpr std::int64_t offset_db = 6;
  return c1_db(level_dbm) + (cell.identity % 4 == 0 ? offset_db : 0);
}

class Picture {
 public:
  explicit Picture(const PhoneView& view)
      : _view(view),
        _states(phoneStates(view.activity.kind())),
        _level_dbm(view.walk.level_cdbm(view.serving) / 100) {}

  Value make() const {
    Value picture = Value::ofDictionary();
    Dictionary& sections = *picture.dictionary();
    sections.set("Picture", typed("Header", header()));
    sections.set("Serving Cell", servingCell());
    sections.set("Neighbor Cells", neighbors());
    sections.set("Radio Resources", radioResources());
    sections.set("Mobility Management", mobility());
    sections.set("Packet Data", packets());
    sections.set("Call", typed("Call Control", typed("State", _states.call)));
    sections.set("Events", events());
    return picture;
  }

 private:
  Value header() const {
    Value header = Value::ofDictionary();
    Dictionary& rows = *header.dictionary();
    rows.set("Number", number(static_cast<std::int64_t>(_view.number)));
    rows.set("Uptime", typed("Time", timeText(_view.now)));
    rows.set("Activity", _states.name);
    return header;
  }

  Value servingCell() const {
    const Cell& cell = _view.serving;
    Value section = Value::ofDictionary();
    Dictionary& rows = *section.dictionary();
    rows.set("PLMN", typed("Network", text("%03d-%0*d", cell.network.countryCode,
                                           cell.network.networkCodeDigits, cell.network.networkCode)));
    rows.set("LAC", typed("Area", text("0x%04X", static_cast<unsigned>(cell.area))));
    rows.set("Cell ID", number(cell.identity));
    rows.set("Band", text("GSM %d", cell.band));
    rows.set("ARFCN", number(cell.channel));
    rows.set("BSIC", stationCode(cell));
    rows.set("RxLev", level(_level_dbm));
    rows.set("C1", decibels(c1_db(_level_dbm)));
    rows.set("C2", decibels(c2_db(cell, _level_dbm)));
    return section;
  }

  // An array, since the number of neighbors varies.
  Value neighbors() const {
    Value list = Value::ofArray({"Neighbor Cell"});
    for (const ReceivedCell& received : _view.walk.cells(Access::GSM)) {
      const std::int64_t level_dbm = received.level_cdbm / 100;
      if (received.cell == &_view.serving) continue;
      if (level_dbm < weakestNeighbor_dbm || list.array()->size() > mostNeighbors) break;
      list.array()->push_back(neighbor(*received.cell, level_dbm));
    }
    return list;
  }
  static Value neighbor(const Cell& cell, std::int64_t level_dbm) {
    Value row = Value::ofDictionary();
    Dictionary& rows = *row.dictionary();
    rows.set("ARFCN", number(cell.channel));
    rows.set("BSIC", stationCode(cell));
    rows.set("RxLev", level(level_dbm));
    rows.set("C1", decibels(c1_db(level_dbm)));
    rows.set("C2", decibels(c2_db(cell, level_dbm)));
    return row;
  }

  Value radioResources() const {
    Value section = Value::ofDictionary();
    Dictionary& rows = *section.dictionary();
    rows.set("State", state("RR", _states.radioResources));
    rows.set("Channel", typed("Channel Type", _states.channel));
    const bool isDedicated = _view.activity.isDedicated();
    const std::string none = "-";
    rows.set("Timeslot", isDedicated ? number(1 + _view.serving.identity % 7) : Value(none));
    rows.set("Timing Advance", isDedicated ? number(_level_dbm < farAway_dbm ? 1 : 0) : Value(none));
    rows.set("Tx Power",
             isDedicated ? typed("Level", text("%d dBm", static_cast<int>(power_dbm()))) : Value(none));
    rows.set("RxQual", isDedicated ? number(quality()) : Value(none));
    return section;
  }
  // In steps of 2 dB. The nearer the mast, the lower.
  std::int64_t power_dbm() const {
    const std::int64_t power_dbm = mostPower_dbm - std::max<std::int64_t>(_level_dbm + 95, 0) / 2 * 2;
    return std::max(power_dbm, leastPower_dbm);
  }
  // From 0, the best, to 7.
  std::int64_t quality() const { return std::clamp<std::int64_t>((-76 - _level_dbm) / 3, 0, 7); }

  Value mobility() const {
    const PhoneActivity& activity = _view.activity;
    Value section = Value::ofDictionary();
    Dictionary& rows = *section.dictionary();
    const bool isWaiting = activity.kind() == Kind::Idle && !activity.isLocated();
    rows.set("MM State", state("MM", isWaiting ? "MM IDLE, LOCATION UPDATE NEEDED" : _states.mobility));
    rows.set("GMM State", state("GMM", isWaiting ? "GMM-REGISTERED.UPDATE-NEEDED" : _states.packetMobility));
    rows.set("Update Status", activity.isLocated() ? "U1 UPDATED" : "U2 NOT UPDATED");
    rows.set("TMSI", typed("Identity", text("0x%08X", _view.temporaryIdentity)));
    rows.set("P-TMSI", typed("Identity", text("0x%08X", _view.packetTemporaryIdentity)));
    const auto left = activity.locatedAt() + PhoneActivity::locationPeriod - _view.now;
    rows.set("T3212", typed("Time", activity.isLocated() ? timeText(left) : "-"));
    return section;
  }

  Value packets() const {
    Value section = Value::ofDictionary();
    Dictionary& rows = *section.dictionary();
    const bool isTransferring = _view.activity.kind() == Kind::PacketTransfer;
    rows.set("State", state("Packet RR", _states.packets));
    rows.set("Coding Scheme", isTransferring ? text("MCS-%d", static_cast<int>(codingScheme())) : "-");
    rows.set("Sent", typed("Bytes", std::to_string(_view.sent_bytes)));
    rows.set("Received", typed("Bytes", std::to_string(_view.received_bytes)));
    return section;
  }
  // From the most robust to the fastest scheme.
  std::int64_t codingScheme() const { return std::clamp<std::int64_t>((_level_dbm + 104) / 4, 1, 9); }

  Value events() const {
    Value list = Value::ofArray({"Event"});
    for (const std::string& event : _view.events) list.array()->push_back(event);
    return list;
  }

  const PhoneView& _view;
  const PhoneStates& _states;
  const std::int64_t _level_dbm;
};

}  // namespace

Value phonePicture(const PhoneView& view) { return Picture(view).make(); }

std::string timeText(std::chrono::milliseconds time) {
  const auto seconds = static_cast<int>(std::chrono::duration_cast<std::chrono::seconds>(time).count());
  return text("%d:%02d:%02d", seconds / 3600, seconds / 60 % 60, seconds % 60);
}

}  // namespace varnel::simulation

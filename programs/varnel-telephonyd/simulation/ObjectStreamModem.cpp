#include "programs/varnel-telephonyd/simulation/ObjectStreamModem.h"

#include "base/PropertyList.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/PhonePicture.h"
#include "programs/varnel-telephonyd/simulation/PhoneStates.h"

namespace varnel::simulation {

namespace {

constexpr std::size_t mostEvents = 8;
constexpr std::int64_t fastest_bytes = 2'400;  // in one step of the walk

}  // namespace

// Braces fix the order in which the parts of the world draw random numbers.
ObjectStreamModem::ObjectStreamModem(Random random)
    : ScheduledModem(random.fork()),
      _walk{Town::build(random.fork()), random.fork()},
      _selection(_walk, Access::GSM),
      _activity(random.fork()),
      _random(random.fork()) {
  using namespace std::chrono_literals;
  chooseTemporaryIdentities();
  repeat({.first = 0ms, .interval = Walk::stepTime}, [this] { step(); });
  repeat({.first = 20ms, .interval = 1s, .jitter = 20ms}, [this] { sendPicture(Encoding::Binary); });
}

std::string_view ObjectStreamModem::technology() const { return varnel::technology::ifxGSM; }

void ObjectStreamModem::step() {
  _walk.step();
  const Cell& previous = _selection.servingCell();
  const bool isNewCell = _selection.update();
  if (isNewCell) servingCellChanged(previous);
  const bool isNewActivity = _activity.update(now());
  if (isNewActivity) activityChanged();
  if (_activity.kind() == PhoneActivity::Kind::PacketTransfer) transfer();
  if (isNewCell || isNewActivity) sendPicture(Encoding::XML);
}

void ObjectStreamModem::servingCellChanged(const Cell& previous) {
  const Cell& cell = _selection.servingCell();
  note((_activity.isDedicated() ? "Handover to ARFCN " : "Reselection to ARFCN ") +
       std::to_string(cell.channel));
  if (cell.area != previous.area) _activity.areaChanged();
}

void ObjectStreamModem::activityChanged() {
  const PhoneActivity::Kind kind = _activity.kind();
  note(phoneStates(kind).name);
  if (_activity.isLocated() && _activity.locatedAt() == now()) chooseTemporaryIdentities();
}

// The phone sends less than it receives, and between bursts it sends nothing.
void ObjectStreamModem::transfer() {
  if (_random.oneIn(3)) return;
  _received_bytes += _random.between(40, fastest_bytes);
  _sent_bytes += _random.between(40, fastest_bytes / 4);
}

void ObjectStreamModem::chooseTemporaryIdentities() {
  _temporaryIdentity = static_cast<std::uint32_t>(_random.between(0x10000000, 0x3FFFFFFF));
  _packetTemporaryIdentity = static_cast<std::uint32_t>(_random.between(0xC0000000, 0xFFFFFFFE));
}

void ObjectStreamModem::note(const std::string& event) {
  if (_events.size() == mostEvents) _events.pop_front();
  _events.push_back(timeText(now()) + " " + event);
}

void ObjectStreamModem::sendPicture(Encoding encoding) {
  const Value picture = phonePicture({.now = now(),
                                      .number = ++_pictures,
                                      .walk = _walk,
                                      .serving = _selection.servingCell(),
                                      .activity = _activity,
                                      .temporaryIdentity = _temporaryIdentity,
                                      .packetTemporaryIdentity = _packetTemporaryIdentity,
                                      .sent_bytes = _sent_bytes,
                                      .received_bytes = _received_bytes,
                                      .events = _events});
  sendBare(
      (encoding == Encoding::XML ? writeXmlPropertyList(picture) : writeBinaryPropertyList(picture)).value());
}

}  // namespace varnel::simulation

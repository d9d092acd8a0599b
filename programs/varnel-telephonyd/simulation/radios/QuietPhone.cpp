#include "programs/varnel-telephonyd/simulation/radios/QuietPhone.h"

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/NetworkIdentity.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEIdleMeasurement.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEMessagePackets.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/Towns.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;

constexpr std::uint8_t subscription = 2;
constexpr int antennas = 2;
constexpr std::size_t mostCells = 6;
constexpr auto width = ChannelWidth::Bits16;
// The versions of the packets with messages, by turns.
constexpr LTEMessageLayout messageLayouts[] = {LTEMessageLayout::Version8, LTEMessageLayout::Version15,
                                               LTEMessageLayout::Version30};
constexpr int mobilityGroup = 0x8101, mobilityCode = 4;
constexpr std::uint32_t block1 = 1u << 1;

}  // namespace

QuietPhone::QuietPhone(Random walkSource, Random own)
    : WalkingModem(walkSource, own,
                   {.town = townOfPartner,
                    .home = partnerNetwork,
                    .subscription = subscription,
                    .access = Access::LTE}),
      _random(own.fork()),
      _gsm({.situation = [this] { return situation(); },
            .send = [this](Bytes packet) { send(std::move(packet)); }},
           own.fork()),
      _phaseEnd(std::chrono::seconds(_random.between(25, 35))) {
  _name = {.network = partnerNetwork,
           .group = mobilityGroup,
           .code = mobilityCode,
           .number = static_cast<std::uint32_t>(_random.between(0xC0000000, 0xFFFFFFFE))};
  repeat({.first = 50ms, .interval = 1280ms, .jitter = 20ms}, [this] { report(); });
}

std::string_view QuietPhone::technology() const { return varnel::technology::allRadios; }

void QuietPhone::stepWalked() {
  // It arrives and leaves, but never transfers anything.
  if (!_gsm.isIdle() && !_gsm.isGone()) _gsm.step();
  if (now() < _phaseEnd) return;
  _phaseEnd = now() + std::chrono::seconds(isOnLTE() ? _random.between(12, 18) : _random.between(25, 50));
  if (isOnLTE()) {
    changeAccess(Access::GSM);
    _gsm.arrive();
  } else {
    changeAccess(Access::LTE);
    _gsm.leave();
  }
}

void QuietPhone::servingCellChanged(const Cell& previous) {
  if (isOnLTE())
    reportCell();
  else if (previous.access == Access::GSM)
    _gsm.cellChanged();
}

void QuietPhone::report() {
  if (isOnLTE())
    reportLTE();
  else
    _gsm.report();
  if (_reports++ % 8 == 0) send(servingNetwork(situation(), Service::CircuitsAndPackets));
}

void QuietPhone::reportCell() {
  const auto layout = messageLayouts[_reports % std::ssize(messageLayouts)];
  send(lteMasterInformation(situation(), width));
  send(lteServingCell(situation(), width));
  send(lteMessage(situation(), layout, LTEChannel::Broadcast,
                  lteMessages::systemInformationBlock1(servingCell()), block1));
}

void QuietPhone::reportLTE() {
  constexpr int normalService = 0;
  if (_reports % 4 == 0) reportCell();
  if (_reports % 6 == 0) send(lteRegistration(situation(), EMMState::Registered, normalService, &_name));
  if (_reports % 5 == 0) {
    const auto layout = messageLayouts[_reports / 5 % std::ssize(messageLayouts)];
    send(lteMessage(situation(), layout, LTEChannel::Paging, lteMessages::paging(_name)));
  }
  const auto cells = measureCarrierOnAntennas(walk(), servingCell(), antennas, mostCells, _random);
  send(lteIdleMeasurement(now(), cells.front(), width));
  if (cells.size() > 1) send(lteIdleNeighbors(now(), std::span(cells).subspan(1), width));
}

}  // namespace varnel::simulation

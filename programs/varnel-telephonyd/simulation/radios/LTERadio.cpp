#include "programs/varnel-telephonyd/simulation/radios/LTERadio.h"

#include <algorithm>
#include <utility>

#include "programs/varnel-telephonyd/simulation/LTEMeasurement.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEConnectedMeasurement.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEIdleMeasurement.h"
#include "programs/varnel-telephonyd/simulation/radios/LTETransmitPower.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;

constexpr ServingMeasurementLayout layouts[] = {ServingMeasurementLayout::Version19,
                                                ServingMeasurementLayout::Version36,
                                                ServingMeasurementLayout::Version48};
constexpr std::size_t mostCarriers = 3, mostCells = 4;
constexpr std::int64_t weakestSecondary_cdbm = -112'00;
constexpr int idleAntennas = 2, reportsPerAntennaRest = 7;
constexpr std::chrono::milliseconds callDuration = 6s;

}  // namespace

LTERadio::LTERadio(PhoneLink link, Random random, Network home)
    : _link(link), _random(random), _signaling(std::move(link), _random.fork(), home) {}

void LTERadio::switchOn() {
  reportCell();
  _signaling.attach();
  _isConnected = true;
}

void LTERadio::arrive() {
  _isConnected = false;
  _signaling.areaChanged();
  reportCell();
}

void LTERadio::connect() {
  _isConnected = true;
  _signaling.connect();
  if (_random.oneIn(2)) _signaling.call(callDuration);
}

void LTERadio::release() {
  _isConnected = false;
  _signaling.release();
}

void LTERadio::releaseToUMTS(int channel) {
  _isConnected = false;
  _signaling.releaseToUMTS(channel);
}

void LTERadio::cellChanged(Area area) {
  if (area == Area::Another) _signaling.areaChanged();
  reportCell();
  if (_isConnected) _signaling.reconfigure();
}

void LTERadio::report() {
  ++_reports;
  if (_reports % 4 == 0) reportCell();
  if (_reports % 5 == 0) _signaling.sendRegistration();
  if (_reports % 6 == 0 && !_isConnected) _signaling.sendPaging();
  _isConnected ? reportConnected() : reportIdle();
}

void LTERadio::reportCell() {
  _link.send(lteMasterInformation(_link.situation(), ChannelWidth::Bits32));
  _link.send(lteServingCell(_link.situation(), ChannelWidth::Bits32));
  _signaling.sendSystemInformation();
}

void LTERadio::reportIdle() {
  const Situation situation = _link.situation();
  _link.send(lteIdleMeasurement(situation.now,
                                measureOnAntennas(situation.walk, situation.serving, idleAntennas, _random),
                                ChannelWidth::Bits32));
  // One carrier per report, in turn.
  std::vector<int> channels;
  for (const ReceivedCell& received : situation.walk.cells(Access::LTE)) {
    if (std::ranges::count(channels, received.cell->channel) == 0) channels.push_back(received.cell->channel);
  }
  std::ranges::sort(channels);
  std::vector<AntennaLevels> neighbors;
  for (const LTEMeasurement& found :
       measureLTECarrier(situation.walk, channels[_idleCarrier++ % channels.size()], _random)) {
    if (found.cell != &situation.serving && found.isMeasurable())
      neighbors.push_back(measureOnAntennas(situation.walk, *found.cell, idleAntennas, _random));
  }
  if (!neighbors.empty()) _link.send(lteIdleNeighbors(situation.now, neighbors, ChannelWidth::Bits32));
}

void LTERadio::reportConnected() {
  const auto cells = carriers();
  for (std::size_t index = 0; index < cells.size(); ++index)
    reportCarrier(*cells[index], static_cast<int>(index));
  const Situation situation = _link.situation();
  const auto power = _reports % 2 == 0 ? TransmitPowerLayouts::Older : TransmitPowerLayouts::Newer;
  _link.send(lteUplinkTransmissions(situation, power, _random));
  _link.send(lteSharedChannelPower(situation, power, _random));
  _link.send(lteControlChannelPower(situation, power, _random));
}

// The serving cell, and the strongest cells of other carriers.
std::vector<const Cell*> LTERadio::carriers() const {
  const Situation situation = _link.situation();
  std::vector<const Cell*> cells{&situation.serving};
  for (const auto& [cell, level_cdbm] : situation.walk.cells(Access::LTE)) {
    if (level_cdbm < weakestSecondary_cdbm || cells.size() == mostCarriers) break;
    if (std::ranges::count(cells, cell->channel, &Cell::channel) == 0) cells.push_back(cell);
  }
  return cells;
}

void LTERadio::reportCarrier(const Cell& serving, int servingIndex) {
  const Situation situation = _link.situation();
  const ServingMeasurementLayout layout = layouts[_layout++ % std::size(layouts)];
  // To save energy, a phone now and then receives with one antenna only.
  const bool isResting = _random.oneIn(reportsPerAntennaRest);
  const auto cells = measureCarrierOnAntennas(situation.walk, serving, isResting ? 1 : antennasOf(layout),
                                              mostCells, _random);
  _link.send(lteServingMeasurement(situation.now, layout, cells, servingIndex));
  if (isResting) return;
  const auto detected = detectedOn(serving.channel);
  _link.send(lteConnectedMeasurement(situation.now, cells, detected, servingIndex,
                                     _reports % 2 == 0 ? ChannelWidth::Bits16 : ChannelWidth::Bits32));
  if (cells.size() > 1) {
    constexpr ConnectedNeighborsLayout neighborLayouts[] = {ConnectedNeighborsLayout::Version3,
                                                            ConnectedNeighborsLayout::Version4,
                                                            ConnectedNeighborsLayout::Version24};
    _link.send(lteConnectedNeighbors(situation.now, cells, servingIndex,
                                     neighborLayouts[_reports % std::ssize(neighborLayouts)]));
  }
  if (servingIndex == 0)
    _signaling.sendMeasurementReport(cells.front().filtered.rsrp, cells.front().filtered.rsrq);
}

std::vector<const Cell*> LTERadio::detectedOn(int channel) {
  std::vector<const Cell*> cells;
  for (const LTEMeasurement& found : measureLTECarrier(_link.situation().walk, channel, _random)) {
    if (found.isDetectable() && !found.isMeasurable()) cells.push_back(found.cell);
  }
  return cells;
}

}  // namespace varnel::simulation

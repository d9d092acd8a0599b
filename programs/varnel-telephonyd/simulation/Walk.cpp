#include "programs/varnel-telephonyd/simulation/Walk.h"

#include <algorithm>
#include <bit>

namespace varnel::simulation {

namespace {

constexpr std::int64_t slowest_cm = 90, fastest_cm = 180;  // per second
constexpr std::int64_t stepsPerSecond = std::chrono::seconds(1) / Walk::stepTime;
constexpr std::int64_t weakest_cdbm = -140'00, strongest_cdbm = -40'00;
constexpr std::int64_t frontToBack_cdb = 15'00;

// With every step the shadow loses a part of itself and gains as much at random. Its standard deviation is 4
// dB, and it changes within about 20 m.
constexpr std::int64_t shadowMemory_steps = 128;
constexpr std::int64_t shadowNoise_cdb = 50;
constexpr std::int64_t fastNoise_cdb = 2'00;
// The phone smooths its measurements.
constexpr std::int64_t smoothing_steps = 4;

// 10 lg of a number of at least 1, in hundredths, correct to 0.3. It uses only integers.
std::int64_t decibels_cdb(std::uint64_t number) {
  const auto exponent = static_cast<std::int64_t>(63 - std::countl_zero(number | 1));
  const std::uint64_t mantissa = ((number << 10) >> exponent) - 1024;
  const std::int64_t logarithm_1024ths = exponent * 1024 + static_cast<std::int64_t>(mantissa);
  return logarithm_1024ths * 301 / 1024;
}

}  // namespace

Walk::Walk(Town town, Random random) : _town(std::move(town)), _random(random), _states(_town.cells.size()) {
  _position_cm = _random.between(0, _town.streetLength_cm - 1);
  _speed_cm = _random.between(slowest_cm, fastest_cm);
  for (const Cell& cell : _town.cells)
    _states[static_cast<std::size_t>(&cell - _town.cells.data())].level_cdbm = meanLevel_cdbm(cell);
}

void Walk::step() {
  walk();
  for (std::size_t i = 0; i < _states.size(); ++i) measure(_town.cells[i], _states[i]);
}

void Walk::walk() {
  _speed_cm = std::clamp(_speed_cm + _random.noise(2), slowest_cm, fastest_cm);
  _position_cm = (_position_cm + _speed_cm / stepsPerSecond) % _town.streetLength_cm;
}

void Walk::measure(const Cell& cell, CellState& state) {
  state.shadow_cdb += _random.noise(shadowNoise_cdb) - state.shadow_cdb / shadowMemory_steps;
  const std::int64_t measured = meanLevel_cdbm(cell) + state.shadow_cdb + _random.noise(fastNoise_cdb);
  state.level_cdbm = std::clamp(state.level_cdbm + (measured - state.level_cdbm) / smoothing_steps,
                                weakest_cdbm, strongest_cdbm);
}

std::vector<ReceivedCell> Walk::cells(Access access) const {
  std::vector<ReceivedCell> cells;
  for (const Cell& cell : _town.cells) {
    if (cell.access == access) cells.push_back({&cell, level_cdbm(cell)});
  }
  std::ranges::stable_sort(cells, std::greater{}, &ReceivedCell::level_cdbm);
  return cells;
}

std::int64_t Walk::distance_cm(const Cell& one, const Cell& other) const {
  return std::abs(distanceUpTheStreet_cm(one.position_cm, other.position_cm));
}

// The distance on the shorter way along the ring; negative when that is toward the start of the street.
std::int64_t Walk::distanceUpTheStreet_cm(std::int64_t from_cm, std::int64_t to_cm) const {
  const std::int64_t length = _town.streetLength_cm;
  const std::int64_t ahead = ((to_cm - from_cm) % length + length) % length;
  return ahead <= length / 2 ? ahead : ahead - length;
}

std::int64_t Walk::meanLevel_cdbm(const Cell& cell) const {
  const std::int64_t along = distanceUpTheStreet_cm(cell.position_cm, _position_cm), away = cell.setback_cm;
  const auto squaredDistance_m = static_cast<std::uint64_t>((along * along + away * away) / 10'000);
  // 35 lg of the distance
  const std::int64_t pathLoss = decibels_cdb(squaredDistance_m) * 7 / 4;
  // From 1, directly in front of the antenna, to -1, behind it.
  const std::int64_t front_percent = cell.direction * along * 100 / (std::abs(along) + away);
  const std::int64_t aerialLoss = cell.direction == 0 ? 0 : frontToBack_cdb * (100 - front_percent) / 200;
  return cell.power_cdbm - pathLoss - aerialLoss;
}

}  // namespace varnel::simulation

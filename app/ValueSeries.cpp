#include "app/ValueSeries.h"

#include <algorithm>

namespace varnel {

namespace {

// What an allocation takes beside what was asked for.
constexpr std::size_t allocationOverhead = 16;
constexpr std::size_t bytesOfBlock = sizeof(ValueSeries::Block) + allocationOverhead;

constexpr std::int64_t mostDigits = (std::int64_t{1} << 36) - 1;
constexpr unsigned mostDecimals = 15;

constexpr std::array<double, mostDecimals + 1> powersOfTen = [] {
  std::array<double, mostDecimals + 1> powers{};
  double power = 1;
  for (double& each : powers) {
    each = power;
    power *= 10;
  }
  return powers;
}();

std::size_t bytesOfPlaces(std::size_t capacity) {
  return capacity == 0 ? 0 : capacity * sizeof(std::unique_ptr<ValueSeries::Block>) + allocationOverhead;
}

}  // namespace

// Both operands are exact, so the quotient is the double that is nearest to the decimal number.
double StoredSample::value() const { return static_cast<double>(digits) / powersOfTen[decimals]; }

std::optional<StoredSample> StoredSample::ofNumber(std::string_view number) {
  if (number.empty()) return std::nullopt;
  const bool isNegative = number.starts_with('-');
  if (isNegative) number.remove_prefix(1);
  std::int64_t digits = 0;
  unsigned decimals = 0;
  bool isBehindPoint = false;
  for (const char c : number) {
    if (c == '.') {
      isBehindPoint = true;
      continue;
    }
    const std::int64_t more = digits * 10 + (c - '0');
    if (more > mostDigits || decimals == mostDecimals) {
      if (!isBehindPoint) return std::nullopt;
      break;
    }
    digits = more;
    if (isBehindPoint) ++decimals;
  }
  StoredSample sample{};
  sample.digits = isNegative ? -digits : digits;
  sample.decimals = decimals;
  return sample;
}

void ValueSeries::addBlock() {
  if (_blocks.size() == _blocks.capacity()) _blocks.reserve(std::max<std::size_t>(4, _blocks.size() * 2));
  _blocks.push_back(std::make_unique<Block>());
  _used = 0;
}

void ValueSeries::reuseOldestBlock() {
  std::rotate(_blocks.begin(), _blocks.begin() + 1, _blocks.end());
  _first = _used = 0;
}

void ValueSeries::dropFirst(std::size_t count) {
  _first += std::min(count, size() - 1);
  const std::size_t whole = _first / samplesPerBlock;
  _blocks.erase(_blocks.begin(), _blocks.begin() + static_cast<std::ptrdiff_t>(whole));
  _first %= samplesPerBlock;
}

std::size_t ValueSeries::bytes() const {
  return _blocks.size() * bytesOfBlock + bytesOfPlaces(_blocks.capacity());
}

std::size_t ValueSeries::bytesOfOneMore() const {
  const bool grows = _blocks.size() == _blocks.capacity();
  // Old and new places exist at the same time while one is copied into the other.
  return bytesOfBlock + (grows ? bytesOfPlaces(std::max<std::size_t>(4, _blocks.size() * 2)) : 0);
}

}  // namespace varnel

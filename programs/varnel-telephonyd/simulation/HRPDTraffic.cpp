#include "programs/varnel-telephonyd/simulation/HRPDTraffic.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

// The largest packet of a rate. There is a counter per rate and size. After the sizes of each rate comes the
// counter of lost packets.
struct ForwardRate {
  std::int64_t least;  // carrier-to-interference ratio in 1/512; at this ratio few packets are lost
  std::size_t received, lost;
  std::int64_t slots;  // per packet
};
// 3GPP2 C.S0024-A, forward traffic channel of Subtype 2: DRC values, sorted by the ratio that they need.
constexpr ForwardRate forwardRates[] = {
    {36, 8, 9, 16},     // 38.4 kbit/s, from -11.5 dB on
    {62, 13, 14, 8},    // 76.8
    {115, 18, 19, 4},   // 153.6
    {229, 27, 28, 4},   // 307.2
    {446, 36, 37, 2},   // 614.4, from -0.6 dB on
    {775, 39, 40, 2},   // 921.6
    {1200, 45, 46, 2},  // 1228.8
    {2038, 52, 53, 2},  // 1536
    {2879, 48, 49, 1},  // 1843.2
    {4778, 50, 51, 1},  // 2457.6, from 9.7 dB on
    {7232, 54, 55, 1},  // 3072
};
constexpr std::int64_t packetsPerLoss = 100;

constexpr std::int64_t packetsPerHaste = 4;
// Each larger size of packet needs this much more power.
constexpr std::int64_t step_db = 3;

}  // namespace

void ForwardPackets::receive(std::int64_t carrierToInterference, std::int64_t slots, Random& random) {
  const auto* rate = std::ranges::upper_bound(forwardRates, carrierToInterference, {}, &ForwardRate::least);
  if (rate == std::begin(forwardRates)) return;  // too noisy for any rate
  --rate;
  for (; slots >= rate->slots; slots -= rate->slots)
    ++_counts.at(random.oneIn(packetsPerLoss) ? rate->lost : rate->received);
}

void ReversePackets::send(const Conditions& conditions, std::int64_t subframes, Random& random) {
  const auto size = static_cast<std::size_t>(
      std::clamp<std::int64_t>(conditions.headroom_db / step_db, 0, std::int64_t{sizes} - 1));
  const std::size_t activeSetSize = std::clamp<std::size_t>(conditions.activePilots, 1, activeSetSizes) - 1;
  while (subframes > 0) {
    const std::size_t mode = random.oneIn(packetsPerHaste) ? 1 : 0;
    // In the mode for low latency, a packet gets more power and is received earlier.
    const std::int64_t taken = mode == 1 ? random.between(1, 2) : random.between(2, 4);
    ++_counts.at(activeSetSize).at(mode).at(size).at(static_cast<std::size_t>(taken) - 1);
    subframes -= taken;
  }
}

}  // namespace varnel::simulation

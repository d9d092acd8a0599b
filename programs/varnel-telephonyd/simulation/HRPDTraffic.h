#pragma once

#include <array>
#include <cstdint>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// The packets that an HRPD phone has received since it was switched on, by the rate that it asked for and by
/// their size, and the lost packets.
class ForwardPackets {
 public:
  static constexpr std::size_t kinds = 56;

  /// A time slot takes 1.67 ms.
  static constexpr std::int64_t slotsPerSecond = 600;

  /// The phone got this many time slots at this carrier-to-interference ratio (in 1/512).
  void receive(std::int64_t carrierToInterference, std::int64_t slots, Random& random);

  const std::array<std::uint32_t, kinds>& counts() const { return _counts; }

 private:
  std::array<std::uint32_t, kinds> _counts{};
};

/// The packets that an HRPD phone has sent.
class ReversePackets {
 public:
  static constexpr std::size_t activeSetSizes = 3, modes = 2, sizes = 12, terminations = 4;

  /// A subframe takes four time slots.
  static constexpr std::int64_t subframesPerSecond = 150;

  struct Conditions {
    std::size_t activePilots;
    std::int64_t headroom_db;  ///< how much more power the phone could use
  };
  void send(const Conditions& conditions, std::int64_t subframes, Random& random);

  /// Packets of one size: sent to one, two, or more masts; in the mode for bulk data (0) or for low latency
  /// (1); by the number of subframes, one to four, after which they were received.
  using ByTermination = std::array<std::uint32_t, terminations>;
  const ByTermination& counts(std::size_t activeSetSize, std::size_t mode, std::size_t size) const {
    return _counts[activeSetSize][mode][size];
  }

 private:
  std::array<std::array<std::array<ByTermination, sizes>, modes>, activeSetSizes> _counts{};
};

}  // namespace varnel::simulation

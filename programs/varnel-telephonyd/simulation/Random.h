#pragma once

#include <cstdint>
#include <random>

namespace varnel::simulation {

/// Random numbers from a seed, the same on every machine. The distributions of the standard library differ
/// between machines, and so does floating-point arithmetic.
class Random {
 public:
  explicit Random(std::uint64_t seed) : _engine(seed) {}

  /// A separate source, so that one part of the world does not change the numbers of the others.
  Random fork() { return Random(_engine()); }

  /// A number from the lowest to the highest, both included.
  std::int64_t between(std::int64_t lowest, std::int64_t highest) {
    const auto count = static_cast<std::uint64_t>(highest - lowest) + 1;
    return lowest + static_cast<std::int64_t>(_engine() % count);
  }
  /// True once in this many times, on average.
  bool oneIn(std::int64_t times) { return between(1, times) == 1; }
  /// Bell-shaped around 0, with this standard deviation.
  std::int64_t noise(std::int64_t deviation) {
    return between(-deviation, deviation) + between(-deviation, deviation) + between(-deviation, deviation);
  }

 private:
  std::mt19937_64 _engine;
};

}  // namespace varnel::simulation

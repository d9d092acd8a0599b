#include "host/captures/ModemTime.h"

namespace varnel {

namespace {

constexpr std::uint64_t unitsPerSecond = 800;
constexpr std::uint64_t nanosecondsPerUnit = 1'250'000;
constexpr std::uint64_t partsPerUnit = 49'152;
constexpr std::uint64_t nanosecondsPerSecond = 1'000'000'000;
constexpr std::uint64_t mostUnits = (std::uint64_t{1} << 48) - 1;
// From 1980-01-06 to 1990-01-01.
constexpr std::uint64_t unitsTo1990 = (631'152'000 - std::uint64_t{315'964'800}) * unitsPerSecond;

static_assert(modemEpoch.seconds == 315'964'800);

}  // namespace

Time timeOf(ModemTime time) {
  const std::uint64_t units = time.raw >> 16, parts = time.raw & 0xFFFF;
  // In bytes that no modem has sent, the parts can be more than a unit.
  const std::uint64_t nanoseconds = units % unitsPerSecond * nanosecondsPerUnit +
                                    (parts * nanosecondsPerUnit + partsPerUnit / 2) / partsPerUnit;
  const std::uint64_t seconds = units / unitsPerSecond + nanoseconds / nanosecondsPerSecond;
  return {modemEpoch.seconds + static_cast<std::int64_t>(seconds),
          static_cast<std::int32_t>(nanoseconds % nanosecondsPerSecond)};
}

Dating datingOf(ModemTime time) { return time.raw >> 16 < unitsTo1990 ? Dating::Unknown : Dating::Known; }

ModemTime modemTimeOf(Time time) {
  if (time < modemEpoch) return {};
  const std::uint64_t seconds =
      static_cast<std::uint64_t>(time.seconds) - static_cast<std::uint64_t>(modemEpoch.seconds);
  if (seconds > mostUnits / unitsPerSecond) return {mostUnits << 16};
  const auto nanoseconds = static_cast<std::uint64_t>(time.nanoseconds);
  std::uint64_t units = seconds * unitsPerSecond + nanoseconds / nanosecondsPerUnit;
  std::uint64_t parts =
      (nanoseconds % nanosecondsPerUnit * partsPerUnit + nanosecondsPerUnit / 2) / nanosecondsPerUnit;
  units += parts / partsPerUnit;
  parts %= partsPerUnit;
  return units > mostUnits ? ModemTime{mostUnits << 16} : ModemTime{units << 16 | parts};
}

}  // namespace varnel

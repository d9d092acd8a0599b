#include <iterator>
#include <numeric>
#include <optional>

#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/C2K/PacketDecoders.h"
#include "LogGenerator/LogGenerator.h"

namespace varnel::c2k {

namespace {

// The bits per packet of each counter. A counter with 0 does not count.
constexpr std::uint64_t flWeights[] = {
    128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
    0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
    0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
    1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0,
};
constexpr std::uint64_t rlWeights[] = {128, 256, 512, 768, 1024, 1536, 2048, 3072, 4096, 6144, 8192, 12288};
constexpr std::size_t flCounterCount = std::size(flWeights);
constexpr std::size_t rlRateCount = std::size(rlWeights);
static_assert(flCounterCount == 56 && rlRateCount == 12);

constexpr std::size_t counterSize = 4;

constexpr Variable forwardRate = "kFLDataRate";
constexpr Variable reverseRate = "kRLDataRate";
constexpr Format rateFormat = real("%.2f kbps");

constexpr std::size_t flSequenceOffset = 13;
constexpr std::size_t flCounters = 17;
static_assert(flCounters + counterSize * flCounterCount == flDataRateSize);

// The reverse link has three blocks of counters with two halves each. A half has a record per rate, whose
// first counters count.
constexpr std::size_t rlSequenceOffset = 14;
constexpr std::size_t rlCounters = 18;
constexpr std::size_t rlRecordSize = 24;
constexpr std::size_t rlRecordCounters = 4;
constexpr std::size_t rlHalfSize = rlRecordSize * rlRateCount;
constexpr std::size_t rlHalfCount = 6;
static_assert(rlHalfSize == 288 && rlCounters + rlHalfSize * rlHalfCount <= rlDataRateSize);

// What a link had sent when it sent a packet.
struct Progress {
  std::uint32_t sequence;
  std::uint64_t bits;
};

void store(Dictionary& entries, BoundEntry& sequence, BoundEntry& sent, const Progress& progress) {
  sequence.setInteger(entries, progress.sequence);
  sent.setInteger(entries, static_cast<std::int64_t>(progress.bits));
}

std::optional<Progress> previousProgress(const Dictionary& entries, LinkEntries& link) {
  const auto sequence = link.sequence.get(entries).integer();
  const auto bits = link.sent.get(entries).integer();
  if (!sequence || !bits) return std::nullopt;
  return Progress{static_cast<std::uint32_t>(*sequence), static_cast<std::uint64_t>(*bits)};
}

void showRate(Variable variable, const Progress& previous, const Progress& now, Lookup& lookup) {
  // The sequence value wraps. If it does not rise, the rate stays as it is.
  const auto steps = static_cast<std::int32_t>(now.sequence - previous.sequence);
  if (steps < 1) return;
  const auto bits = static_cast<double>(static_cast<std::int64_t>(now.bits - previous.bits));
  storeDisplayNumber(variable, rateFormat, bits / (steps * 1024.0), lookup);
}

void updateRate(Variable variable, const Progress& now, State& state, LinkEntries& link, Lookup& lookup) {
  Dictionary* extraInfo = state.bound.extraInfo.get(state.entries).dictionary();
  if (const auto previous = previousProgress(state.entries, link)) {
    showRate(variable, *previous, now, lookup);
    if (extraInfo) store(*extraInfo, link.oldSequence, link.oldSent, *previous);
  } else {
    storeDisplayText(variable, "", lookup);
  }
  store(state.entries, link.sequence, link.sent, now);
  if (extraInfo) store(*extraInfo, link.newSequence, link.newSent, now);
}

std::uint64_t rlPacketsAtRate(const Packet& packet, std::size_t rate) {
  std::uint64_t sum = 0;
  for (std::size_t half = 0; half < rlHalfCount; ++half) {
    const std::size_t record = rlCounters + rlHalfSize * half + rlRecordSize * rate;
    for (const std::uint32_t counter : packet.numbers<rlRecordCounters>(record)) sum += counter;
  }
  return sum;
}

}  // namespace

void decodeFLDataRate(const Packet& packet, State& state, Lookup& lookup) {
  const auto counters = packet.numbers<flCounterCount>(flCounters);
  const std::uint64_t bits =
      std::inner_product(counters.begin(), counters.end(), std::begin(flWeights), std::uint64_t{0});
  updateRate(forwardRate, {packet.u32(flSequenceOffset), bits}, state, state.bound.forwardLink, lookup);
}

void decodeRLDataRate(const Packet& packet, State& state, Lookup& lookup) {
  std::uint64_t bits = 0;
  for (std::size_t rate = 0; rate < rlRateCount; ++rate) {
    bits += rlPacketsAtRate(packet, rate) * rlWeights[rate];
  }
  updateRate(reverseRate, {packet.u32(rlSequenceOffset), bits}, state, state.bound.reverseLink, lookup);
}

void listDataRateFormats(std::vector<VariableFormat>& formats) {
  formats.push_back({forwardRate, rateFormat});
  formats.push_back({reverseRate, rateFormat});
}

}  // namespace varnel::c2k

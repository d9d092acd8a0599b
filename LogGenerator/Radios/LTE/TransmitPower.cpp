#include "LogGenerator/Radios/LTE/TransmitPower.h"

#include <algorithm>

#include "LogGenerator/NumberFormats.h"

namespace varnel::lte {

namespace {

constexpr Format dBm = integer("%d dBm");
constexpr Format dB = integer("%d dB");

// A run of bits of a record's word, which has 32 bits.
consteval Source run(unsigned word, unsigned firstBit, std::uint8_t width) {
  return bits(static_cast<std::uint16_t>(4 * word + firstBit / 8), firstBit % 8, width);
}
consteval Source signedRun(unsigned word, unsigned firstBit, std::uint8_t width) {
  Source source = run(word, firstBit, width);
  source.isSigned = true;
  return source;
}

constexpr Field transmission43[] = {
    {signedRun(6, 0, 7), "PUSCH Power", dBm},
    {u16(12), "Transport Block Size"},
};
constexpr Field transmission102[] = {
    {signedRun(6, 0, 7), "PUSCH Power", dBm},
    {u16(8), "Transport Block Size"},
};

constexpr Field sharedChannel4[] = {
    {signedRun(0, 14, 8), "PUSCH Power", dBm},
    {signedRun(2, 5, 8), "PUSCH Actual Power", dBm},
    {run(1, 14, 8), "PUSCH Path Loss", dB},
    {run(1, 0, 14), "Transport Block Size"},
};
constexpr Field sharedChannel5[] = {
    {signedRun(0, 14, 8), "PUSCH Power", dBm}, {signedRun(2, 15, 8), "PUSCH Actual Power", dBm},
    {run(1, 22, 8), "PUSCH Path Loss", dB},    {run(1, 0, 8), "PUSCH Resource Blocks"},
    {run(1, 8, 14), "Transport Block Size"},
};
constexpr Field sharedChannel25[] = {
    {signedRun(0, 17, 8), "PUSCH Power", dBm}, {signedRun(2, 15, 8), "PUSCH Actual Power", dBm},
    {run(1, 22, 8), "PUSCH Path Loss", dB},    {run(1, 0, 8), "PUSCH Resource Blocks"},
    {run(1, 8, 14), "Transport Block Size"},   {signedRun(2, 23, 8), "Maximum Power", dBm},
};
constexpr Field controlChannel[] = {
    {signedRun(0, 14, 8), "PUCCH Power", dBm},
    {signedRun(2, 16, 8), "PUCCH Actual Power", dBm},
    {run(1, 11, 8), "PUCCH Path Loss", dB},
};

/// A counted list. The last record that lies wholly inside the packet is the newest.
struct List {
  Source count;
  std::size_t first, stride;
};
constexpr List transmissions43{bits(2, 1, 5), 8, 64}, transmissions102{bits(2, 1, 5), 8, 68};
constexpr List powers{u8(3), 4, 12};

template <const List& list, const auto& fields>
void showLast(Section& section, const Packet& payload) {
  static_assert(extent(fields) <= list.stride);
  const std::size_t room = (std::max(payload.size(), list.first) - list.first) / list.stride;
  const std::size_t count = std::min<std::size_t>(rawValue(payload, list.count), room);
  if (count > 0) section.show(payload.from(list.first + list.stride * (count - 1)), fields);
}

constexpr PacketLayout layouts[] = {
    {0xB139, 43, transmissions43.first, showLast<transmissions43, transmission43>},
    {0xB139, 102, transmissions102.first, showLast<transmissions102, transmission102>},
    {0xB16E, 4, powers.first, showLast<powers, sharedChannel4>},
    {0xB16E, 5, powers.first, showLast<powers, sharedChannel5>},
    {0xB16E, 25, powers.first, showLast<powers, sharedChannel25>},
    {0xB16F, 4, powers.first, showLast<powers, controlChannel>},
    {0xB16F, 24, powers.first, showLast<powers, controlChannel>},
};

}  // namespace

TransmitPower::TransmitPower() : VersionedDecoder("Transmit Power", layouts) {}

void TransmitPower::listNumberFormats(SectionFormats& formats) const {
  formats.add(sharedChannel25);
  formats.add(controlChannel);
}

}  // namespace varnel::lte

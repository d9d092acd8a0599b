#include "LogGenerator/Radios/NR/ServingCell.h"

#include <array>
#include <charconv>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/ChannelText.h"
#include "LogGenerator/Radios/NR/Plausible.h"
#include "LogGenerator/Radios/Plmn.h"

namespace varnel::nr {

namespace {

constexpr Format bandwidth = integer("%d MHz");
constexpr Format number = integer("%u");

constexpr Field cellEntries[] = {
    {u16(0), "Physical Cell ID"},
};

// Newer versions put more in front of the cell, and the cell global identity between the cell and the
// channels. What follows stays together.
constexpr std::uint16_t channel = 0, uplinkChannel = 4, cellIdentity = 12, countryCode = 20,
                        networkDigits = 22, networkCode = 23;
constexpr Field entries[] = {
    {u32(channel), "NR-ARFCN"},
    {u32(uplinkChannel), "Uplink NR-ARFCN", number},
    {u16(30), "Band", integer("n%d")},
    {u16(8), "Downlink Bandwidth", bandwidth},
    {u16(10), "Uplink Bandwidth", bandwidth},
    {u32(26), "Tracking Area Code", number},
    {u8(25), "Allowed Access"},
};

// The number of 64 bits at this place, in decimal.
void setLongNumber(Section& section, std::string_view entry, const Packet& packet, std::size_t offset) {
  const auto [low, high] = packet.numbers<2>(offset);
  std::array<char, 20> room;  // the digits of the greatest number
  const auto end = std::to_chars(room.begin(), room.end(), std::uint64_t{high} << 32 | low).ptr;
  section.setText(entry, {room.begin(), end});
}

template <std::size_t cellOffset, std::size_t channelOffset>
void update(Section& section, const Packet& payload) {
  const Packet cell = payload.from(cellOffset), rest = payload.from(channelOffset);
  const std::uint32_t nrArfcn = rest.u32(channel);
  if (!isPhysicalCell(cell.u16(0)) || !isChannel(nrArfcn)) return;
  section.show(cell, cellEntries);
  section.show(rest, entries);
  section.setText("Downlink Frequency", channels::nrFrequency(nrArfcn));
  section.setText("Uplink Frequency", channels::nrFrequency(rest.u32(uplinkChannel)));
  section.setText("PLMN", plmnText(rest.u16(countryCode), rest.u16(networkCode), rest.u8(networkDigits)));
  setLongNumber(section, "Cell Identity", rest, cellIdentity);
}

constexpr PacketLayout layouts[] = {
    {0xB823, 4, 6 + extent(entries), update<4, 6>},
    {0xB823, 0x30000, 14 + extent(entries), update<4, 14>},
    {0xB823, 0x30002, 17 + extent(entries), update<7, 17>},
    {0xB823, 0x30003, 17 + extent(entries), update<7, 17>},
};
static_assert(17 + extent(entries) == 49);

}  // namespace

ServingCell::ServingCell() : VersionedDecoder("Serving Cell", layouts) {}

void ServingCell::listNumberFormats(SectionFormats& formats) const {
  formats.add(entries);
  formats.add("Downlink Frequency", channels::nrFrequencyFormat);
  formats.add("Uplink Frequency", channels::nrFrequencyFormat);
}

}  // namespace varnel::nr

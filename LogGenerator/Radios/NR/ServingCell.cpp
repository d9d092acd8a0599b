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

// Newer versions put more in front of the cell, and the cell global identity between the cell and the
// channels. What follows stays together.
template <std::uint16_t cell, std::uint16_t rest>
constexpr Field entries[] = {
    {u16(cell), "Physical Cell ID"},
    {u32(rest), "NR-ARFCN"},
    {u32(rest + 4), "Uplink NR-ARFCN", number},
    {u16(rest + 30), "Band", integer("n%d")},
    {u16(rest + 8), "Downlink Bandwidth", bandwidth},
    {u16(rest + 10), "Uplink Bandwidth", bandwidth},
    {u32(rest + 26), "Tracking Area Code", number},
    {u8(rest + 25), "Allowed Access"},
};

// The number of 64 bits at this place, in decimal.
void setLongNumber(Section& section, std::string_view entry, const Packet& payload, std::size_t offset) {
  const auto [low, high] = payload.numbers<2>(offset);
  std::array<char, 20> room;  // the digits of the greatest number
  const auto end = std::to_chars(room.begin(), room.end(), std::uint64_t{high} << 32 | low).ptr;
  section.setText(entry, {room.begin(), end});
}

template <std::uint16_t cell, std::uint16_t rest>
void update(Section& section, const Packet& payload) {
  const std::uint32_t nrArfcn = payload.u32(rest);
  if (!isPhysicalCell(payload.u16(cell)) || !isChannel(nrArfcn)) return;
  section.show(payload, entries<cell, rest>);
  section.setText("Downlink Frequency", channels::nrFrequency(nrArfcn));
  section.setText("Uplink Frequency", channels::nrFrequency(payload.u32(rest + 4)));
  section.setText("PLMN", plmnText(payload.u16(rest + 20), payload.u16(rest + 23), payload.u8(rest + 22)));
  setLongNumber(section, "Cell Identity", payload, rest + 12);
}

constexpr PacketLayout layouts[] = {
    {0xB823, 4, 38, update<4, 6>},
    {0xB823, 0x30000, 46, update<4, 14>},
    {0xB823, 0x30002, 49, update<7, 17>},
    {0xB823, 0x30003, 49, update<7, 17>},
};
static_assert(extent(entries<4, 6>) == 38 && extent(entries<4, 14>) == 46 && extent(entries<7, 17>) == 49);

}  // namespace

ServingCell::ServingCell() : VersionedDecoder("Serving Cell", layouts) {}

void ServingCell::listNumberFormats(SectionFormats& formats) const {
  formats.add(entries<4, 6>);
  formats.add("Downlink Frequency", channels::nrFrequencyFormat);
  formats.add("Uplink Frequency", channels::nrFrequencyFormat);
}

}  // namespace varnel::nr

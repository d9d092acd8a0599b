#include "LogGenerator/Radios/NR/MasterInformation.h"

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/ChannelText.h"
#include "LogGenerator/Radios/NR/Plausible.h"

namespace varnel::nr {

namespace {

constexpr std::uint16_t cell = 4, channel = 6;
constexpr std::string_view spacings[] = {"15 kHz", "30 kHz", "60 kHz", "120 kHz"};

constexpr Format spacing = integer("%u kHz");  // for the list of units

// The versions differ in the place of the subcarrier spacing: bit 30 or bit 31 of the properties.
template <std::uint8_t spacingBit>
constexpr Field entries[] = {
    {u16(cell), "Physical Cell ID"},
    {u32(channel), "NR-ARFCN"},
    {bits(10, 0, 10), "System Frame Number"},
    {bits(13, spacingBit, 2), "Subcarrier Spacing", entry(spacings)},
};

template <std::uint8_t spacingBit>
void update(Section& section, const Packet& payload) {
  const std::uint32_t nrArfcn = payload.u32(channel);
  if (!isPhysicalCell(payload.u16(cell)) || !isChannel(nrArfcn)) return;
  section.show(payload, entries<spacingBit>);
  section.setText("Frequency", channels::nrFrequency(nrArfcn));
}

constexpr PacketLayout layouts[] = {
    {0xB822, 3, 14, update<6>},
    {0xB822, 0x20000, 15, update<7>},
};

}  // namespace

MasterInformation::MasterInformation() : VersionedDecoder("MIB", layouts) {}

void MasterInformation::listNumberFormats(SectionFormats& formats) const {
  VersionedDecoder::listNumberFormats(formats);
  formats.add(entries<6>);
  formats.add("Frequency", channels::nrFrequencyFormat);
  // Texts of a table, which are numbers with one unit.
  formats.add("Subcarrier Spacing", spacing);
}

}  // namespace varnel::nr

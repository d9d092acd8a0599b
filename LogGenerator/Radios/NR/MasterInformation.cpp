#include "LogGenerator/Radios/NR/MasterInformation.h"

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/ChannelText.h"
#include "LogGenerator/Radios/NR/Plausible.h"

namespace varnel::nr {

namespace {

constexpr std::uint16_t cell = 4, channel = 6;
constexpr std::string_view spacings[] = {"15 kHz", "30 kHz", "60 kHz", "120 kHz"};

constexpr Format spacing = integer("%u kHz");  // for the list of units

constexpr Field entries[] = {
    {u16(cell), "Physical Cell ID"},
    {u32(channel), "NR-ARFCN"},
    {bits(10, 0, 10), "System Frame Number"},
};
// Bits 30 and 31 of the properties, or bits 31 and 32.
constexpr Field shortSpacing[] = {
    {bits(13, 6, 2), "Subcarrier Spacing", entry(spacings)},
};
constexpr Field longSpacing[] = {
    {bits(13, 7, 2), "Subcarrier Spacing", entry(spacings)},
};

template <const auto& spacingEntry>
void update(Section& section, const Packet& payload) {
  const std::uint32_t nrArfcn = payload.u32(channel);
  if (!isPhysicalCell(payload.u16(cell)) || !isChannel(nrArfcn)) return;
  section.show(payload, entries);
  section.show(payload, spacingEntry);
  section.setText("Frequency", channels::nrFrequency(nrArfcn));
}

constexpr PacketLayout layouts[] = {
    {0xB822, 3, 14, update<shortSpacing>},
    {0xB822, 0x20000, 15, update<longSpacing>},
};
static_assert(extent(shortSpacing) == 14 && extent(longSpacing) == 15);

}  // namespace

MasterInformation::MasterInformation() : VersionedDecoder("MIB", layouts) {}

void MasterInformation::listNumberFormats(SectionFormats& formats) const {
  formats.add(entries);
  formats.add("Frequency", channels::nrFrequencyFormat);
  // Texts of a table, which are numbers with one unit.
  formats.add("Subcarrier Spacing", spacing);
}

}  // namespace varnel::nr

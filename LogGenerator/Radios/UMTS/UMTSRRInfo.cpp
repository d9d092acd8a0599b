#include "LogGenerator/Radios/UMTS/UMTSRRInfo.h"

#include "LogGenerator/KLV/GSMUMTS/UMTSTransmitPower.h"
#include "LogGenerator/Radios/CorrectedHandlers.h"

namespace varnel::radios {

namespace {

void showTransmitPower(Section& section, const Packet& packet) {
  using namespace umtsTransmitPower;
  if (const auto mean = mean_dbm(packet)) {
    section.setReal(label, levelFormat, *mean);
  } else {
    section.setText(label, {});
  }
}

constexpr PacketHandler corrections[] = {
    {umtsTransmitPower::logCode, umtsTransmitPower::minimumSize, showTransmitPower},
};

std::span<const PacketHandler> withCorrections(std::span<const PacketHandler> handlers) {
  static const auto all = correctedHandlers(handlers, corrections);
  return all;
}

}  // namespace

UMTSRRInfo::UMTSRRInfo(CellMonitorReader& cellMonitor)
    : varnel::UMTSRRInfo(cellMonitor, withCorrections(ownHandlers())) {}

}  // namespace varnel::radios

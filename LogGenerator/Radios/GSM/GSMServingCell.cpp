#include "LogGenerator/Radios/GSM/GSMServingCell.h"

#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"
#include "LogGenerator/Radios/CorrectedHandlers.h"

namespace varnel::radios {

namespace {

constexpr Field measurement[] = {
    {gsmMeasurement::receiveLevel, "RSSI", integer("%d dBm")},
    {u32(gsmMeasurement::firstValue), "C1 Value"},
    {u32(gsmMeasurement::secondValue), "C2 Value"},
};
constexpr Field dedicatedChannel[] = {{u16(13), "MA Dedicated ARFCN"}};

constexpr PacketHandler corrections[] = {
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, measurement},
    {0x5076, 17, dedicatedChannel},
};

std::span<const PacketHandler> withCorrections(std::span<const PacketHandler> handlers) {
  static const auto all = correctedHandlers(handlers, corrections);
  return all;
}

}  // namespace

GSMServingCell::GSMServingCell(CellMonitorReader& cellMonitor)
    : varnel::GSMServingCell(cellMonitor, withCorrections(ownHandlers())) {}

}  // namespace varnel::radios

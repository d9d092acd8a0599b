#include "LogGenerator/KLV/LTE/NeighborMeasurementMisc.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/NeighborMeasurement.h"
#include "LogGenerator/NumberFormats.h"

namespace varnel {

namespace {

constexpr Field frequency[] = {
    {u8(13), "Version"},
    {u16(17), "E-ARFCN"},
    {bits(19, 0, 6), "Qrxlevmin", integer("%d dBm", 2, -140)},
};
static_assert(within(frequency, neighborMeasurement::minimumSize));

}  // namespace

constinit const PacketHandlers<NeighborMeasurementMisc> NeighborMeasurementMisc::handlers = {
    {neighborMeasurement::logCode, neighborMeasurement::minimumSize, &NeighborMeasurementMisc::update},
};

void NeighborMeasurementMisc::listNumberFormats(SectionFormats& formats) const { formats.add(frequency); }

void NeighborMeasurementMisc::update(const Packet& packet) { setFields(rows(), packet, frequency); }

}  // namespace varnel

#include "LogGenerator/KLV/LTE/NeighborMeasurementMisc.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/NeighborMeasurement.h"

namespace varnel {

namespace {

constexpr Field frequency[] = {
    {u8(13), "Version"},
    {u16(17), "E-ARFCN"},
    {bits(19, 0, 6), "Qrxlevmin", integer("%d dBm", 2, -140)},
};

constexpr PacketHandler packets[] = {
    {neighborMeasurement::logCode, neighborMeasurement::minimumSize, frequency},
};

}  // namespace

NeighborMeasurementMisc::NeighborMeasurementMisc()
    : SectionDecoder("Neighbor Measurements", "Neighbor Measurements", packets) {}

}  // namespace varnel

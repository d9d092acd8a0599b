#include "LogGenerator/KLV/LTE/ConnectedModeMeasurementMisc.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ConnectedModeMeasurement.h"

namespace varnel {

namespace {

constexpr Format rsrp = real("%4.2f dBm", 0.25, -140.0);
constexpr Format rsrq = real("%4.2f dB", 0.125, -20.0);

constexpr Field servingCell[] = {
    {u16(17), "E-ARFCN"},
    {u16(19), "Serving Physical Cell ID"},
    {u16(21), "Subframe Number"},
    {u16(23), "Serving Filtered RSRP", rsrp},
    {u16(25), "Serving Filtered RSRQ", rsrq},
};

constexpr PacketHandler packets[] = {
    {connectedModeMeasurement::logCode, connectedModeMeasurement::minimumSize, servingCell},
};

}  // namespace

ConnectedModeMeasurementMisc::ConnectedModeMeasurementMisc()
    : SectionDecoder("Connected mode LTE Intra-frequency Measurement",
                     "Connected mode LTE Intra-frequency Measurement", packets) {}

}  // namespace varnel

#include "LogGenerator/KLV/LTE/ConnectedModeMeasurementMisc.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ConnectedModeMeasurement.h"
#include "LogGenerator/NumberFormats.h"

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
static_assert(within(servingCell, connectedModeMeasurement::minimumSize));

}  // namespace

constinit const PacketHandlers<ConnectedModeMeasurementMisc> ConnectedModeMeasurementMisc::handlers = {
    {connectedModeMeasurement::logCode, connectedModeMeasurement::minimumSize,
     &ConnectedModeMeasurementMisc::update},
};

void ConnectedModeMeasurementMisc::listNumberFormats(SectionFormats& formats) const {
  formats.add(servingCell);
}

void ConnectedModeMeasurementMisc::update(const Packet& packet) { setFields(rows(), packet, servingCell); }

}  // namespace varnel

#include "LogGenerator/KLV/LTE/ServingCellMeasurement.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr Choice truth[] = {{0, "False"}};

constexpr Format rsrp = real("%4.2f dBm", 0.25, -140.0);
constexpr Format rsrq = real("%4.2f dB", 0.25, -30.0);
constexpr Format rssi = real("%4.2f dBm", 0.5, -140.0);
constexpr Format power = integer("%d dBm", 1, -30).unless(64, "Not Present");

constexpr Field measurement[] = {
    {u8(13), "Version"},
    {u16(17), "E-ARFCN"},
    {bits(19, 0, 9), "Physical Cell ID"},
    {bits(20, 1, 4), "Serving Layer Priority"},
    {bits(21, 0, 9), "Measured RSRP", rsrp},
    {bits(22, 1, 9), "Average RSRP", rsrp},
    {bits(23, 2, 7), "Measured RSRQ", rsrq},
    {bits(24, 1, 7), "Average RSRQ", rsrq},
    {bits(25, 0, 9), "Measured RSSI", rssi},
    {bits(26, 1, 6), "Qrxlevmin", integer("%d dBm", 2, -140)},
    {bits(26, 7, 7), "P_Max", power},
    // Kept: a value of six bits never reaches 64, so "Not Present" never shows.
    {bits(27, 6, 6), "Max UE Tx Power", power},
    {bits(29, 0, 7), "Srxlev", integer("%d dBm", 1, -30)},
    {bits(29, 7, 6), "Num of Consecutive DRX Cycles of S < 0"},
    {bits(30, 5, 6), "S Intra Search", integer("%d dB", 2).unless(32, "Not Present")},
    // Kept: this threshold is a difference, like the one above, but shows dBm.
    {bits(31, 3, 6), "S Non Intra Search", integer("%d dBm", 2).unless(32, "Not Present")},
    {bits(32, 1, 1), "Measurement Rules Updated", choice(truth, "True")},
    {bits(32, 2, 4), "Measurement Rules"},
};

constexpr PacketHandler packets[] = {
    {0xB17F, 33, measurement},
};

}  // namespace

ServingCellMeasurement::ServingCellMeasurement()
    : SectionDecoder("Serving Cell Measurements", "Serving Cell Measurements", packets) {}

}  // namespace varnel

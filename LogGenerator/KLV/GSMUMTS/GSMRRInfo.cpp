#include "LogGenerator/KLV/GSMUMTS/GSMRRInfo.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/GPRSCellOptions.h"
#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"
#include "LogGenerator/NumberFormats.h"

namespace varnel {

namespace {

constexpr std::uint32_t stateLogCode = 0x512C;
constexpr std::size_t stateSize = 17;
constexpr std::uint32_t transmissionLogCode = 0x5072;
constexpr std::size_t transmissionSize = 20;

// Kept: the blanks in three of the names, and two that are no RR_ names.
constexpr std::string_view states[] = {
    /*  0 */ "RR_INACTIVE",
    /*  1 */ "RR_GOING_ACTIVE",
    /*  2 */ "RR_GOING_INACTIVE",
    /*  3 */ "RR_CELL_SELECTION",
    /*  4 */ "RR_PLMN_LIST_CONSTRUCTION",
    /*  5 */ "RR_IDLE",
    /*  6 */ "RR_CELL_RESELECTION",
    /*  7 */ "RR_CONNECTION_PENDING",
    /*  8 */ "RR_CHOOSE_CELL",
    /*  9 */ "RR_DATA_TRANSFER",
    /* 10 */ "RR_NO_CHANNELS",
    /* 11 */ "RR_CONNECTION_RELEASE",
    /* 12 */ "RR_EARLY_CAMPED_WAIT_FOR_SI",
    /* 13 */ "RR_W2G_INTERRAT_HANDOVER_ PROGRESS",
    /* 14 */ "RR_W2G_INTERRAT_RESELECTION_PROGRESS",
    /* 15 */ "RR_WAIT_FOR_EARLY_PSCAN",
    /* 16 */ "GRR51",
    /* 17 */ "GRR52",
    /* 18 */ "RR_G2W_INTERRAT_RESELECTION_PROGRESS",
    /* 19 */ "RR_G2W_INTERRAT_HANDOVER_ PROGRESS",
    /* 20 */ "RR_CELL_REEST",
    /* 21 */ "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS",
};
constexpr Choice modes[] = {{0, "Voice"}};
constexpr Field state[] = {
    {u8(13), "RR State", entry(states)},
    {u8(14), "RR Sub State"},
    {u8(15), "RR Status"},
    {u8(16), "RR Mode", choice(modes, "Data")},
};
static_assert(within(state, stateSize));

constexpr Field measurement[] = {
    {gsmMeasurement::receiveLevel, "Serving Rx Level"},
    {u32(gsmMeasurement::firstValue), "Rx Quality Full"},
    {u32(gsmMeasurement::secondValue), "Rx Quality Sub"},
};
static_assert(within(measurement, gsmMeasurement::minimumSize));

// Discontinuous transmission.
constexpr Choice off[] = {{0, "OFF"}};
constexpr Field transmission[] = {
    {u8(19), "DTX Used", choice(off, "ON")},
};
static_assert(within(transmission, transmissionSize));

// Discontinuous reception.
constexpr Field reception[] = {
    {gprsCellOptions::drxTimerMaximum, "DRX Used", integer("%d sec")},
};
static_assert(within(reception, gprsCellOptions::minimumSize));

}  // namespace

constinit const PacketHandlers<GSMRRInfo> GSMRRInfo::handlers = {
    {stateLogCode, stateSize, &GSMRRInfo::updateState},
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, &GSMRRInfo::updateMeasurement},
    {transmissionLogCode, transmissionSize, &GSMRRInfo::updateTransmission},
    {gprsCellOptions::logCode, gprsCellOptions::minimumSize, &GSMRRInfo::updateReception},
};

void GSMRRInfo::listNumberFormats(SectionFormats& formats) const { formats.add(reception); }

void GSMRRInfo::updateState(const Packet& packet) { setFields(rows(), packet, state); }

void GSMRRInfo::updateMeasurement(const Packet& packet) { setFields(rows(), packet, measurement); }

void GSMRRInfo::updateTransmission(const Packet& packet) { setFields(rows(), packet, transmission); }

void GSMRRInfo::updateReception(const Packet& packet) { setFields(rows(), packet, reception); }

}  // namespace varnel

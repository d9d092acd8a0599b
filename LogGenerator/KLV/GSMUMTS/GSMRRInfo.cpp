#include "LogGenerator/KLV/GSMUMTS/GSMRRInfo.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/GPRSCellOptions.h"
#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"

namespace varnel {

namespace {

// Kept: three of the names have a blank, and two do not begin with RR_.
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

constexpr Field measurement[] = {
    {gsmMeasurement::receiveLevel, "Serving Rx Level"},
    {u32(gsmMeasurement::firstValue), "Rx Quality Full"},
    {u32(gsmMeasurement::secondValue), "Rx Quality Sub"},
};

// Discontinuous transmission.
constexpr Choice off[] = {{0, "OFF"}};
constexpr Field transmission[] = {
    {u8(19), "DTX Used", choice(off, "ON")},
};

// Discontinuous reception.
constexpr Field reception[] = {
    {gprsCellOptions::drxTimerMaximum, "DRX Used", integer("%d sec")},
};

constexpr PacketHandler packets[] = {
    {0x512C, 17, state},
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, measurement},
    {0x5072, 20, transmission},
    {gprsCellOptions::logCode, gprsCellOptions::minimumSize, reception},
};

}  // namespace

GSMRRInfo::GSMRRInfo() : SectionDecoder("GSM RR Info", "GSMRRInfo", packets) {}

}  // namespace varnel

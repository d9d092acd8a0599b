#pragma once

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/CellRanking.h"

namespace varnel::cellRanking {

/// The fields of a GSM record.
inline constexpr Field gsmCell[] = {
    {u16(0), "ARFCN"},
    {u16(2), "BSIC"},
    {s8(4), "RSSI", integer("%d dBm")},
    {s16(5), "Ranking Value"},
};
static_assert(extent(gsmCell) <= gsmRecordSize);

}  // namespace varnel::cellRanking

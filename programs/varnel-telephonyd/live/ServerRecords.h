#pragma once

#include <cstdint>
#include <vector>

#include "base/Value.h"
#include "programs/varnel-telephonyd/live/ModemReadings.h"

namespace varnel {

// The payloads of the server's own packets, as docs/formats.md defines them, from what ModemManager tells.

/// 0xFF0000: the files of the SIM card.
Value simFilesOf(const SimReading& sim);
/// 0xFF0001: the cells of GSM, UMTS, and LTE.
Value cellMonitorOf(const std::vector<CellReading>& cells);
/// Whether viewers forget a cell of this list unless it comes again.
bool hasPassingCells(const std::vector<CellReading>& cells);
/// 0xFF0002: a dictionary of rows per bearer.
Value packetDataOf(const std::vector<BearerReading>& bearers);
/// 0xFF0003: everything that has no row in the other packets.
Value modemReportOf(const ModemReading& modem);

}  // namespace varnel

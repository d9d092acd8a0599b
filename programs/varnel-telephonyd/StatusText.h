#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "host/ControlProtocol.h"

namespace varnel {

/// What a server does, as lines of text. Bytes that would control a terminal are not in them.
std::string statusText(const ServerStatus& status);
/// The same as one JSON object in one line. Durations are seconds, and moments are in UTC (RFC 3339). What is
/// not known is left out.
std::string statusJson(const ServerStatus& status);

/// Reads a place as a user types it: "90", "1:30", or "0:01:30.5" after the start, or "2026-11-22 14:00:05"
/// by the capture's clock in UTC, also with "T" and "Z". Nothing for anything else.
std::optional<StreamPlace> readPlace(std::string_view text);

}  // namespace varnel

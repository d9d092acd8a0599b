#pragma once

#include <algorithm>
#include <span>
#include <vector>

#include "LogGenerator/PacketHandler.h"

namespace varnel::radios {

/// The handlers of a decoder, in their order, with others in place of those that read their packet wrong.
inline std::vector<PacketHandler> correctedHandlers(std::span<const PacketHandler> handlers,
                                                    std::span<const PacketHandler> corrections) {
  std::vector<PacketHandler> corrected(handlers.begin(), handlers.end());
  for (PacketHandler& handler : corrected) {
    const auto correction = std::ranges::find(corrections, handler.logCode, &PacketHandler::logCode);
    if (correction != corrections.end()) handler = *correction;
  }
  return corrected;
}

}  // namespace varnel::radios

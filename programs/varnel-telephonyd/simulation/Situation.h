#pragma once

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// When and where a modem is: what its packets tell of.
struct Situation {
  std::chrono::milliseconds now;
  const Walk& walk;
  const Cell& serving;

  /// A packet of that many bytes, written now.
  PacketWriter packet(std::uint16_t code, std::size_t size) const {
    return PacketWriter(PacketWriter::LogType::Modem, code, now, size);
  }
};

}  // namespace varnel::simulation

#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UTRAN neighbour cells, a row each.
class UTRANNeighbhorMeasurements final : public SectionDecoder<UTRANNeighbhorMeasurements> {
 public:
  static constexpr std::string_view sectionName = "Neighbor Cell List";
  static constexpr std::string_view traceLine = "NeighbhorMeasurements List";
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static const PacketHandlers<UTRANNeighbhorMeasurements> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// What the idle-mode neighbour measurement says of its frequency.
class NeighborMeasurementMisc final : public SectionDecoder<NeighborMeasurementMisc> {
 public:
  static constexpr std::string_view sectionName = "Neighbor Measurements";
  static constexpr std::string_view traceLine = "Neighbor Measurements";
  static const PacketHandlers<NeighborMeasurementMisc> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The cells of the idle-mode neighbour measurement, a row each.
class NeighborCellsList final : public SectionDecoder<NeighborCellsList> {
 public:
  static constexpr std::string_view sectionName = "Neighbor Cells List";
  static constexpr std::string_view traceLine = "Neighbor Cells List";
  static const PacketHandlers<NeighborCellsList> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

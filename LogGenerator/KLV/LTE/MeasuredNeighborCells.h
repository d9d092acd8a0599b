#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The neighbour cells of the connected-mode intra-frequency measurement, a row each.
class MeasuredNeighborCells final : public SectionDecoder<MeasuredNeighborCells> {
 public:
  static constexpr std::string_view sectionName = "Measured Neighbor Cells";
  static constexpr std::string_view traceLine = "Measured Neighbor Cells";
  static const PacketHandlers<MeasuredNeighborCells> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

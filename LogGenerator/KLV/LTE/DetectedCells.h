#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The detected cells of the connected-mode intra-frequency measurement, a row each.
class DetectedCells final : public SectionDecoder<DetectedCells> {
 public:
  static constexpr std::string_view sectionName = "Detected Cells";
  static constexpr std::string_view traceLine = "Detected Cells";
  static const PacketHandlers<DetectedCells> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

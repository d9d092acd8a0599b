#pragma once

#include <span>

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The idle-mode measurement of the serving cell.
class ServingCellMeasurement final : public SectionDecoder<ServingCellMeasurement> {
 public:
  static constexpr std::string_view sectionName = "Serving Cell Measurements";
  static constexpr std::string_view traceLine = "Serving Cell Measurements";
  static std::span<const PacketHandler<ServingCellMeasurement>> handlers();

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

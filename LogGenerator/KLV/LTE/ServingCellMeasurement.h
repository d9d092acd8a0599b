#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The idle-mode measurement of the serving cell.
class ServingCellMeasurement final : public SectionDecoder<ServingCellMeasurement> {
 public:
  static constexpr std::string_view sectionName = "Serving Cell Measurements";
  static constexpr std::string_view traceLine = "Serving Cell Measurements";
  static const PacketHandlers<ServingCellMeasurement> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

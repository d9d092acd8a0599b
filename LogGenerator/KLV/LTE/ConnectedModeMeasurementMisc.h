#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The serving cell of the connected-mode intra-frequency measurement.
class ConnectedModeMeasurementMisc final : public SectionDecoder<ConnectedModeMeasurementMisc> {
 public:
  static constexpr std::string_view sectionName = "Connected mode LTE Intra-frequency Measurement";
  static constexpr std::string_view traceLine = "Connected mode LTE Intra-frequency Measurement";
  static const PacketHandlers<ConnectedModeMeasurementMisc> handlers;

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

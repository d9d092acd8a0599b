#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The block error rates of the transport channels, a row each.
class TRCHBLERMeasurement final : public SectionDecoder<TRCHBLERMeasurement> {
 public:
  static constexpr std::string_view sectionName = "TRCH BLER";
  static constexpr std::string_view traceLine = "TRCH BLER Measurement";
  static constexpr int tracePriority = logNoticePriority;
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static const PacketHandlers<TRCHBLERMeasurement> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

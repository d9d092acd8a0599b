#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM neighbour cells of a UTRAN modem, a row each.
class GSMNeighbhorMeasurements final : public SectionDecoder<GSMNeighbhorMeasurements> {
 public:
  static constexpr std::string_view sectionName = "GSM Neighbor Cell List";
  static constexpr std::string_view traceLine = "GSM Neighbor Cell List";
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static const PacketHandlers<GSMNeighbhorMeasurements> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

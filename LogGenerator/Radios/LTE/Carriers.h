#pragma once

#include <array>
#include <vector>

#include "LogGenerator/Radios/LTE/ChannelEntries.h"
#include "LogGenerator/Radios/LTE/ServingCellLayouts.h"
#include "LogGenerator/Radios/SeenCells.h"
#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// The cells that serve the phone together (carrier aggregation): a record for the primary cell and one per
/// secondary cell, in the order of their serving indexes.
class Carriers final : public VersionedDecoder {
 public:
  Carriers();

  void prepareDisplay(const Time& now) override;
  void listNumberFormats(SectionFormats& formats) const override;

 private:
  static const std::array<PacketLayout, servingCellVersions> packets;

  void update(const Packet& subpacket);
  void add(const ServingCellLayout& layout, const MeasuredCell& cell, std::uint8_t servingIndex);

  SeenCells _cells;
  ChannelEntries _channel;
};

}  // namespace varnel::lte

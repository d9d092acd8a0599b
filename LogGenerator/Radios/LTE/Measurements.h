#pragma once

#include <array>
#include <cstdint>

#include "LogGenerator/Radios/LTE/ServingCellLayouts.h"
#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// How strong the primary serving cell is: of all antennas together, of each antenna, and in idle mode with
/// what the phone compares it to. An entry of another packet stays until a packet names another cell.
class Measurements final : public VersionedDecoder {
 public:
  Measurements();

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  enum class Cell : std::uint8_t { Same, Another };

  static const std::array<PacketLayout, servingCellVersions + 2> packets;

  void updateServingCell(const Packet& subpacket);
  void showServingCell(const ServingCellLayout& layout, const Packet& subpacket, const Packet& cell);
  void updateIdle(const Packet& payload);

  /// Compares the cell with the one that the section shows. If it is another one, empties the entries that
  /// only some packets carry.
  Cell beginCell(std::uint32_t earfcn, std::uint32_t physicalCell);
};

}  // namespace varnel::lte

#pragma once

#include <vector>

#include "host/captures/Capture.h"

namespace varnel {

/// pcapng whose first interface has link type USER0. Each packet of this interface is one message with its
/// own time stamp. The interface's description may name the technology. Packets of other interfaces are left
/// out.
class PcapngCapture final : public Capture {
 public:
  /// Throws CaptureError for another link type, and for a file without an interface.
  explicit PcapngCapture(CaptureInput input);
  bool next(CaptureRecord& record) override;
  std::optional<std::string> technology() const override { return _technology; }

 private:
  struct Interface {
    std::uint32_t linkType = 0;
    std::uint32_t snapshotLength = 0;  // 0: none
    std::uint8_t resolution = 6;       // a power of ten, or a power of two if the highest bit is set
    std::int64_t offset_s = 0;
    std::string description{};
  };
  struct Block {
    std::uint32_t type = 0;
    std::uint32_t size = 0;
  };
  struct PacketPlace {
    std::size_t interfaceNumber;
    std::size_t offset;  // of its bytes in the block
    std::uint32_t size;
    std::uint32_t sizeOnTheWay;
    std::optional<Time> time;
  };

  std::optional<Block> nextBlock();
  void startSection();
  void addInterface(const Block& block);
  void readOptions(Interface& interface, std::size_t begin, std::size_t end);
  bool takePacket(const Block& block, CaptureRecord& record);
  std::optional<PacketPlace> packetIn(const Block& block);
  Time timeAt(const Interface& interface, std::size_t offset);
  void passOver(const Block& block);
  [[noreturn]] void failAsDamaged() const;
  [[noreturn]] void failAsCutOff() const;

  std::uint16_t u16(std::size_t offset);
  std::uint32_t u32(std::size_t offset);

  bool _isBigEndian = false;
  std::vector<Interface> _interfaces;
  std::optional<std::string> _technology;
  std::uint64_t _recordsSeen = 0;
  Time _lastTime = {};
};

/// Whether a pcapng file begins with these four bytes.
bool isPcapngMagic(ByteView bytes);

}  // namespace varnel

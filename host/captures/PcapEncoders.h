#pragma once

#include <string>

#include "host/captures/CaptureEncoder.h"

namespace varnel {

/// pcap of link type USER0 with nanoseconds. Each message is a record. pcap keeps 32 bits of the seconds.
class PcapWriter final : public CaptureEncoder {
 public:
  ByteView beginning() override;
  ByteView encode(const CaptureRecord& record) override;

 private:
  Bytes _bytes;
};

/// pcapng of link type USER0 with nanoseconds. Each message is a packet. The description of its interface is
/// the technology.
class PcapngWriter final : public CaptureEncoder {
 public:
  explicit PcapngWriter(std::string technology) : _technology(std::move(technology)) {}
  ByteView beginning() override;
  /// A time before 1970 becomes 1970, and a time after 2554 becomes the last one that fits.
  ByteView encode(const CaptureRecord& record) override;

 private:
  std::string _technology;
  Bytes _bytes;
};

}  // namespace varnel

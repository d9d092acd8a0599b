#pragma once

#include <string>

#include "host/captures/CaptureEncoder.h"

namespace varnel {

/// pcap of link type USER0 with nanoseconds, each message a record. Of a time its seconds are kept as 32
/// bits.
class PcapWriter final : public CaptureEncoder {
 public:
  ByteView beginning() override;
  ByteView encode(const CaptureRecord& record) override;

 private:
  Bytes _bytes;
};

/// pcapng of link type USER0 with nanoseconds, each message a packet; the description of its interface is the
/// technology.
class PcapngWriter final : public CaptureEncoder {
 public:
  explicit PcapngWriter(std::string technology) : _technology(std::move(technology)) {}
  ByteView beginning() override;
  /// Times before 1970 and after 2554 become those.
  ByteView encode(const CaptureRecord& record) override;

 private:
  std::string _technology;
  Bytes _bytes;
};

}  // namespace varnel

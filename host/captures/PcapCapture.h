#pragma once

#include "host/captures/Capture.h"

namespace varnel {

/// pcap of link type USER0. Each record is one message, and its time stamp is the message's time.
class PcapCapture final : public Capture {
 public:
  /// The link type of captures of the log channel.
  static constexpr std::uint32_t linkType = 147;
  /// Longer records are left out.
  static constexpr std::size_t longestMessage = std::size_t{1} << 20;

  /// Throws CaptureError for another link type, and for a header that is cut off.
  explicit PcapCapture(CaptureInput input);
  bool next(CaptureRecord& record) override;

 private:
  std::uint32_t number(std::size_t offset);
  std::string place() const { return name() + ", record " + std::to_string(_recordsSeen) + ": "; }

  bool _isBigEndian = false;
  std::uint32_t _nanosecondsPerUnit = 1000;
  std::uint64_t _recordsSeen = 0;
};

/// Whether a pcap file begins with these four bytes.
bool isPcapMagic(ByteView bytes);

/// The sentence for a capture of another link type. Some of its bytes may tell more about it.
std::string foreignLinkType(const std::string& name, std::uint32_t linkType, ByteView someBytes);

/// Completes a record of pcap. The message's prefix tells its subscription.
void setMessage(CaptureRecord& record, ByteView message);

/// The line for a record that is too long.
std::string tooLongLine(const std::string& name, std::uint64_t number, std::uint64_t size);

}  // namespace varnel

#pragma once

#include <cstddef>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// What captures are made of.
enum class CaptureKind {
  Pcap,
  Pcapng,
  Gzip,
  FramedStream,
  LengthFramedStream,
  RecordStream,
  BinaryLog,  ///< records as a viewer of this system saves them
};

struct Recognition {
  enum class Verdict { Known, Unknown, NeedsMore };
  Verdict verdict = Verdict::Unknown;
  CaptureKind kind{};
  std::size_t headerSize = 0;  ///< of what stands before the first frame
};

/// Whether the bytes are all that there is.
enum class Beginning { OfMore, Whole };

/// Tells what begins with these bytes.
Recognition recognise(ByteView bytes, Beginning beginning);

/// So many bytes and no more are looked at for a sound frame.
inline constexpr std::size_t longestSearch = std::size_t{1} << 16;

/// What a file holds that is no capture, and what would help, as the rest of a sentence that begins with the
/// file's name.
std::string whatElseItIs(ByteView bytes);

}  // namespace varnel

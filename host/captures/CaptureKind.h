#pragma once

#include <cstddef>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// The kinds of captures.
enum class CaptureKind {
  Pcap,
  Pcapng,
  Gzip,
  FramedStream,
  LengthFramedStream,
  RecordStream,
  BinaryLog,  ///< log records as a viewer of this system saves them
};

struct Recognition {
  enum class Verdict { Known, Unknown, NeedsMore };
  Verdict verdict = Verdict::Unknown;
  CaptureKind kind{};
  std::size_t headerSize = 0;  ///< bytes before the first frame
};

/// Whether more bytes follow.
enum class Beginning { OfMore, Whole };

/// Finds the kind of a capture that begins with these bytes.
Recognition recognise(ByteView bytes, Beginning beginning);

/// At most this many bytes are searched for a sound frame.
inline constexpr std::size_t longestSearch = std::size_t{1} << 16;

/// What a file that is no capture holds, and what would help. The text is the rest of a sentence that begins
/// with the name of the file.
std::string whatElseItIs(ByteView bytes);

}  // namespace varnel

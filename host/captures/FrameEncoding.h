#pragma once

#include "base/Bytes.h"

namespace varnel {

/// Appends these contents to the stream of a diagnostic port, as one frame: escaped, with the checksum, and
/// with the frame end.
void appendFramed(Bytes& stream, ByteView contents);

}  // namespace varnel

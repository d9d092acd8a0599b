#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "fuzz/Require.h"
#include "host/PortFrame.h"

using namespace varnel;

// The bytes arrive in pieces whose lengths come from the first byte. The frames in them must be the same as
// when all bytes arrive at once.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const ByteView stream(data + 1, size - 1);
  const std::size_t pieceSize = data[0] + std::size_t{1};

  FrameReader whole;
  whole.feed(stream);
  Bytes expected;
  while (const auto frame = whole.next()) appendFrame(expected, *frame);

  FrameReader pieces;
  Bytes found;
  for (ByteView rest = stream; !rest.empty();) {
    const ByteView piece = rest.first(std::min(pieceSize, rest.size()));
    rest = rest.subspan(piece.size());
    pieces.feed(piece);
    while (const auto frame = pieces.next()) appendFrame(found, *frame);
  }
  require(found == expected, "frames are the same in pieces");
  require(pieces.isFaulty() == whole.isFaulty(), "a fault is the same in pieces");
  return 0;
}

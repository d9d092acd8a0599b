#pragma once

#include <algorithm>
#include <cstdint>
#include <random>
#include <string>
#include <string_view>
#include <utility>

#include "base/Bytes.h"
#include "host/PortFrame.h"

namespace varnel {

/// Frames as they should not be. The same seed makes the same bytes.
class FrameMutator {
 public:
  explicit FrameMutator(std::uint32_t seed) : _random(seed) {}

  /// A number below the limit, which must not be 0.
  std::size_t below(std::size_t limit) { return _random() % limit; }

  /// The frame's bytes with one to four changes.
  Bytes mutated(const Frame& frame) {
    Bytes bytes;
    appendFrame(bytes, frame);
    for (std::size_t changes = 1 + below(4); changes > 0; --changes) change(bytes);
    return bytes;
  }
  /// The frame's bytes with changes in its header alone.
  Bytes mutatedHeader(const Frame& frame) {
    Bytes bytes;
    appendFrame(bytes, frame);
    for (std::size_t changes = 1 + below(3); changes > 0; --changes)
      bytes[below(headerSize)] = static_cast<std::uint8_t>(below(2) ? below(256) : below(6));
    return bytes;
  }

 private:
  static constexpr std::size_t headerSize = 9;

  void change(Bytes& bytes) {
    if (bytes.empty()) return;
    const std::size_t at = below(bytes.size());
    const auto place = bytes.begin() + static_cast<std::ptrdiff_t>(at);
    switch (below(7)) {
      case 0:
        bytes[at] ^= static_cast<std::uint8_t>(1U << below(8));
        break;
      case 1:
        bytes[at] = static_cast<std::uint8_t>(below(256));
        break;
      case 2:
        bytes.erase(place,
                    bytes.begin() + static_cast<std::ptrdiff_t>(std::min(bytes.size(), at + 1 + below(64))));
        break;
      case 3:
        bytes.insert(place, 1 + below(64), static_cast<std::uint8_t>(below(256)));
        break;
      case 4:
        bytes.resize(at);
        break;
      case 5:  // a piece once more
      {
        const Bytes piece(place, bytes.end());
        bytes.insert(bytes.end(), piece.begin(), piece.end());
      } break;
      default:  // the length
        bytes[below(std::min<std::size_t>(4, bytes.size()))] = static_cast<std::uint8_t>(below(256));
    }
  }

  std::mt19937 _random;
};

inline ByteView viewOf(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

/// A property list of this dictionary.
inline std::string plistOf(std::string_view dictionary) {
  return "<plist version=\"1.0\">" + std::string(dictionary) + "</plist>";
}

}  // namespace varnel

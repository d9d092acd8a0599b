#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// A section that the display has but no packet fills: its decoder subscribes to nothing, and when it is
/// called all the same it only writes its trace line.
template <class Decoder>
class SectionWithoutCodes : public SectionDecoder<Decoder> {
 public:
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Ignored;
  static constexpr PacketHandlers<Decoder> handlers = {};
};

}  // namespace varnel

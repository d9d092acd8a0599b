#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The last random access of the phone: which preamble it sent, and how far away the answer says it is.
class RandomAccess final : public SectionDecoder {
 public:
  RandomAccess();
};

}  // namespace varnel

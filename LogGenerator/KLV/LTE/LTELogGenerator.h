#pragma once

#include "LogGenerator/KLVLogGenerator2.h"

namespace varnel {

/// The generator of LTE modems, with the template "LTE" and the decoders of `LTEClassIndex`.
class LTELogGenerator final : public KLVLogGenerator2 {
 public:
  explicit LTELogGenerator(const Services& services);
  ~LTELogGenerator() override;
  static std::unique_ptr<LogGenerator> generator(const Services& services);
};

}  // namespace varnel

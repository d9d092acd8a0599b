#pragma once

#include "LogGenerator/KLVLogGenerator2.h"

namespace varnel {

/// The generator of GSM/UMTS modems, with the template "KLV_GSM" and the decoders of `KLV_GSMClassIndex`.
class KLV_GSMLogGenerator final : public KLVLogGenerator2 {
 public:
  explicit KLV_GSMLogGenerator(const Services& services);
  ~KLV_GSMLogGenerator() override;
  static std::unique_ptr<LogGenerator> generator(const Services& services);
};

}  // namespace varnel

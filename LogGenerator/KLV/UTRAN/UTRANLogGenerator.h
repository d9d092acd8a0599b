#pragma once

#include "LogGenerator/KLVLogGenerator2.h"

namespace varnel {

/// The generator of UTRAN modems, with the decoders of `UTRANClassIndex`. Its template is the first resource
/// with "UTRAN" in its path, in any letter case. Without such a resource it decodes nothing.
class UTRANLogGenerator final : public KLVLogGenerator2 {
 public:
  explicit UTRANLogGenerator(const Services& services);
  static std::unique_ptr<LogGenerator> generator(const Services& services);
  std::optional<std::string> missingTemplate() const override;

 private:
  UTRANLogGenerator(const Services& services, const std::string& listName);
};

}  // namespace varnel

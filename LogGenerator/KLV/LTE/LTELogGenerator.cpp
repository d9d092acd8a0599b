#include "LogGenerator/KLV/LTE/LTELogGenerator.h"

#include "LogGenerator/KLV/LTE/LTEClassIndex.h"
#include "base/Log.h"

namespace varnel {

namespace {

std::shared_ptr<ClassIndex> makeClassIndex(const Services& services) {
  // Kept: a success, logged as an error.
  logError("Creating LTELogGenerator object");
  return std::make_shared<LTEClassIndex>(services.standardOutput);
}

}  // namespace

LTELogGenerator::LTELogGenerator(const Services& services)
    : KLVLogGenerator2(services, "LTE", makeClassIndex(services)) {}

LTELogGenerator::~LTELogGenerator() {
  logWarning("LTELogGenerator is destructed %p", static_cast<const void*>(this));
}

std::unique_ptr<LogGenerator> LTELogGenerator::generator(const Services& services) {
  return std::make_unique<LTELogGenerator>(services);
}

}  // namespace varnel

#include "LogGenerator/KLV/GSMUMTS/KLV_GSMLogGenerator.h"

#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"
#include "base/Log.h"

namespace varnel {

namespace {

std::shared_ptr<ClassIndex> makeClassIndex(const Services& services) {
  // Kept: a success, logged as an error.
  logError("Creating KLV_GSMLogGenerator object");
  return std::make_shared<KLV_GSMClassIndex>(services.standardOutput);
}

}  // namespace

KLV_GSMLogGenerator::KLV_GSMLogGenerator(const Services& services)
    : KLVLogGenerator2(services, "KLV_GSM", makeClassIndex(services)) {}

KLV_GSMLogGenerator::~KLV_GSMLogGenerator() {
  logWarning("KLV_GSMLogGenerator is destructed %p", static_cast<const void*>(this));
}

std::unique_ptr<LogGenerator> KLV_GSMLogGenerator::generator(const Services& services) {
  return std::make_unique<KLV_GSMLogGenerator>(services);
}

}  // namespace varnel

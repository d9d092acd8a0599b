#include "LogGenerator/KLV/Subscriber/PDPContextList.h"

#include "base/Log.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {
constexpr std::uint32_t pdpContextsLogCode = 0xFF0002;
}

std::vector<std::uint32_t> PDPContextList::getLogCodeArray() const { return {pdpContextsLogCode}; }

// Kept: the log code is ignored. Every packet is taken as a list of contexts.
void PDPContextList::updateWithData_logCode(const Packet& packet, std::uint32_t /*logCode*/) {
  logWarning("PDPContextList");
  const auto payload = readPropertyList(packet.payload());
  if (!payload || !payload->array()) return;
  sectionRef.refill([&](Array& contexts) { contexts = std::move(*payload->array()); });
}

}  // namespace varnel

#include "programs/varnel-telephonyd/CodeFilter.h"

#include "LogGenerator/LogMessage.h"

namespace varnel {

namespace {

bool holds(const std::optional<CodeFilter::Codes>& codes, std::uint32_t code) {
  return codes && codes->contains(code);
}

}  // namespace

bool CodeFilter::takes(ByteView message) const {
  if (!modemCodes && !serverCodes) return true;
  const auto framed = LogMessage::framed(message);
  if (!framed || !framed->isOfKnownType()) return true;
  const std::uint32_t code = framed->logCode();
  if (framed->logType() == LogMessage::modemLogType) return holds(modemCodes, code);
  return holds(serverCodes, code - LogMessage::extraCodeBase);
}

}  // namespace varnel

#include "programs/varnel-telephonyd/CodeFilter.h"

namespace varnel {

namespace {

constexpr std::size_t headerSize = 13, codeOffset = 3;
constexpr std::uint8_t modemType = 1, serverType = 0xFF;
constexpr std::uint8_t prefixMark = 0x81;
constexpr std::size_t prefixSize = 2;

bool holds(const std::optional<CodeFilter::Codes>& codes, int code) { return codes && codes->contains(code); }

}  // namespace

bool CodeFilter::takes(ByteView message) const {
  if (!modemCodes && !serverCodes) return true;
  if (message.size() < headerSize) return true;
  if (message[0] == prefixMark) message = message.subspan(prefixSize);
  const int code = message[codeOffset] | message[codeOffset + 1] << 8;
  if (message[0] == modemType) return holds(modemCodes, code);
  if (message[0] == serverType) return holds(serverCodes, code);
  return true;
}

}  // namespace varnel

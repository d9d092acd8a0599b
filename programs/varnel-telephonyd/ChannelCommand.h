#pragma once

#include <optional>
#include <string_view>
#include <variant>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/CodeFilter.h"

namespace varnel {

/// {"GetTechnology": "GetTechnology"}
struct TechnologyRequest {};
/// {"SetState": "Streaming", "SetKalviLogCodes": [codes], "SetTkExtraCodes": [codes]}. Either list may be
/// missing, or both.
struct StartRequest {
  CodeFilter filter;
};
using ChannelCommand = std::variant<TechnologyRequest, StartRequest>;

/// Reads a viewer's command, an XML or binary property list; nothing when it is neither of these two.
std::optional<ChannelCommand> readChannelCommand(ByteView data);

/// The reply to a request for the technology.
Bytes technologyReply(std::string_view technology);

}  // namespace varnel

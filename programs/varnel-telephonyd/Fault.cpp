#include "programs/varnel-telephonyd/Fault.h"

#include <charconv>

namespace varnel {

namespace {

constexpr struct {
  std::string_view name;
  Fault::Kind kind;
  bool hasMessages;
} faults[] = {
    {"drop-channel", Fault::Kind::DropChannel, true},
    {"crash", Fault::Kind::Crash, true},
    {"garbage", Fault::Kind::Garbage, true},
    {"silent", Fault::Kind::Silent, false},
    {"late-reply", Fault::Kind::LateReply, false},
    {"bad-reply", Fault::Kind::BadReply, false},
    {"empty-reply", Fault::Kind::EmptyReply, false},
    {"unknown-technology", Fault::Kind::UnknownTechnology, false},
    {"drop-after-reply", Fault::Kind::DropAfterReply, false},
    {"refuse-channel", Fault::Kind::RefuseChannel, false},
    {"no-port", Fault::Kind::NoPort, false},
    {"wrong-port", Fault::Kind::WrongPort, false},
};

// The number that is the whole text, 1 or more.
std::optional<std::uint64_t> readCount(std::string_view text) {
  std::uint64_t count = 0;
  const char* const end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, count);
  if (error != std::errc() || stop != end || count == 0) return std::nullopt;
  return count;
}

}  // namespace

std::optional<Fault> readFault(std::string_view text) {
  const std::size_t at = text.find('@');
  for (const auto& [name, kind, hasMessages] : faults) {
    if (text.substr(0, at) != name) continue;
    if (!hasMessages) return at == std::string_view::npos ? std::optional(Fault{kind}) : std::nullopt;
    if (at == std::string_view::npos) return std::nullopt;
    const auto messages = readCount(text.substr(at + 1));
    return messages ? std::optional(Fault{kind, *messages}) : std::nullopt;
  }
  return std::nullopt;
}

std::string namesOfFaults() {
  std::string names;
  for (const auto& [name, kind, hasMessages] : faults)
    names.append(names.empty() ? "" : ", ").append(name).append(hasMessages ? "@N" : "");
  return names;
}

}  // namespace varnel

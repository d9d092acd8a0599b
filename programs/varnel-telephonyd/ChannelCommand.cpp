#include "programs/varnel-telephonyd/ChannelCommand.h"

#include "base/Dictionary.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {

constexpr std::string_view technologyKey = "GetTechnology";
constexpr std::string_view stateKey = "SetState", streamingState = "Streaming";
constexpr std::string_view modemCodesKey = "SetKalviLogCodes", serverCodesKey = "SetTkExtraCodes";

bool isText(const Value& value, std::string_view text) { return value.string() && *value.string() == text; }

// Reads the codes of a list that is present; false when it is no list of integers.
bool readCodes(const Value& list, std::optional<CodeFilter::Codes>& codes) {
  if (list.isAbsent()) return true;
  if (!list.array()) return false;
  codes.emplace();
  for (const Value& code : *list.array()) {
    if (!code.integer()) return false;
    codes->insert(*code.integer());
  }
  return true;
}

}  // namespace

std::optional<ChannelCommand> readChannelCommand(ByteView data) {
  const auto list = readPropertyList(data);
  const Dictionary* command = list ? list->dictionary() : nullptr;
  if (!command) return std::nullopt;
  if (isText(command->get(technologyKey), technologyKey)) return TechnologyRequest{};
  if (!isText(command->get(stateKey), streamingState)) return std::nullopt;
  StartRequest request;
  if (!readCodes(command->get(modemCodesKey), request.filter.modemCodes)) return std::nullopt;
  if (!readCodes(command->get(serverCodesKey), request.filter.serverCodes)) return std::nullopt;
  return request;
}

Bytes technologyReply(std::string_view technology) {
  const Value reply = Value::ofDictionary();
  reply.dictionary()->set(technologyKey, technology);
  return writeXmlPropertyList(reply).value();
}

}  // namespace varnel

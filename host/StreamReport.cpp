#include "host/StreamReport.h"

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

namespace protocol = telephonyProtocol;

std::uint64_t count(const Dictionary& report, std::string_view key) {
  const auto number = report.get(key).integer();
  return number && *number > 0 ? static_cast<std::uint64_t>(*number) : 0;
}

Value propertyList(const StreamReport& report) {
  Value list = Value::ofDictionary();
  list.dictionary()->set(protocol::noteKey, std::string_view(report.note));
  list.dictionary()->set(protocol::droppedKey, Value::ofInteger(static_cast<std::int64_t>(report.dropped)));
  list.dictionary()->set(protocol::tooLongKey, Value::ofInteger(static_cast<std::int64_t>(report.tooLong)));
  return list;
}

}  // namespace

Bytes writeStreamReport(const StreamReport& report) {
  if (auto list = writeXmlPropertyList(propertyList(report))) return *std::move(list);
  return writeXmlPropertyList(propertyList({"", report.dropped, report.tooLong})).value();
}

std::optional<StreamReport> readStreamReport(ByteView bytes) {
  const auto list = readPropertyList(bytes);
  const Dictionary* const fields = list ? list->dictionary() : nullptr;
  if (!fields) return std::nullopt;
  const std::string* const note = fields->get(protocol::noteKey).string();
  return StreamReport{note ? *note : std::string(), count(*fields, protocol::droppedKey),
                      count(*fields, protocol::tooLongKey)};
}

}  // namespace varnel

#include <cstddef>
#include <cstdint>
#include <ostream>
#include <string>

#include "LogGenerator/KLV/LTE/LTELogGenerator.h"
#include "LogGenerator/KLV/Subscriber/SimInfo.h"
#include "app/TreeText.h"
#include "platform/PropertyList.h"

using namespace varnel;

namespace {

// Templates hold every section of the technology; rows come as they come.
class FuzzHost final : public Resources, public Clock {
 public:
  Value propertyList(std::string_view /*name*/) const override {
    Value list = Value::ofDictionary();
    list.dictionary()->set("Serving Cell Info", Value::ofDictionary());
    list.dictionary()->set("SIM Info", Value::ofDictionary());
    list.dictionary()->set("PDP Context Info", Value::ofArray());
    return list;
  }
  std::vector<std::string> propertyListPaths() const override { return {"LTE.plist"}; }
  Time now() const override { return {1700000000, 0}; }
  TimeZone zoneAt(Time /*time*/) const override { return {3600, false}; }
};

}  // namespace

// The input is a row of messages, each behind its length of two bytes.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const FuzzHost host;
  const ApplicationInfo application{"1.0", "Jan  1 2024 00:00:00"};
  std::ostream nowhere(nullptr);
  LTELogGenerator generator({host, host, application, nowhere});
  Dictionary state;
  ByteView rest(data, size);
  while (rest.size() >= 2) {
    const std::size_t length = std::min<std::size_t>(rest[0] | rest[1] << 8, rest.size() - 2);
    try {
      generator.updateState_withData(state, rest.subspan(2, length));
    } catch (const LogCode_0xFF0000::UnknownDataException&) {
      return 0;  // the end that such a message must bring
    }
    rest = rest.subspan(2 + length);
    PathDictionary paths;
    const Value display = generator.generateLogUsingState(state);
    treeAsText(*VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths));
  }
  writeXmlPropertyList(generator.getSaveContentsFromState(state));
  return 0;
}

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "base/PropertyList.h"
#include "fuzz/ChosenInputs.h"
#include "fuzz/DisplayChecks.h"
#include "fuzz/FuzzHost.h"
#include "fuzz/MessageRules.h"
#include "fuzz/Require.h"
#include "platform/TelephonyService.h"
#include "platform/ui/ScreenLayout.h"

using namespace varnel;

namespace {

/// The same list under every name.
class OneResource final : public Resources {
 public:
  explicit OneResource(Value list) : _list(std::move(list)) {}
  Value propertyList(std::string_view /*name*/) const override { return _list; }
  std::vector<std::string> propertyListPaths() const override { return {"UTRAN.plist"}; }

 private:
  Value _list;
};

Bytes packet(std::uint16_t logCode, std::size_t size) {
  Bytes bytes(size, 1);
  bytes[3] = static_cast<std::uint8_t>(logCode);
  bytes[4] = static_cast<std::uint8_t>(logCode >> 8U);
  return bytes;
}

enum class Writing { Checked, Unchecked };

// Decodes packets into whatever the template has in place of sections.
void checkTemplate(std::string_view technology, const Services& services, const std::vector<Bytes>& packets,
                   Writing writing) {
  const auto generator = LogGenerator::generatorFromTechnology(technology, services);
  Dictionary state;
  for (const Bytes& message : packets) generator->updateState_withData(state, message);
  const Value display = generator->generateLogUsingState(state);
  checkTree(display);
  if (writing == Writing::Unchecked) return;
  checkFormats(display);
  require(writeBinaryPropertyList(generator->getSaveContentsFromState(state)).has_value(), "it can be saved");
}

}  // namespace

// The input is a resource file: the layout of a screen, or the template of a display.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static FuzzHost host;
  if (isLaborious({data, size}, fileLimits)) return 0;
  const auto list = readPropertyList({data, size}, fileLimits);
  if (!list) return 0;
  if (const auto layout = ScreenLayout::fromResource(*list))
    require(layout->rows.size() == list->dictionary()->get("Rows").array()->size(), "a layout has every row");
  constexpr std::size_t inputsPerWriting = 16;
  const Writing writing = isChosen({data, size}, inputsPerWriting) ? Writing::Checked : Writing::Unchecked;
  const OneResource resources(*list);
  const Services services = host.services(resources);
  static const std::vector<Bytes> lte{packet(0xB0C2, 38), packet(0xB17F, 33), packet(0xB179, 35)};
  static const std::vector<Bytes> gsmUMTS{packet(0x5134, 80), packet(0x7132, 16), packet(0x417A, 80)};
  static const std::vector<Bytes> cdma{packet(0x1183, 50), packet(0x134F, 171), packet(0x108A, 40)};
  checkTemplate(technology::kalviLTE, services, lte, writing);
  checkTemplate(technology::kalviGSMUMTS, services, gsmUMTS, writing);
  checkTemplate(technology::kalviUTRAN2, services, {}, writing);
  checkTemplate(technology::kalviCDMA, services, cdma, writing);
  return 0;
}

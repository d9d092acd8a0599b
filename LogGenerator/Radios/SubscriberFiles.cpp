#include "LogGenerator/Radios/SubscriberFiles.h"

#include "LogGenerator/KLV/Subscriber/SimFiles.h"
#include "base/Dictionary.h"
#include "base/Log.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {

// An absent file stays absent, and one without a text stays empty.
Value hidden(const Value& content) {
  const bool isEmpty = content.isAbsent() || (content.string() && content.string()->empty());
  return isEmpty ? content : Value(presentText);
}

}  // namespace

std::vector<std::uint32_t> SubscriberFiles::getLogCodeArray() const { return {simFilesLogCode}; }

void SubscriberFiles::updateWithData_logCode(const Packet& packet, std::uint32_t /*logCode*/) {
  const auto payload = readPropertyList(packet.payload());
  const Dictionary* const files = payload ? payload->dictionary() : nullptr;
  if (!files) return logError("SIM File dictionary data could not be constructed");
  for (const SimFile& file : simFiles) {
    const Value& content = files->get(file.payloadKey);
    const bool isHidden = file.namesPerson && _identities == Identities::Hidden;
    sectionRef.set(file.entry, isHidden ? hidden(content) : content);
  }
}

}  // namespace varnel

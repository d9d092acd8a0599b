#include "LogGenerator/KLV/Subscriber/SimInfo.h"

#include "LogGenerator/KLV/Subscriber/SimFiles.h"
#include "base/Log.h"
#include "base/PropertyList.h"

namespace varnel {

std::vector<std::uint32_t> SimInfo::getLogCodeArray() const { return {simFilesLogCode}; }

void SimInfo::updateWithData_logCode(const Packet& packet, std::uint32_t logCode) {
  logWarning("SimInfo");
  if (logCode != simFilesLogCode) return;
  const auto payload = readPropertyList(packet.payload());
  const Dictionary* files = payload ? payload->dictionary() : nullptr;
  if (!files) {
    logError("SIM File dictionary data could not be constructed");
    throw LogCode_0xFF0000::UnknownDataException();
  }
  for (const SimFile& file : simFiles) sectionRef.set(file.entry, files->get(file.payloadKey));
}

}  // namespace varnel

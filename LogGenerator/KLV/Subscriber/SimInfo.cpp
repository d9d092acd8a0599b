#include "LogGenerator/KLV/Subscriber/SimInfo.h"

#include "base/Log.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {

constexpr std::uint32_t simFilesLogCode = 0xFF0000;

struct SimFile {
  std::string_view payloadKey;
  std::string_view entry;
};

constexpr SimFile simFiles[] = {
    {"kSimFile_ICCID", "EF-ICCID"},
    {"kSimFile_MSISDN", "EF-MSISDN"},
    {"kSimFile_MBDN", "EF-3GPP MAIL BOX DIALING NUMBER"},
    {"kSimFile_HPPLMN", "EF-HPPLMN SEARCH PERIOD"},
    {"kSimFile_LOCI", "EF-LOCI"},
    {"kSimFile_PSLOCI", "EF-GPRS/PS-LOCI"},
    {"kSimFile_ACC", "EF-ACCESS CONTROL CLASS"},
    {"kSimFile_AD", "EF-ADMINISTRATIVE DATA"},
    {"kSimFile_FPLMN", "EF-FPLMN"},
    {"kSimFile_AHPLMN", "EF-ACTING HPLMN"},
    {"kSimFile_RATMODE", "EF-RAT MODE"},
    {"kSimFile_PNN", "EF-PLMN NETWORK NAME"},
    {"kSimFile_OPL", "EF-OPERATOR PLMN LIST"},
    {"kSimFile_OPLMNAcT", "EF-OPLMNAcT"},
};

}  // namespace

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

#include "LogGenerator/Radios/GSM/GPRSInformation.h"

#include "LogGenerator/KLV/GSMUMTS/GPRSInformation.h"
#include "LogGenerator/KLV/GSMUMTS/GPRSPacketControl.h"
#include "LogGenerator/Radios/CorrectedHandlers.h"

namespace varnel::radios {

namespace {

constexpr Choice flowContextSupport[] = {{0xFF, "Not Available"}, {0, "Not Supported"}, {1, "Supported"}};
constexpr Field packetControl[] = {
    gprsPacketControl::controlOrder,
    {gprsPacketControl::flowContexts, "PFC Supported", choice(flowContextSupport, "Unknown")},
    gprsPacketControl::accessThreshold,
};

constexpr PacketHandler corrections[] = {
    {gprsPacketControl::logCode, gprsPacketControl::minimumSize, packetControl},
};

std::span<const PacketHandler> withCorrections() {
  static const auto all = correctedHandlers(varnel::GPRSInformation().handlers(), corrections);
  return all;
}

}  // namespace

GPRSInformation::GPRSInformation()
    : SectionDecoder("GPRS Information", "GPRSInformation", withCorrections()) {}

}  // namespace varnel::radios

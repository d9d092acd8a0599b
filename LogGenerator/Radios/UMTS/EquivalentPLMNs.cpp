#include "LogGenerator/Radios/UMTS/EquivalentPLMNs.h"

#include <string>

#include "LogGenerator/Radios/Plmn.h"

namespace varnel::radios {

namespace {

constexpr std::size_t minimumSize = 17, countOffset = 16, networkSize = 3;

// Leaves out places of the list without a network, and those that do not lie wholly inside the packet.
void update(Section& section, const Packet& packet) {
  section.refill([&](Array& networks) {
    for (std::size_t i = 0; i < packet.u8(countOffset); ++i) {
      const std::size_t offset = minimumSize + networkSize * i;
      if (!packet.holds(offset, networkSize)) return;
      const std::string codes = plmnText(packet, offset);
      const std::size_t dash = codes.find('-');
      if (dash == std::string::npos) continue;
      Dictionary& record = *networks.emplace_back(Value::ofDictionary()).dictionary();
      record.set("Mobile Country Code", codes.substr(0, dash));
      record.set("Mobile Network Code", codes.substr(dash + 1));
    }
  });
}

constexpr PacketHandler packets[] = {{0x7150, minimumSize, update}};

}  // namespace

EquivalentPLMNs::EquivalentPLMNs()
    : SectionDecoder("Equivalent PLMN List", "Equivalent PLMN List", packets) {}

}  // namespace varnel::radios

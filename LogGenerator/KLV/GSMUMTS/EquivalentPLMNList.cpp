#include "LogGenerator/KLV/GSMUMTS/EquivalentPLMNList.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::size_t minimumSize = 17;
constexpr std::size_t countOffset = 16;
constexpr std::size_t networkSize = 3;

// The number made of three decimal digits. Each digit is a byte, and every other byte counts.
std::int32_t everyOtherDigit(const Packet& network, std::size_t first) {
  return network.u8(first) * 100 + network.u8(first + 2) * 10 + network.u8(first + 4);
}

void update(Section& section, const Packet& packet) {
  section.refill([&](Array& networks) {
    for (std::size_t i = 0; i < packet.u8(countOffset); ++i) {
      // Kept: a network has three bytes, but six are read, so each network runs into the next one.
      const Packet network = packet.from(minimumSize + networkSize * i);
      const Value& record = networks.emplace_back(Value::ofDictionary());
      setInteger(*record.dictionary(), "Mobile Country Code", integer(), everyOtherDigit(network, 0));
      setInteger(*record.dictionary(), "Mobile Network Code", integer(), everyOtherDigit(network, 1));
    }
  });
}

constexpr PacketHandler packets[] = {
    {0x7150, minimumSize, update},
};

}  // namespace

EquivalentPLMNList::EquivalentPLMNList()
    : SectionDecoder("Equivalent PLMN List", "Equivalent PLMN List", packets) {}

}  // namespace varnel

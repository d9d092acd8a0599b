#include "LogGenerator/KLV/GSMUMTS/EquivalentPLMNList.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::uint32_t logCode = 0x7150;
constexpr std::size_t minimumSize = 17;
constexpr std::size_t countOffset = 16;
constexpr std::size_t entrySize = 3;

// The number of three decimal digits, a byte each, of which every other one counts.
std::int32_t everyOtherDigit(const Packet& entry, std::size_t first) {
  return entry.u8(first) * 100 + entry.u8(first + 2) * 10 + entry.u8(first + 4);
}

}  // namespace

constinit const PacketHandlers<EquivalentPLMNList> EquivalentPLMNList::handlers = {
    {logCode, minimumSize, &EquivalentPLMNList::update},
};

void EquivalentPLMNList::update(const Packet& packet) {
  clearElementsInArray(list());
  Array networks;
  for (std::size_t i = 0; i < packet.u8(countOffset); ++i) {
    // Kept: six bytes are read of three, so that each network runs into the next.
    const Packet entry = packet.from(minimumSize + entrySize * i);
    Value row = Value::ofDictionary();
    setInteger(*row.dictionary(), "Mobile Country Code", integer(), everyOtherDigit(entry, 0));
    setInteger(*row.dictionary(), "Mobile Network Code", integer(), everyOtherDigit(entry, 1));
    networks.push_back(std::move(row));
  }
  replaceArray_With(list(), std::move(networks));
}

}  // namespace varnel

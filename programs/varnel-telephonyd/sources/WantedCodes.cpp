#include "programs/varnel-telephonyd/sources/WantedCodes.h"

#include <algorithm>

namespace varnel {

namespace {

constexpr std::int64_t highestCode = equipments * codesOfEquipment - 1;
constexpr std::uint32_t bitsOfByte = 8;

bool hasCode(const CodeNumbers& numbers, std::int64_t code) {
  if (code < 0 || code > highestCode) return false;
  return code % codesOfEquipment < numbers[static_cast<std::size_t>(code / codesOfEquipment)];
}

void switchOn(CodeMask& mask, std::uint32_t code) {
  mask.count = std::max(mask.count, code + 1);
  mask.bits.resize((mask.count + bitsOfByte - 1) / bitsOfByte);
  mask.bits[code / bitsOfByte] |= static_cast<std::uint8_t>(1 << code % bitsOfByte);
}

}  // namespace

void WantedCodes::add(const CodeFilter& filter) {
  if (!filter.modemCodes && !filter.serverCodes) _wantsAll = true;
  if (filter.modemCodes) _codes.insert(filter.modemCodes->begin(), filter.modemCodes->end());
}

CodeMasks WantedCodes::masksFor(const CodeNumbers& numbers) const {
  CodeMasks masks;
  if (_wantsAll) {
    for (std::size_t equipment = 0; equipment < equipments; ++equipment)
      for (std::uint32_t code = 0; code < numbers[equipment]; ++code) switchOn(masks[equipment], code);
    return masks;
  }
  for (const std::int64_t code : _codes) {
    if (hasCode(numbers, code))
      switchOn(masks[static_cast<std::size_t>(code / codesOfEquipment)],
               static_cast<std::uint32_t>(code % codesOfEquipment));
  }
  return masks;
}

std::size_t WantedCodes::missingFrom(const CodeNumbers& numbers) const {
  return static_cast<std::size_t>(
      std::ranges::count_if(_codes, [&](std::int64_t code) { return !hasCode(numbers, code); }));
}

}  // namespace varnel

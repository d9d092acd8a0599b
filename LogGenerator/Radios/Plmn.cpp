#include "LogGenerator/Radios/Plmn.h"

#include <algorithm>

namespace varnel {

namespace {

constexpr std::uint32_t noDigit = 15;  // in the place of the third digit of a network code that has two

std::string codeText(std::uint32_t code, std::uint32_t digits) {
  std::string text(digits, '0');
  for (auto digit = text.rbegin(); digit != text.rend(); ++digit, code /= 10)
    *digit = static_cast<char>('0' + code % 10);
  return text;
}

}  // namespace

std::string plmnText(const Packet& packet, std::size_t offset) {
  const auto digit = [&](std::size_t byte, unsigned firstBit) {
    return packet.bits(offset + byte, firstBit, 4);
  };
  const std::uint32_t country[] = {digit(0, 0), digit(0, 4), digit(1, 0)};
  const std::uint32_t network[] = {digit(2, 0), digit(2, 4), digit(1, 4)};
  const std::size_t networkDigits = network[2] == noDigit ? 2 : 3;

  std::string text;
  const auto add = [&](std::uint32_t next) { text += static_cast<char>('0' + next); };
  std::for_each(country, country + 3, add);
  text += '-';
  std::for_each(network, network + networkDigits, add);
  const bool isNumber = std::ranges::all_of(text, [](char c) { return c == '-' || (c >= '0' && c <= '9'); });
  return isNumber ? text : std::string();
}

std::string plmnText(std::uint32_t countryCode, std::uint32_t networkCode, std::uint32_t networkDigits) {
  if (networkDigits != 2 && networkDigits != 3) return {};
  const std::uint32_t networkCodes = networkDigits == 2 ? 100 : 1000;
  if (countryCode >= 1000 || networkCode >= networkCodes) return {};
  return codeText(countryCode, 3) + '-' + codeText(networkCode, networkDigits);
}

}  // namespace varnel

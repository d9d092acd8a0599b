#include "programs/varnel-telephonyd/simulation/SimCard.h"

#include <cstdio>

#include "base/Dictionary.h"

namespace varnel::simulation {

namespace {

// With this digit, the sum of all digits, of which every second one is doubled, is a multiple of ten.
char checkDigit(const std::string& digits) {
  int sum = 0;
  bool isDoubled = true;
  for (auto digit = digits.rbegin(); digit != digits.rend(); ++digit, isDoubled = !isDoubled) {
    const int number = (*digit - '0') * (isDoubled ? 2 : 1);
    sum += number / 10 + number % 10;
  }
  return static_cast<char>('0' + (10 - sum % 10) % 10);
}

std::string codeText(const Network& network) {
  char text[16];
  std::snprintf(text, sizeof text, "%03d-%0*d", network.countryCode, network.networkCodeDigits,
                network.networkCode);
  return text;
}

// Numbers of telecom cards begin with 89. Then come the country and the issuer.
std::string cardNumber(Random& random, const Network& home) {
  std::string digits = "89" + codeText(home);
  std::erase(digits, '-');
  while (digits.size() < 18) digits += static_cast<char>('0' + random.between(0, 9));
  return digits + checkDigit(digits);
}

std::string locationText(const char* identityName, std::uint32_t identity, const char* areaName,
                         const Network& network, int area) {
  char text[100];
  std::snprintf(text, sizeof text, "%s 0x%08X, %s %03d-%0*d-%04X, updated", identityName, identity, areaName,
                network.countryCode, network.networkCodeDigits, network.networkCode,
                static_cast<unsigned>(area));
  return text;
}

std::string accessClassText(const std::string& cardNumber) {
  // The access class is the last digit before the check digit.
  const int accessClass = cardNumber[cardNumber.size() - 2] - '0';
  char text[32];
  std::snprintf(text, sizeof text, "0x%04X (class %d)", 1u << accessClass, accessClass);
  return text;
}

}  // namespace

SimCard::SimCard(Random random, const Cell& cell, Network home)
    : _random(random), _home(home), _number(cardNumber(_random, home)) {
  // Numbers in this range are reserved for fiction.
  _subscriberNumber = "+1212555" + std::to_string(_random.between(1000100, 1000199)).substr(3);
  registerIn(cell);
}

void SimCard::registerIn(const Cell& cell) {
  _area = cell.area;
  _network = cell.network;
  _temporaryIdentity = static_cast<std::uint32_t>(_random.between(0x10000000, 0x3FFFFFFF));
  _packetTemporaryIdentity = static_cast<std::uint32_t>(_random.between(0xC0000000, 0xFFFFFFFE));
}

Value SimCard::files() const {
  Value files = Value::ofDictionary();
  Dictionary& texts = *files.dictionary();
  texts.set("kSimFile_ICCID", _number);
  texts.set("kSimFile_MSISDN", _subscriberNumber);
  texts.set("kSimFile_MBDN", "+12125550100");
  texts.set("kSimFile_HPPLMN", "5 (30 minutes)");
  texts.set("kSimFile_LOCI", locationText("TMSI", _temporaryIdentity, "LAI", _network, _area));
  texts.set("kSimFile_PSLOCI", locationText("P-TMSI", _packetTemporaryIdentity, "RAI", _network, _area));
  texts.set("kSimFile_ACC", accessClassText(_number));
  const std::string home = codeText(_home);
  texts.set("kSimFile_AD", "Normal operation, MNC of " + std::to_string(_home.networkCodeDigits) + " digits");
  texts.set("kSimFile_FPLMN", "001-02, 001-03");
  texts.set("kSimFile_AHPLMN", home);
  texts.set("kSimFile_RATMODE", "LTE, UMTS, GSM");
  texts.set("kSimFile_PNN", _home == homeNetwork ? "Test Network" : "Partner Network");
  texts.set("kSimFile_OPL", home + ", areas 0000 to FFFE, name 1");
  texts.set("kSimFile_OPLMNAcT", home + " (LTE, UMTS, GSM)");
  return files;
}

}  // namespace varnel::simulation

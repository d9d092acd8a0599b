#include "programs/varnel-decode/TechnologyGuess.h"

#include <algorithm>
#include <cinttypes>
#include <cstdio>

#include "LogGenerator/LogGenerator.h"
#include "base/PropertyList.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::size_t mostExamples = 256;
constexpr std::size_t longestExample = 1 << 20;
constexpr std::size_t mostCodesTold = 4;

bool isKnown(const MessageFate& fate) {
  return fate.outcome == MessageFate::Outcome::Decoded ||
         (fate.logCode && fate.outcome != MessageFate::Outcome::Unknown);
}

// SIM files and the like do not come from the modem, and every packet technology knows them.
bool isSystemMessage(const MessageFate& fate) {
  constexpr std::uint32_t largestModemCode = 0xFFFF;
  return fate.logCode && *fate.logCode > largestModemCode;
}

std::string joined(const std::vector<std::string>& names, const char* separator) {
  std::string text;
  for (const std::string& name : names) text += (text.empty() ? "" : separator) + name;
  return text;
}

}  // namespace

void TechnologyGuess::take(ByteView message, const MessageFate& fate) {
  if (isSystemMessage(fate)) return;
  ++_count;
  if (isKnown(fate)) {
    _isAnyKnown = true;
    _examples.clear();
    return;
  }
  const auto found = _examples.find(fate.logCode);
  if (found != _examples.end()) {
    ++found->second.count;
  } else if (_examples.size() < mostExamples && message.size() <= longestExample) {
    _examples.emplace(fate.logCode, Example{Bytes(message.begin(), message.end()), 1});
  }
}

// A generator of object messages knows no log codes. There it counts whether the messages are objects.
std::uint64_t TechnologyGuess::knownTo(const std::string& technology, const Services& services) const {
  const bool takesObjects = technology == technology::ifxGSM;
  const auto generator = LogGenerator::generatorFromTechnology(technology, services);
  std::uint64_t count = 0;
  for (const auto& [logCode, example] : _examples) {
    const bool isTaken = takesObjects ? readPropertyList(example.message, messageLimits).has_value()
                                      : isKnown(generator->fateOf(example.message));
    if (isTaken) count += example.count;
  }
  return count;
}

std::vector<std::string> TechnologyGuess::likeliest(const std::vector<std::string>& technologies,
                                                    const Services& services) const {
  std::vector<std::string> names;
  std::uint64_t most = 1;
  bool isKnownToAllRadios = false;
  for (const std::string& technology : technologies) {
    const std::uint64_t count = knownTo(technology, services);
    // It knows what the others know, and more, so it would hide which modem it was.
    if (technology == technology::allRadios) {
      isKnownToAllRadios = count > 0;
      continue;
    }
    if (count < most) continue;
    if (count > most) names.clear();
    most = count;
    names.push_back(technology);
  }
  if (isKnownToAllRadios) names.emplace(names.begin(), technology::allRadios);
  return names;
}

std::string TechnologyGuess::logCodes() const {
  std::vector<std::string> codes;
  for (const auto& [logCode, example] : _examples) {
    if (!logCode) continue;
    char text[16];
    std::snprintf(text, sizeof text, "0x%04" PRIX32, *logCode);
    codes.push_back(codes.size() == mostCodesTold ? "…" : text);
    if (codes.size() > mostCodesTold) break;
  }
  return codes.empty() ? std::string() : " (log codes " + joined(codes, ", ") + ")";
}

std::string TechnologyGuess::sentence(const std::string& captureName, const std::string& technology,
                                      const std::vector<std::string>& technologies,
                                      const Services& services) const {
  const auto names = likeliest(technologies, services);
  return technology + " knows none of the " + std::to_string(_count) + " modem messages of " + captureName +
         logCodes() +
         (names.empty() ? "; nor does any other technology" : "; try --technology " + joined(names, " or "));
}

}  // namespace varnel

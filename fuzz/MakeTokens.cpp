#include <cstdio>
#include <exception>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <ostream>
#include <set>
#include <stdexcept>
#include <string>

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/LogMessage.h"
#include "host/FileResources.h"
#include "host/SystemClock.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

// The log codes of all decoders of all technologies.
std::set<std::uint32_t> logCodes(const fs::path& resourceFolder) {
  const FileResources resources(resourceFolder);
  const SystemClock clock;
  const ApplicationInfo application;
  std::ostream nowhere(nullptr);
  std::set<std::uint32_t> codes;
  for (const std::string_view technology : LogGenerator::technologies()) {
    const auto generator =
        LogGenerator::generatorFromTechnology(technology, {resources, clock, application, nowhere});
    for (const CodeSections& entry : generator->codeSections()) codes.insert(entry.logCode);
  }
  if (codes.empty()) throw std::runtime_error("no decoder has a log code");
  return codes;
}

// The packet header with this log code, as a word of a dictionary: length and time are 0.
std::string headerWord(std::uint32_t code) {
  const unsigned type =
      code < LogMessage::extraCodeBase ? LogMessage::modemLogType : LogMessage::extraLogType;
  char word[64];
  std::snprintf(word, sizeof word, "\"\\x%02X\\x00\\x00\\x%02X\\x%02X", type, code & 0xFFU,
                code >> 8 & 0xFFU);
  std::string text = word;
  while (text.size() < 1 + 4 * Packet::headerSize) text += "\\x00";
  return text + "\"\n";
}

void makeTokens(const fs::path& resourceFolder, const fs::path& wordsPath, const fs::path& tokensPath) {
  std::ifstream file(wordsPath, std::ios::binary);
  std::string tokens(std::istreambuf_iterator<char>(file), {});
  if (!file || tokens.empty()) throw std::runtime_error("cannot read " + wordsPath.string());
  tokens += "\n# The packet header of each log code\n";
  for (const std::uint32_t code : logCodes(resourceFolder)) tokens += headerWord(code);
  std::ofstream written(tokensPath, std::ios::binary);
  if (!(written << tokens).flush()) throw std::runtime_error("cannot write " + tokensPath.string());
}

}  // namespace

}  // namespace varnel

// Writes the words of a file and the packet headers of all decoders as the dictionary of the fuzzer.
int main(int argumentCount, char** arguments) {
  if (argumentCount != 4) {
    std::fprintf(stderr, "usage: %s RESOURCES WORDS TOKENS\n", arguments[0]);
    return 2;
  }
  try {
    varnel::makeTokens(arguments[1], arguments[2], arguments[3]);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 1;
  }
  return 0;
}

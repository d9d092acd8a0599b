#include "LogGenerator/ClassIndex.h"

#include <algorithm>
#include <ostream>

#include "base/Log.h"

namespace varnel {

void CodeDictionary::subscribe(std::uint32_t code, Base& decoder) {
  auto& [decoders, shortestTaken] = _subscriptions[code];
  const std::size_t shortest = decoder.minimumLength(code);
  shortestTaken = decoders.empty() ? shortest : std::min(shortestTaken, shortest);
  if (decoders.empty()) _codes.push_back(code);
  decoders.push_back(&decoder);
}

const CodeDictionary::Subscription* CodeDictionary::subscription(std::uint32_t code) const {
  const auto found = _subscriptions.find(code);
  return found == _subscriptions.end() ? nullptr : &found->second;
}

std::span<Base* const> CodeDictionary::subscribers(std::uint32_t code) const {
  const Subscription* found = subscription(code);
  return found ? std::span<Base* const>(found->decoders) : std::span<Base* const>();
}

std::vector<std::string> CodeDictionary::keys() const {
  std::vector<std::string> texts;
  for (const std::uint32_t code : _codes) texts.push_back(std::to_string(code));
  return texts;
}

ClassIndex::~ClassIndex() { _standardOutput << "Deallocing ClassIndex\n"; }

Base* ClassIndex::getClass(std::string_view sectionName) const {
  const auto found = classDict.find(sectionName);
  return found == classDict.end() ? nullptr : found->second;
}

std::vector<CodeSections> ClassIndex::codeSections() const {
  std::vector<CodeSections> list;
  for (const std::uint32_t code : codeDictionary.codes()) {
    CodeSections& entry = list.emplace_back(CodeSections{code, {}});
    for (const Base* decoder : getSubscribers(code)) {
      const std::string_view name = decoder->getSectionName();
      if (std::ranges::find(entry.sections, name) == entry.sections.end()) entry.sections.emplace_back(name);
    }
  }
  return list;
}

void ClassIndex::listNumberFormats(NumberFormats& formats) const {
  for (const auto& [sectionName, decoder] : classDict) {
    SectionFormats section(formats, sectionName);
    decoder->listNumberFormats(section);
  }
}

void ClassIndex::status() const {
  // The class dictionary has been a dictionary, and no string, ever since the compiler knows its type.
  logWarning("Dictionary = %d", 1);
  logWarning("String = %d", 0);
}

}  // namespace varnel

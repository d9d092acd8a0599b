#include "LogGenerator/ClassIndex.h"

#include <algorithm>
#include <ostream>

#include "base/Log.h"

namespace varnel {

void CodeDictionary::subscribe(std::uint32_t code, const Subscriber& subscriber) {
  auto& [subscribers, shortestTaken] = _subscriptions[code];
  const std::size_t shortest = subscriber.handler ? subscriber.handler->minimumLength : 0;
  shortestTaken = subscribers.empty() ? shortest : std::min(shortestTaken, shortest);
  if (subscribers.empty()) _codes.push_back(code);
  subscribers.push_back(subscriber);
}

const CodeDictionary::Subscription* CodeDictionary::subscription(std::uint32_t code) const {
  const auto found = _subscriptions.find(code);
  return found == _subscriptions.end() ? nullptr : &found->second;
}

// Kept: "Deallocing" is no word.
ClassIndex::~ClassIndex() { _standardOutput << "Deallocing ClassIndex\n"; }

Base* ClassIndex::getClass(std::string_view sectionName) const {
  const auto found = classDict.find(sectionName);
  return found == classDict.end() ? nullptr : found->second;
}

std::vector<Base*> ClassIndex::getSubscribers(std::uint32_t code) const {
  std::vector<Base*> decoders;
  if (const auto* found = subscription(code)) {
    for (const Subscriber& subscriber : found->subscribers) decoders.push_back(subscriber.decoder);
  }
  return decoders;
}

std::vector<std::string> ClassIndex::getAllLogCodes() const {
  std::vector<std::string> texts;
  for (const std::uint32_t code : logCodes()) texts.push_back(std::to_string(code));
  return texts;
}

std::vector<CodeSections> ClassIndex::codeSections() const {
  std::vector<CodeSections> list;
  for (const std::uint32_t code : logCodes()) {
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
  // Kept: the class dictionary is always a dictionary and never a string, and two lines say so.
  logWarning("Dictionary = %d", 1);
  logWarning("String = %d", 0);
}

}  // namespace varnel

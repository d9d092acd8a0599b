#pragma once

#include <cstddef>
#include <cstdint>
#include <iosfwd>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/Base.h"
#include "LogGenerator/CodeSections.h"
#include "LogGenerator/NumberFormats.h"

namespace varnel {

/// A decoder that wants a log code, with its handler if it has one.
struct Subscriber {
  Base* decoder;
  const PacketHandler* handler;

  void deliver(const Packet& packet, std::uint32_t logCode) const {
    if (handler) return decoder->decode(packet, *handler);
    decoder->updateWithData_logCode(packet, logCode);
  }
};

/// Log code → the decoders that subscribed to it, in the order of their subscription. Codes keep the order in
/// which they were first subscribed to.
class CodeDictionary {
 public:
  struct Subscription {
    std::vector<Subscriber> subscribers;
    /// The length of the shortest packet, header included, that at least one of them takes.
    std::size_t shortestTaken = 0;
  };

  /// A decoder that subscribes twice receives each packet twice.
  void subscribe(std::uint32_t code, const Subscriber& subscriber);
  /// Null for a code without subscribers.
  const Subscription* subscription(std::uint32_t code) const;
  std::span<const std::uint32_t> codes() const { return _codes; }

 private:
  std::vector<std::uint32_t> _codes;
  std::unordered_map<std::uint32_t, Subscription> _subscriptions;
};

/// The base of the class index of each technology, which creates every decoder of its technology once.
class ClassIndex {
 public:
  explicit ClassIndex(std::ostream& standardOutput) : _standardOutput(standardOutput) {}
  ClassIndex(const ClassIndex&) = delete;
  ClassIndex& operator=(const ClassIndex&) = delete;
  /// Writes "Deallocing ClassIndex" to standard output.
  virtual ~ClassIndex();

  /// The decoder of this section; null when there is none.
  Base* getClass(std::string_view sectionName) const;
  /// Null for a code without subscribers.
  const CodeDictionary::Subscription* subscription(std::uint32_t code) const {
    return codeDictionary.subscription(code);
  }
  /// The decoders that want the code, in the order of their subscription.
  std::vector<Base*> getSubscribers(std::uint32_t code) const;
  /// Every subscribed code; the same as decimal texts.
  std::span<const std::uint32_t> logCodes() const { return codeDictionary.codes(); }
  std::vector<std::string> getAllLogCodes() const;
  /// The section with this container; null when there is none.
  template <class Container>
  const Section* sectionIn(const Container& container) const {
    for (const auto& [name, decoder] : classDict) {
      if (decoder->section().holds(container)) return &decoder->section();
    }
    return nullptr;
  }
  /// Every subscribed code with the sections of its subscribers. Each section comes once.
  std::vector<CodeSections> codeSections() const;
  /// Adds the formats of all decoders' sections.
  void listNumberFormats(NumberFormats& formats) const;
  /// Tells all decoders that a display is about to be made.
  void prepareDisplay(const Time& now) const {
    for (const auto& [name, decoder] : classDict) decoder->prepareDisplay(now);
  }
  /// For debugging: logs the kind of object of the class dictionary.
  void status() const;

 protected:
  /// Creates a decoder and registers it. Each decoder gets what the decoders of an index share.
  template <class Decoder, class... Shared>
  std::unique_ptr<Decoder> create(Shared&... shared) {
    auto decoder = std::make_unique<Decoder>(shared...);
    decoder->initWithDict_codeDict(classDict, codeDictionary);
    return decoder;
  }
  std::ostream& standardOutput() const { return _standardOutput; }

 private:
  ClassDictionary classDict;
  CodeDictionary codeDictionary;
  std::ostream& _standardOutput;
};

}  // namespace varnel

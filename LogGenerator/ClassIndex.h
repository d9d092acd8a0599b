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

/// Who wants a log code: a decoder, with its handler if it has one.
struct Subscriber {
  Base* decoder;
  const PacketHandler* handler;

  void deliver(const Packet& packet, std::uint32_t logCode) const {
    if (handler) return decoder->decode(packet, *handler);
    decoder->updateWithData_logCode(packet, logCode);
  }
};

/// Log code → the decoders subscribed to it, in the order of their subscription. Codes keep the order in
/// which they were first subscribed to.
class CodeDictionary {
 public:
  struct Subscription {
    std::vector<Subscriber> subscribers;
    /// The shortest packet, header included, that one of them does not drop unread.
    std::size_t shortestTaken = 0;
  };

  /// A decoder that subscribes twice receives each packet twice.
  void subscribe(std::uint32_t code, const Subscriber& subscriber);
  /// Null for a code that nobody wants.
  const Subscription* subscription(std::uint32_t code) const;
  std::span<const std::uint32_t> codes() const { return _codes; }

 private:
  std::vector<std::uint32_t> _codes;
  std::unordered_map<std::uint32_t, Subscription> _subscriptions;
};

/// The root of the per-technology indexes, which create every decoder of their technology once.
class ClassIndex {
 public:
  explicit ClassIndex(std::ostream& standardOutput) : _standardOutput(standardOutput) {}
  ClassIndex(const ClassIndex&) = delete;
  ClassIndex& operator=(const ClassIndex&) = delete;
  /// Writes "Deallocing ClassIndex" to standard output.
  virtual ~ClassIndex();

  /// The decoder of that section; null when there is none.
  Base* getClass(std::string_view sectionName) const;
  /// Null when nobody wants the code.
  const CodeDictionary::Subscription* subscription(std::uint32_t code) const {
    return codeDictionary.subscription(code);
  }
  /// The decoders that want the code, in the order of their subscription.
  std::vector<Base*> getSubscribers(std::uint32_t code) const;
  /// Every subscribed code, and the same as decimal texts.
  std::span<const std::uint32_t> logCodes() const { return codeDictionary.codes(); }
  std::vector<std::string> getAllLogCodes() const;
  /// The section that has that container; null when none has.
  template <class Container>
  const Section* sectionIn(const Container& container) const {
    for (const auto& [name, decoder] : classDict) {
      if (decoder->section().holds(container)) return &decoder->section();
    }
    return nullptr;
  }
  /// Every subscribed code with the sections of its subscribers, each once.
  std::vector<CodeSections> codeSections() const;
  /// How the sections of all decoders write numbers.
  void listNumberFormats(NumberFormats& formats) const;
  /// A debugging aid: logs what kind of object the class dictionary is.
  void status() const;

 protected:
  /// Creates a decoder and registers it. What the decoders of an index share is handed to each.
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

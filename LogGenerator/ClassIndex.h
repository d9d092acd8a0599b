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

/// Log code → the decoders subscribed to it, in the order of their subscription. Codes keep the order in
/// which they were first subscribed to.
class CodeDictionary {
 public:
  /// Who wants a code.
  struct Subscription {
    std::vector<Base*> decoders;
    /// The shortest packet, header included, that one of them does not drop unread.
    std::size_t shortestTaken = 0;
  };

  /// A decoder that subscribes twice receives each packet twice.
  void subscribe(std::uint32_t code, Base& decoder);
  /// Null for a code that nobody wants.
  const Subscription* subscription(std::uint32_t code) const;
  /// Empty for a code that nobody wants.
  std::span<Base* const> subscribers(std::uint32_t code) const;
  std::span<const std::uint32_t> codes() const { return _codes; }
  /// The codes as decimal texts.
  std::vector<std::string> keys() const;

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
  /// Empty when nobody wants the code.
  std::span<Base* const> getSubscribers(std::uint32_t code) const { return codeDictionary.subscribers(code); }
  /// Every subscribed code as decimal text.
  std::vector<std::string> getAllLogCodes() const { return codeDictionary.keys(); }
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

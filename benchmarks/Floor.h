#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "base/Bytes.h"
#include "base/Value.h"

namespace varnel {

/// The least that the decoding of a message can cost. It reads the message's bytes, lets the library parse a
/// property list in it, and writes the texts that the generator shows for it into one buffer on the stack. It
/// formats numbers, and uses no dictionary.
class Floor {
 public:
  /// Adds a message. The texts that it makes are those that `takeTexts` finds after the generator has decoded
  /// it.
  void learn(ByteView message, bool isObject, const std::vector<std::string>& texts);
  /// Does the least for the message with this index. The result depends on all bytes that were read and
  /// written.
  std::uint64_t run(std::size_t message) const;
  std::size_t size() const { return _messages.size(); }

 private:
  // One text: what is around its number, if it has one.
  struct Text {
    enum class Kind { Plain, Integer, Real } kind = Kind::Plain;
    std::string before{}, after{};
    std::int64_t integer = 0;
    double real = 0;
    int precision = 0;
  };
  struct Message {
    Bytes bytes;
    std::size_t listOffset;  // where its property list begins; its size if it has none
    std::vector<Text> texts;
  };

  static Text split(const std::string& text);
  static char* write(const Text& text, char* out, char* end);

  std::vector<Message> _messages;
};

/// Empties the lists of a display and marks its texts, so that `takeTexts` can tell which ones the next
/// message sets.
void markTexts(const Value& display);
/// The texts of a display that were set since they were marked.
std::vector<std::string> takeTexts(const Value& display);

}  // namespace varnel

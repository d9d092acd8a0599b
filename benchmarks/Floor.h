#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "base/Bytes.h"
#include "base/Value.h"

namespace varnel {

/// What the decoding of a message costs at the least: its bytes are read, a property list in it is parsed by
/// the library, and the texts that the generator shows for it are written anew into one buffer on the stack,
/// numbers as numbers, without any dictionary.
class Floor {
 public:
  /// Learns the message: which texts it makes are those that `takeTexts` finds after the generator had it.
  void learn(ByteView message, bool isObject, const std::vector<std::string>& texts);
  /// Does the least for the message of that number. The result depends on all that was read and written.
  std::uint64_t run(std::size_t message) const;
  std::size_t size() const { return _messages.size(); }

 private:
  // One text: what stands around its number, if it has one.
  struct Text {
    enum class Kind { Plain, Integer, Real } kind = Kind::Plain;
    std::string before{}, after{};
    std::int64_t integer = 0;
    double real = 0;
    int precision = 0;
  };
  struct Message {
    Bytes bytes;
    std::size_t listOffset;  // where its property list begins; its size when it has none
    std::vector<Text> texts;
  };

  static Text split(const std::string& text);
  static char* write(const Text& text, char* out, char* end);

  std::vector<Message> _messages;
};

/// Empties the lists of a display and marks its texts, so that the next message's own can be told.
void markTexts(const Value& display);
/// The texts of a display that were set since they were marked.
std::vector<std::string> takeTexts(const Value& display);

}  // namespace varnel

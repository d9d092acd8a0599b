#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "LogGenerator/MessageFate.h"
#include "LogGenerator/Services.h"
#include "base/Bytes.h"

namespace varnel {

/// Guesses the technology of a capture when the one that the user named knows none of its messages.
class TechnologyGuess {
 public:
  /// Takes a message and what becomes of it. A message with a known log code is known, whatever its length.
  /// Messages that do not come from the modem are ignored.
  void take(ByteView message, const MessageFate& fate);

  /// Whether a modem's message was known. After that there is no need to take more.
  bool isAnyKnown() const { return _isAnyKnown; }
  /// Whether there were messages of a modem, and none of them was known.
  bool isNeeded() const { return _count > 0 && !_isAnyKnown; }

  /// One sentence that names the log codes, and the technologies that know most of the messages: first that
  /// of all radios, if it knows any, then those of one modem. It tries all technologies, so the log should
  /// have no sink.
  std::string sentence(const std::string& captureName, const std::string& technology,
                       const std::vector<std::string>& technologies, const Services& services) const;

 private:
  struct Example {
    Bytes message;  // the first message with its log code
    std::uint64_t count = 0;
  };

  std::uint64_t knownTo(const std::string& technology, const Services& services) const;
  std::vector<std::string> likeliest(const std::vector<std::string>& technologies,
                                     const Services& services) const;
  std::string logCodes() const;

  std::map<std::optional<std::uint32_t>, Example> _examples;  // by log code; absent for messages without one
  std::uint64_t _count = 0;
  bool _isAnyKnown = false;
};

}  // namespace varnel

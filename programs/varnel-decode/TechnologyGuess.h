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

/// Finds out what a capture is of when the technology that the user named knows none of its messages.
class TechnologyGuess {
 public:
  /// Takes a message and what becomes of it. A message of a known log code, whatever its length, is known;
  /// those that do not come from the modem tell nothing.
  void take(ByteView message, const MessageFate& fate);

  /// Whether a modem's message was known, after which there is no use in taking more.
  bool isAnyKnown() const { return _isAnyKnown; }
  /// Whether there were such messages, none of which was known.
  bool isNeeded() const { return _count > 0 && !_isAnyKnown; }

  /// A sentence that names the log codes and the technologies which know most of the messages. All
  /// technologies are tried out, so nobody should listen to the log.
  std::string sentence(const std::string& captureName, const std::string& technology,
                       const std::vector<std::string>& technologies, const Services& services) const;

 private:
  struct Example {
    Bytes message;  // the first of its log code
    std::uint64_t count = 0;
  };

  std::uint64_t knownTo(const std::string& technology, const Services& services) const;
  std::vector<std::string> likeliest(const std::vector<std::string>& technologies,
                                     const Services& services) const;
  std::string logCodes() const;

  std::map<std::optional<std::uint32_t>, Example> _examples;  // by log code, absent where there is none
  std::uint64_t _count = 0;
  bool _isAnyKnown = false;
};

}  // namespace varnel

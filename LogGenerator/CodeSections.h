#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace varnel {

/// The sections that the packets of one log code feed, in the order in which their decoders get the packet.
struct CodeSections {
  std::uint32_t logCode;
  std::vector<std::string> sections;

  friend bool operator==(const CodeSections&, const CodeSections&) = default;
};

}  // namespace varnel

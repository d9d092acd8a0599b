#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <set>

#include "programs/varnel-telephonyd/CodeFilter.h"
#include "programs/varnel-telephonyd/sources/PortCommands.h"

namespace varnel {

/// One mask per equipment. A count of 0 stands for no codes.
using CodeMasks = std::array<CodeMask, equipments>;

/// The modem's log codes that all viewers together have asked for.
class WantedCodes {
 public:
  /// Adds the codes of one viewer.
  void add(const CodeFilter& filter);
  bool isEmpty() const { return !_wantsAll && _codes.empty(); }
  /// The number of codes that were asked for by name.
  std::size_t size() const { return _codes.size(); }

  /// The codes that a modem with these numbers has. A mask goes up to its highest wanted code.
  CodeMasks masksFor(const CodeNumbers& numbers) const;
  /// How many of the codes asked for by name such a modem does not have.
  std::size_t missingFrom(const CodeNumbers& numbers) const;

  bool operator==(const WantedCodes&) const = default;

 private:
  bool _wantsAll = false;
  CodeFilter::Codes _codes;
};

}  // namespace varnel

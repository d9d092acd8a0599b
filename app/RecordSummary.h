#pragma once

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "model/Explanations.h"
#include "model/VarnelModelNode.h"

namespace varnel {

/// What a record of a list says in one line, such as "PCI 16", "−84.0 dBm", "−9.0 dB": what it is about, and
/// its main levels. A record without a level says something else that it shows.
struct RecordSummary {
  std::vector<std::string> parts{};    ///< the most important one first
  std::optional<SignalLevel> level{};  ///< how good the first of the levels is
};

/// The summaries of the records of one list. What the identities of several records all begin with, mostly
/// their channel, is left out.
class RecordSummaries {
 public:
  /// A level in a leaf.
  struct Level {
    std::string_view number;  ///< in decimal
    std::string_view unit;
    SignalLevel level;
  };
  /// The level that a leaf of a record shows; absent if it shows none.
  using LevelReader = std::function<std::optional<Level>(const VarnelModelNode& leaf)>;

  /// `around` is the section or group with the list, as for `identityOfRecord`.
  RecordSummaries(const VarnelModelNode& list, const VarnelModelNode& around);

  /// The record is one of the list.
  RecordSummary of(const VarnelModelNode& record, const LevelReader& levelIn) const;

 private:
  std::string identityOf(const VarnelModelNode& record) const;

  const VarnelModelNode& _list;
  const VarnelModelNode& _around;
  std::size_t _commonLength = 0;  // of the beginning that all identities have
};

}  // namespace varnel

#pragma once

#include <optional>
#include <string_view>

#include "base/Dictionary.h"
#include "base/Time.h"
#include "base/Value.h"

namespace varnel {

/// When packets last wrote what a display shows, by the clock of whoever decodes. The answers are absent for
/// what no packet has written, and for what nobody keeps a time of: that is as old as what it stands in.
class WriteTimes {
 public:
  virtual ~WriteTimes() = default;
  virtual std::optional<Time> writtenAt(const Dictionary& /*entries*/, std::string_view /*key*/) const {
    return std::nullopt;
  }
  virtual std::optional<Time> refilledAt(const Array& /*list*/) const { return std::nullopt; }
};

}  // namespace varnel

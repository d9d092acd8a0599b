#pragma once

#include <optional>
#include <string_view>

#include "base/Dictionary.h"
#include "base/Time.h"
#include "base/Value.h"

namespace varnel {

/// When packets last wrote what a display shows, by the decoder's clock. Absent for what no packet has
/// written since this generator began, and for what has no time of its own: that has the time of the
/// container around it.
class WriteTimes {
 public:
  virtual ~WriteTimes() = default;
  virtual std::optional<Time> writtenAt(const Dictionary& /*entries*/, std::string_view /*key*/) const {
    return std::nullopt;
  }
  virtual std::optional<Time> refilledAt(const Array& /*list*/) const { return std::nullopt; }
};

}  // namespace varnel

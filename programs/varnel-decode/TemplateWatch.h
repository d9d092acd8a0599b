#pragma once

#include <optional>
#include <string>

#include "platform/Resources.h"

namespace varnel {

/// Resources that remember which of them was requested but is missing. Without its display template a
/// technology shows nothing.
class TemplateWatch final : public Resources {
 public:
  explicit TemplateWatch(const Resources& resources) : _resources(resources) {}

  Value propertyList(std::string_view name) const override {
    Value list = _resources.propertyList(name);
    if (list.isAbsent() && !_missing) _missing = name;
    return list;
  }
  std::vector<std::string> propertyListPaths() const override { return _resources.propertyListPaths(); }

  /// The first one that was missing or unreadable; absent while there was none.
  const std::optional<std::string>& missing() const { return _missing; }

 private:
  const Resources& _resources;
  mutable std::optional<std::string> _missing;
};

}  // namespace varnel

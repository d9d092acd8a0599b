#pragma once

#include <string>

#include "platform/ui/UserInterface.h"
#include "terminal/Overlay.h"

namespace varnel {

/// An alert in the middle of the screen. Return, Escape, a blank, and a click close it.
class AlertBox final : public Overlay {
 public:
  explicit AlertBox(Alert alert) : _alert(std::move(alert)) {}

  Wish take(const Key& key) override;
  void paint(CellGrid& grid, const Glyphs& glyphs) override;
  Kind kind() const override { return Kind::Box; }

 private:
  const Alert _alert;
};

}  // namespace varnel

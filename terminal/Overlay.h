#pragma once

#include "terminal/CellGrid.h"
#include "terminal/Glyphs.h"
#include "terminal/Key.h"

namespace varnel {

/// Something above the panes that takes all keys.
class Overlay {
 public:
  enum class Wish { Stay, Close };

  virtual ~Overlay() = default;
  /// The overlay is destroyed after it wished to close.
  virtual Wish take(const Key& key) = 0;
  virtual void paint(CellGrid& grid, const Glyphs& glyphs) = 0;
};

}  // namespace varnel

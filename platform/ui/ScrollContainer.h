#pragma once

#include "platform/ui/Geometry.h"
#include "platform/ui/Label.h"

namespace varnel {

/// A part of a cell that scrolls sideways, the host's own way, as far as its content is wider than its frame.
/// Up and down movements go to the table around it, and clicks to the row.
class ScrollContainer {
 public:
  virtual ~ScrollContainer() = default;
  /// A new label on the content; it lives as long as the container.
  virtual Label& addLabel() = 0;
  virtual void setFrame(const Rect& frame) = 0;
  /// How far the content reaches. The position is kept as far as the new size allows.
  virtual void setContentSize(const Size& size) = 0;
};

}  // namespace varnel

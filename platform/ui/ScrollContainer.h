#pragma once

#include "platform/ui/Geometry.h"
#include "platform/ui/Label.h"

namespace varnel {

/// A part of a cell that scrolls sideways in the host's own way, as far as its content is wider than its
/// frame. Vertical movements go to the table around it, and clicks go to the row.
class ScrollContainer {
 public:
  virtual ~ScrollContainer() = default;
  /// Adds a label to the content. The label lives as long as the container.
  virtual Label& addLabel() = 0;
  virtual void setFrame(const Rect& frame) = 0;
  /// How far the content reaches. The scroll position stays, as far as the new size allows.
  virtual void setContentSize(const Size& size) = 0;
};

}  // namespace varnel

#pragma once

#include <QPixmap>
#include <QVariantAnimation>
#include <QWidget>

namespace varnel {

/// An animation of two pictures, of which one replaces the other, above the real content. It takes no input,
/// and deletes itself at the end.
class SlideOverlay final : public QWidget {
 public:
  enum class Movement {
    Forth,  ///< the new picture comes in from the right
    Back,   ///< the old picture leaves to the right
    Rise,   ///< the new picture comes up from below
    Sink,   ///< the old picture goes down
  };

  /// It covers this part of the parent.
  SlideOverlay(const QPixmap& former, const QPixmap& next, Movement movement, const QRect& part,
               QWidget& parent);

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  QPixmap _below;
  QPixmap _above;
  Movement _movement;
  QVariantAnimation _animation;
};

}  // namespace varnel

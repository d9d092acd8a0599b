#pragma once

#include <QPixmap>
#include <QVariantAnimation>
#include <QWidget>

namespace varnel {

/// One picture making way for another, above what is already there. It takes no input, and deletes itself
/// when the movement is over.
class SlideOverlay final : public QWidget {
 public:
  enum class Movement {
    Forth,  ///< the new one comes in from the right
    Back,   ///< the old one leaves to the right
    Rise,   ///< the new one comes up from below
    Sink,   ///< the old one goes down
  };

  /// As large as the parent.
  SlideOverlay(const QPixmap& former, const QPixmap& next, Movement movement, QWidget& parent);

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  QPixmap _below;
  QPixmap _above;
  Movement _movement;
  QVariantAnimation _animation;
};

}  // namespace varnel

#pragma once

#include <QAbstractButton>

namespace varnel {

/// A button that is a text in the accent color, large enough for a finger.
class TextButton final : public QAbstractButton {
  Q_OBJECT

 public:
  enum class Mark {
    None,
    Back,  ///< with an arrowhead before the text
  };

  explicit TextButton(Mark mark = Mark::None, QWidget* parent = nullptr);
  QSize sizeHint() const override;
  /// Wide enough for its mark only. The text is cut when there is no more room.
  QSize minimumSizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  int markWidth() const;
  QFont textFont() const;
  void paintMark(QPainter& painter) const;

  Mark _mark;
};

}  // namespace varnel

#pragma once

#include <QAbstractButton>

namespace varnel {

/// A button that is a painted sign, large enough for a finger. Its text is for tooltips and screen readers.
class GlyphButton final : public QAbstractButton {
  Q_OBJECT

 public:
  enum class Glyph { Play, Pause, Again, Close, Menu };

  explicit GlyphButton(QWidget* parent = nullptr);

  void setGlyph(Glyph glyph, const QString& text);
  Glyph glyph() const { return _glyph; }
  QSize sizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  Glyph _glyph = Glyph::Play;
};

}  // namespace varnel

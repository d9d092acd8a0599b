#pragma once

#include <QFont>
#include <QPainter>
#include <QRectF>
#include <QString>
#include <QWidget>
#include <optional>

#include "platform/ui/Label.h"

namespace varnel {

/// A label that a row paints. The row repaints only when something on the label has changed.
class PaintedLabel final : public Label {
 public:
  /// The row must outlive the label.
  explicit PaintedLabel(QWidget& row) : _row(row) {}

  void setFont(const Font& font) override;
  void setText(std::string_view text) override;
  std::string text() const override { return _text; }
  void setFrame(const Rect& frame) override;

  const QRectF& frame() const { return _frame; }
  const QString& shownText() const { return _shownText; }
  bool isEmpty() const { return _shownText.isEmpty(); }
  /// Where its letters end, which may be before the end of its frame. Without letters, where they would
  /// begin.
  double endOfText() const;
  /// Paints the text with the painter's pen.
  void paint(QPainter& painter) const;

 private:
  QWidget& _row;
  std::string _text;
  QString _shownText;
  QFont _font;
  QRectF _frame;
  mutable std::optional<double> _textWidth;  // absent until somebody asks
};

}  // namespace varnel

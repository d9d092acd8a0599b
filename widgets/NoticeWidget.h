#pragma once

#include <QString>
#include <QWidget>
#include <string_view>

namespace varnel {

/// The notice, over as many lines as it needs, on a ground of its own. It is hidden, and takes no room, while
/// there is nothing to tell. Screen readers learn of each change.
class NoticeWidget final : public QWidget {
 public:
  explicit NoticeWidget(QWidget* parent = nullptr);

  /// Plain text with a newline between its lines.
  void setText(std::string_view text);
  const QString& text() const { return _text; }
  /// Whether another widget shows the same notice, so that this one is hidden.
  void setShownElsewhere(bool isShownElsewhere);

  bool hasHeightForWidth() const override { return true; }
  int heightForWidth(int width) const override;
  QSize sizeHint() const override;
  QSize minimumSizeHint() const override;

 protected:
  /// Where the pane is too low for all lines, a tooltip has them.
  bool event(QEvent* event) override;
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  QString _text;
  bool _isShownElsewhere = false;
};

}  // namespace varnel

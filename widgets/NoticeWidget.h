#pragma once

#include <QString>
#include <QWidget>
#include <string_view>

namespace varnel {

/// What there is to tell, over as many lines as it takes, on a ground of its own. It is hidden, and takes no
/// room, while there is nothing. Screen readers are told of each change.
class NoticeWidget final : public QWidget {
 public:
  explicit NoticeWidget(QWidget* parent = nullptr);

  /// Plain text, its lines with a newline between them.
  void setText(std::string_view text);
  const QString& text() const { return _text; }

  bool hasHeightForWidth() const override { return true; }
  int heightForWidth(int width) const override;
  QSize sizeHint() const override;
  QSize minimumSizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  QString _text;
};

}  // namespace varnel

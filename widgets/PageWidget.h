#pragma once

#include <QVBoxLayout>
#include <QWidget>
#include <functional>
#include <memory>

#include "widgets/HeaderWidget.h"
#include "widgets/NoticeWidget.h"

namespace varnel {

/// A page above the stack: a title bar with a way back, and the content. Escape goes back too, unless the
/// content has a use for it. Tab stays inside the page.
class PageWidget final : public QWidget {
 public:
  struct Titles {
    QString page;
    QString below;  ///< of what the way back leads to
  };

  /// `close` is called when the user wants to go back.
  PageWidget(const Titles& titles, std::unique_ptr<QWidget> content, std::function<void()> close,
             QWidget& window);

  /// The notice above the content.
  NoticeWidget& notice() { return _notice; }
  QWidget& content() const { return *_content; }
  void takeKeyboard();

 protected:
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  bool focusNextPrevChild(bool next) override;

 private:
  QVBoxLayout _column;
  HeaderWidget _header;
  NoticeWidget _notice;
  QWidget* _content;  // a child
  std::function<void()> _close;
};

}  // namespace varnel

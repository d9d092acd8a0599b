#include "widgets/FileDrop.h"

#include <QDropEvent>
#include <QFile>
#include <QMimeData>
#include <QUrl>
#include <utility>

namespace varnel {

namespace {

// The path of the file; empty when there is not exactly one local file.
std::string pathIn(const QMimeData& data) {
  const auto urls = data.urls();
  if (urls.size() != 1 || !urls.front().isLocalFile()) return {};
  return QFile::encodeName(urls.front().toLocalFile()).toStdString();
}

}  // namespace

FileDrop::FileDrop(QWidget& target, std::function<void(const std::string& path)> take)
    : QObject(&target), _take(std::move(take)) {
  target.setAcceptDrops(true);
  target.installEventFilter(this);
}

bool FileDrop::eventFilter(QObject*, QEvent* event) {
  if (event->type() != QEvent::DragEnter && event->type() != QEvent::Drop) return false;
  auto& drop = static_cast<QDropEvent&>(*event);
  const std::string path = pathIn(*drop.mimeData());
  if (path.empty()) return false;
  // After a move the other program would delete the file.
  drop.setDropAction(Qt::CopyAction);
  drop.accept();
  if (event->type() == QEvent::Drop) _take(path);
  return true;
}

}  // namespace varnel

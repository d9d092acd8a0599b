#include "programs/shared/FileDialogs.h"

#include <QFileDialog>
#include <QScreen>

namespace varnel {

namespace {

// On a smaller screen the toolkit's own dialog has no room, or its buttons are below the edge.
constexpr int roomyWidth = 700, roomyHeight = 520;
// What the window manager draws around the dialog.
constexpr int roomForTitle = 32;

}  // namespace

void openWithinScreen(QFileDialog& dialog) {
  const QRect room = dialog.screen()->availableGeometry();
  if (room.width() < roomyWidth || room.height() < roomyHeight) {
    // The desktop's own dialog does not have them.
    for (const char* const name : {"sidebar", "lookInLabel", "fileTypeLabel", "fileNameLabel"}) {
      if (auto* const part = dialog.findChild<QWidget*>(QLatin1String(name))) part->hide();
    }
    dialog.setMinimumSize(1, 1);
    dialog.setGeometry(room.adjusted(0, roomForTitle, 0, 0));
    dialog.setWindowState(Qt::WindowMaximized);
  }
  dialog.open();
}

}  // namespace varnel

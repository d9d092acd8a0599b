#include "widgets/FirstSize.h"

namespace varnel {

namespace {

constexpr int widestPhone = 640;
// On a desktop the window is at first about as large as a phone's screen.
constexpr QSize preferredSize(480, 800);
// Of the room that there is; a window that nobody has made larger leaves some of the desktop to be seen.
constexpr double largestShare = 0.9;
// The title bar and the borders, which only become known when the window is there.
constexpr QSize largestFrame(16, 48);

}  // namespace

bool isTakenWhole(const QSize& available) { return available.width() <= widestPhone; }

QSize firstSize(const QSize& available, const std::optional<QSize>& last) {
  const QSize room = available - largestFrame;
  if (last) return last->boundedTo(room);
  const QSize share(static_cast<int>(room.width() * largestShare),
                    static_cast<int>(room.height() * largestShare));
  return preferredSize.boundedTo(share);
}

}  // namespace varnel

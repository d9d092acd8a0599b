#include "widgets/FirstSize.h"

namespace varnel {

namespace {

constexpr int widestPhone = 640;
// On a desktop the first window is about as large as a phone's screen.
constexpr QSize preferredSize(480, 800);
// The share of the available room. If the user has not made the window larger, a part of the desktop stays
// visible.
constexpr double largestShare = 0.9;
// The title bar and the borders, whose size is only known when the window exists.
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

#include "widgets/PanePlaces.h"

namespace varnel {

namespace {

// The left pane has this part of the width: the names of its rows tell more than their values.
constexpr int leftParts = 2;
constexpr int allParts = 5;
constexpr int lineWidth = 1;

}  // namespace

PanePlaces PanePlaces::in(const QRect& room, std::size_t panes) {
  if (panes < 2 || room.width() < narrowestForTwo) return {std::nullopt, room};
  const QRect top = partThatChanges(room);
  return {QRect(room.left(), room.top(), top.left() - room.left() - lineWidth, room.height()), top};
}

QRect PanePlaces::partThatChanges(const QRect& room) {
  if (room.width() < narrowestForTwo) return room;
  const int left = room.width() * leftParts / allParts;
  return room.adjusted(left, 0, 0, 0);
}

}  // namespace varnel

#pragma once

#include <QWidget>

#include "platform/ui/Animation.h"

namespace varnel {

/// Whether to animate a change of the widget: only if the caller wants it, the user can see the widget, and
/// the desktop has not switched animations off.
bool isShownHappening(const QWidget& widget, Animation animation);
/// Whether the desktop has animations switched on.
bool desktopWantsMotion();

}  // namespace varnel

#pragma once

#include <QWidget>

#include "platform/ui/Animation.h"

namespace varnel {

/// Whether a change of that widget is to be seen happening: only where the caller wants it, the user can see
/// it, and the desktop has not turned animations off.
bool isShownHappening(const QWidget& widget, Animation animation);
/// Whether the desktop wants things to move.
bool desktopWantsMotion();

}  // namespace varnel

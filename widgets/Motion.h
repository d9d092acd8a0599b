#pragma once

#include <QWidget>
#include <vector>

#include "platform/ui/Animation.h"
#include "widgets/DesktopSettings.h"

namespace varnel {

/// Whether to animate a change of the widget: only if the caller wants it, the user can see the widget, and
/// the desktop has not switched animations off.
bool isShownHappening(const QWidget& widget, Animation animation);
/// Whether the desktop has animations switched on: the toolkit's style has, and none of the settings below
/// says otherwise.
bool desktopWantsMotion();
/// Whether a setting of the desktop has switched animations off.
bool settingsForbidMotion();
/// The settings with which desktops switch animations off.
std::vector<DesktopSettings::Setting> motionSettings();

}  // namespace varnel

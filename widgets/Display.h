#pragma once

#include <string>

namespace varnel {

/// True when windows can probably be opened: the toolkit is told of a platform (QT_QPA_PLATFORM), or the
/// Wayland or X11 server that the environment names takes connections.
bool displayIsThere();

/// What the environment says of the display, such as "DISPLAY=:0"; empty when it says nothing.
std::string wantedDisplay();

}  // namespace varnel

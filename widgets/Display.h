#pragma once

#include <string>

namespace varnel {

/// True when windows can probably be opened: QT_QPA_PLATFORM names a platform, or the Wayland or X11 server
/// in the environment accepts connections.
bool displayIsThere();

/// The environment variable that names the display, such as "DISPLAY=:0"; empty when there is none.
std::string wantedDisplay();

}  // namespace varnel

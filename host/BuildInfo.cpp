#include "host/BuildInfo.h"

namespace varnel {

ApplicationInfo applicationInfo() { return {VARNEL_VERSION, __DATE__ " " __TIME__}; }

}  // namespace varnel

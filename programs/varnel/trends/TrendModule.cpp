#include "programs/varnel/trends/TrendPageWidget.h"

extern "C" varnel::TrendPage* varnelMakeTrendPage(varnel::TrendSource& source) {
  return new varnel::TrendPageWidget(source);
}

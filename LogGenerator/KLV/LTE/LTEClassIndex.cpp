#include "LogGenerator/KLV/LTE/LTEClassIndex.h"

#include <ostream>

namespace varnel {

LTEClassIndex::LTEClassIndex(std::ostream& standardOutput) : ClassIndex(standardOutput) {}

// Kept: "Deallocing" is no word.
LTEClassIndex::~LTEClassIndex() { standardOutput() << "Deallocing LTEClassIndex\n"; }

}  // namespace varnel

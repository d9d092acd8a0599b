#pragma once

#include "app/TreeChanges.h"
#include "app/ValueHistory.h"

namespace varnel {

/// What panes show of a row beside its texts. Both outlive the panes; null where nothing is known.
struct RowFacts {
  const TreeChanges* changes = nullptr;
  const ValueHistory* history = nullptr;
};

}  // namespace varnel

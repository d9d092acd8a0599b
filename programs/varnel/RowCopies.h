#pragma once

#include <string>

#include "app/TreeSearch.h"
#include "model/VarnelModelNode.h"

namespace varnel {

/// What users copy of a row. `names` lead from below the root to the row.

/// The value; of a row that leads to others, its section as text.
std::string copyOfValue(const VarnelModelNode& root, const NamePath& names);
/// Name and value with a tab between them, so that a spreadsheet takes them as two columns; only the name of
/// a row that leads to others.
std::string copyOfRow(const VarnelModelNode& root, const NamePath& names);
/// The section: what the row leads to, or else what the row is in. As lines of text.
std::string copyOfSectionAsText(const VarnelModelNode& root, const NamePath& names);
/// The section in the form of `varnel-decode --format json`.
std::string copyOfSectionAsJson(const VarnelModelNode& root, const NamePath& names);

}  // namespace varnel

#pragma once

#include "LogGenerator/NumberFormats.h"
#include "app/TreeSearch.h"
#include "platform/ui/RecordList.h"

namespace varnel {

/// Whether the node is a list whose rows are all records. A list without any rows does not tell.
bool isListOfRecords(const VarnelModelNode& node);

/// The records of the list under these names, with a column per leaf; the columns have the order in which the
/// records first name them. A number comes from the formats, or it is what a text begins with. Nothing when
/// there is no list.
std::optional<RecordList> recordsOf(const VarnelModelNode& root, const NamePath& path,
                                    const NumberFormats& formats);

}  // namespace varnel

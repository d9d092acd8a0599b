#pragma once

#include <string>
#include <string_view>

#include "model/VarnelModelNode.h"

namespace varnel {

/// What a record of a list is about, such as "EARFCN 1300, PCI 16". The number of a record in its list says
/// nothing: the strongest cell comes first, and another one is the strongest later.
struct RecordIdentity {
  std::string text;  ///< empty when nothing in the record tells what it is about
  /// The same for the record's own rows. Another one only for a channel whose rows are about its serving
  /// cell: the lists of this channel do not change with that cell.
  std::string ownRows;
};

/// The identity of a record. `list` is the list with the record, and `around` the section or group with the
/// list: the records of some lists are on the channel that a section beside the list shows. Records of other
/// lists have no identity, such as messages.
RecordIdentity identityOfRecord(const VarnelModelNode& record, const VarnelModelNode& list,
                                const VarnelModelNode& around);

/// Whether the texts of this list differ by their places alone, so that a place is an identity.
bool placesAreIdentities(std::string_view list);

}  // namespace varnel

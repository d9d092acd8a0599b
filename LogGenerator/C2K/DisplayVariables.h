#pragma once

#include <span>
#include <string_view>

#include "LogGenerator/Field.h"
#include "platform/Dictionary.h"
#include "platform/Value.h"

namespace varnel::c2k {

// Display variables are the names under which decoders publish what they find. The lookup has an array for
// each variable that the template names: its placements {"key": a row, "dict": the dictionary that holds it}.

/// The mark, as key and as text, of a dictionary whose rows are ordered by key.
inline constexpr std::string_view sortedMark = "_sorted";

/// Adds a placement of the variable: a row of a section, which is a dictionary.
void addPlacement(Dictionary& lookup, std::string_view variable, std::string_view key, const Value& section);

/// Shows a value in every place of its variable, in their order, up to the first that is none; nowhere when
/// the lookup does not know the variable.
void storeDisplayValue(std::string_view variable, const Value& value, const Dictionary& lookup);
/// The same with a text, which takes the room of the text that stands there.
void storeDisplayText(std::string_view variable, std::string_view text, const Dictionary& lookup);
/// The same with a computed number, by a format made by `real`.
void storeDisplayNumber(std::string_view variable, const Format& format, double number,
                        const Dictionary& lookup);
/// Shows the fields of a packet, whose labels are variables, in the order of the table.
void storeDisplayFields(const Packet& packet, std::span<const Field> fields, const Dictionary& lookup);

}  // namespace varnel::c2k

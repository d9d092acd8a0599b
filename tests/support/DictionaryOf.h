#pragma once

#include <initializer_list>

#include "base/Dictionary.h"

namespace varnel {

/// A new dictionary with these entries, in this order.
inline Value dictionaryOf(std::initializer_list<Dictionary::Entry> entries) {
  Value made = Value::ofDictionary();
  for (const Dictionary::Entry& entry : entries) made.dictionary()->set(entry.key, entry.value);
  return made;
}

}  // namespace varnel

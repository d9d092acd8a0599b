#pragma once

#include <cstdint>
#include <initializer_list>
#include <utility>

#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {

/// A message with cell-monitor records, header included.
inline Bytes cellMonitorMessage(Array records) {
  return serverMessage(0xFF0001, Value::ofArray(std::move(records)));
}

/// A cell-monitor record with this technology, this cell type, and these entries.
inline Value cellRecord(const char* technology, const char* type,
                        std::initializer_list<Dictionary::Entry> entries = {}) {
  Value record = dictionaryOf({{"RadioAccessTechnology", technology}, {"CellType", type}});
  for (const Dictionary::Entry& entry : entries) record.dictionary()->set(entry.key, entry.value);
  return record;
}

inline Dictionary::Entry number(const char* key, std::int64_t value) {
  return {key, Value::ofInteger(value)};
}

/// Elements that are no valid records: other values, and dictionaries that lack the technology or the cell
/// type or have no text there. Each has all these entries where possible.
inline Array elementsThatAreNoRecords(const char* technology, const char* type,
                                      std::initializer_list<Dictionary::Entry> entries) {
  const auto record = [&] { return cellRecord(technology, type, entries); };
  const Value noTechnology = record();
  noTechnology.dictionary()->remove("RadioAccessTechnology");
  const Value noType = record();
  noType.dictionary()->remove("CellType");
  const Value technologyOfNoText = record();
  technologyOfNoText.dictionary()->set("RadioAccessTechnology", Value::ofInteger(1));
  const Value typeOfNoText = record();
  typeOfNoText.dictionary()->set("CellType", Value::ofArray({type}));
  return {"no record",
          Value::ofInteger(7),
          Value::ofBoolean(true),
          Value::ofArray({record()}),
          Value::ofDictionary(),
          noTechnology,
          noType,
          technologyOfNoText,
          typeOfNoText};
}

}  // namespace varnel

#include "LogGenerator/Radios/Modem/OtherCells.h"

#include <algorithm>
#include <vector>

#include "LogGenerator/Radios/Modem/CellRows.h"
#include "platform/ModemReport.h"

namespace varnel::modem {

namespace {

Value recordOf(const Radio& radio, const Dictionary& cell) {
  Value record = Value::ofDictionary();
  Dictionary& entries = *record.dictionary();
  entries.setText("Radio", radio.name);
  entries.setText("Type", isServing(cell) ? modemReport::serving : modemReport::neighbor);
  Formatter formatter;
  for (const CellRow& row : radio.rows) {
    const std::string text = textOf(cell, row, formatter);
    if (!text.empty()) entries.setText(row.label, text);
  }
  return record;
}

}  // namespace

void OtherCells::listNumberFormats(SectionFormats& formats) const {
  for (const Radio& radio : radios()) listFormats(radio, formats);
}

void OtherCells::show(const Dictionary& report) {
  std::vector<const Radio*> radiosThatServe;
  Array records;
  forEachCell(report, [&](const Radio& radio, const Dictionary& cell) {
    if (isServing(cell) && std::ranges::find(radiosThatServe, &radio) == radiosThatServe.end())
      return radiosThatServe.push_back(&radio);
    records.push_back(recordOf(radio, cell));
  });
  sectionRef.refill([&](Array& list) { list = std::move(records); });
}

}  // namespace varnel::modem

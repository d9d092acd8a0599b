#include "LogGenerator/Radios/Modem/ServingCell.h"

namespace varnel::modem {

void ServingCell::show(const Dictionary& report) {
  const Dictionary* const cell = servingCellIn(report, _radio);
  Formatter formatter;
  for (const CellRow& row : _radio.rows)
    sectionRef.setText(row.label, cell ? textOf(*cell, row, formatter) : std::string());
}

}  // namespace varnel::modem

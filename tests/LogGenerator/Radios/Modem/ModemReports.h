#pragma once

#include <initializer_list>
#include <string>
#include <utility>

#include "LogGenerator/Radios/Modem/ReportDecoder.h"
#include "base/Bytes.h"
#include "platform/ModemReport.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {

/// A modem report of the known version with these entries.
inline Bytes modemReportOf(std::initializer_list<Dictionary::Entry> entries) {
  Value report = dictionaryOf(entries);
  report.dictionary()->set("Version", Value::ofInteger(1));
  return serverMessage(0xFF0003, report);
}
inline Bytes reportOfCells(Array cells) {
  return modemReportOf({{"Cells", Value::ofArray(std::move(cells))}});
}
/// A cell of this radio and type with these entries.
inline Value cellOf(const char* radio, const char* type, std::initializer_list<Dictionary::Entry> entries) {
  Value cell = dictionaryOf(entries);
  cell.dictionary()->set("RadioAccessTechnology", radio);
  cell.dictionary()->set("CellType", type);
  return cell;
}

/// What the decoder shows in a section after the reports.
inline std::string shownAfter(modem::ReportDecoder& decoder, std::initializer_list<Bytes> reports,
                              Value section = Value::ofDictionary()) {
  decoder.updateSectionRef(section);
  for (const Bytes& report : reports) decoder.updateWithData_logCode(Packet(report), 0xFF0003);
  return described(section);
}

}  // namespace varnel

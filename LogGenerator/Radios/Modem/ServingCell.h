#pragma once

#include "LogGenerator/Radios/Modem/CellRows.h"
#include "LogGenerator/Radios/Modem/ReportDecoder.h"

namespace varnel::modem {

/// The serving cell of one radio: its identity and its levels.
class ServingCell final : public ReportDecoder {
 public:
  ServingCell(const Radio& radio, ReportReader& reader)
      : ReportDecoder(radio.sectionName, reader), _radio(radio) {}

  void listNumberFormats(SectionFormats& formats) const override { listFormats(_radio, formats); }

 private:
  void show(const Dictionary& report) override;

  const Radio& _radio;
};

}  // namespace varnel::modem

#pragma once

#include "LogGenerator/Radios/Modem/ReportDecoder.h"

namespace varnel::modem {

/// The cells of the last report beside those that have sections of their own: the neighbors, and further
/// serving cells. They come in the report's order.
class OtherCells final : public ReportDecoder {
 public:
  explicit OtherCells(ReportReader& reader) : ReportDecoder("Other Cells", reader) {}

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void show(const Dictionary& report) override;
};

}  // namespace varnel::modem

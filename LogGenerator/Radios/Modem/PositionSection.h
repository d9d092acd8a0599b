#pragma once

#include "LogGenerator/Identities.h"
#include "LogGenerator/Radios/Modem/ReportDecoder.h"

namespace varnel::modem {

/// Where the modem was at the last report. While identities are hidden, the coordinates are only said to be
/// present: they tell where a person was.
class PositionSection final : public ReportDecoder {
 public:
  explicit PositionSection(ReportReader& reader, Identities identities = Identities::Hidden)
      : ReportDecoder("Position", reader), _identities(identities) {}

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void show(const Dictionary& report) override;

  const Identities _identities;
};

}  // namespace varnel::modem

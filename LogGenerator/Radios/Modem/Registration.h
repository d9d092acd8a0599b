#pragma once

#include "LogGenerator/Radios/Modem/ReportDecoder.h"

namespace varnel::modem {

/// How the modem is registered, and the version of the last report.
class Registration final : public ReportDecoder {
 public:
  explicit Registration(ReportReader& reader) : ReportDecoder("Registration", reader) {}

  void listNumberFormats(SectionFormats& formats) const override;

 private:
  void show(const Dictionary& report) override;
  void noteVersion(const Report& report) override;
};

}  // namespace varnel::modem

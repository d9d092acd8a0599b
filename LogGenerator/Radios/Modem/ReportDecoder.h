#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "LogGenerator/Radios/Modem/ReportReader.h"

namespace varnel::modem {

/// A decoder of modem reports. A report is the whole picture of its moment: what it lacks is shown no more.
/// Of a report with a version that is not known only the version is shown, in the section "Registration".
class ReportDecoder : public Base {
 public:
  std::string_view getSectionName() const final { return _sectionName; }
  std::vector<std::uint32_t> getLogCodeArray() const final;
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) final;
  MessageFate fateOf(const Packet& packet, std::uint32_t logCode) const final;

 protected:
  /// The reader must outlive the decoder.
  ReportDecoder(std::string_view sectionName, ReportReader& reader)
      : _sectionName(sectionName), _reader(reader) {}

  /// Shows a report of a known version.
  virtual void show(const Dictionary& report) = 0;
  /// A report has come, of a version that may not be known. A known one is shown after that.
  virtual void noteVersion(const Report& /*report*/) {}

 private:
  const std::string_view _sectionName;
  ReportReader& _reader;
};

}  // namespace varnel::modem

#include "LogGenerator/Radios/Modem/Registration.h"

#include <algorithm>
#include <cstddef>
#include <iterator>

#include "LogGenerator/NumberFormats.h"
#include "platform/ModemReport.h"

namespace varnel::modem {

namespace {

// 3GPP TS 27.007, 10.1.20.
constexpr std::string_view states[] = {
    "Not Registered",
    "Home",
    "Searching",
    "Denied",
    "Unknown",
    "Roaming",
    "Home, SMS Only",
    "Roaming, SMS Only",
    "Emergency Only",
    "Home, CSFB Not Preferred",
    "Roaming, CSFB Not Preferred",
    "Restricted Local Services",
};

constexpr std::string_view qualityEntry = "Signal Quality";
constexpr Format quality = integer("%d%%");

constexpr std::size_t mostTechnologies = 8;

std::string technologiesIn(const Dictionary& report) {
  std::string text;
  const Array* const technologies = report.get(modemReport::accessTechnologies).array();
  if (!technologies) return text;
  for (std::size_t i = 0; i < std::min(technologies->size(), mostTechnologies); ++i) {
    const std::string name = shortText((*technologies)[i]);
    if (!name.empty()) text.append(text.empty() ? "" : ", ").append(name);
  }
  return text;
}

}  // namespace

void Registration::listNumberFormats(SectionFormats& formats) const { formats.add(qualityEntry, quality); }

void Registration::noteVersion(const Report& report) {
  sectionRef.setText(versionEntry, report.isKnown ? report.version.text() : report.version.unknownText());
}

void Registration::show(const Dictionary& report) {
  const auto state = wholeNumber(report, modemReport::registrationState, 0, std::ssize(states) - 1);
  sectionRef.setText("State", state ? states[*state] : std::string_view());
  sectionRef.setText("Operator", shortText(report.get(modemReport::operatorName)));
  sectionRef.setText("PLMN", network(report));
  sectionRef.setText("Access Technology", technologiesIn(report));
  if (const auto percent = wholeNumber(report, modemReport::signalQuality, 0, 100))
    sectionRef.setInteger(qualityEntry, quality, static_cast<std::int32_t>(*percent));
  else
    sectionRef.setText(qualityEntry, {});
}

}  // namespace varnel::modem

#include "LogGenerator/Radios/Modem/PositionSection.h"

#include <optional>

#include "LogGenerator/NumberFormats.h"

namespace varnel::modem {

namespace {

constexpr Format degrees = real("%.6f °"), meters = real("%.1f m");

}  // namespace

void PositionSection::listNumberFormats(SectionFormats& formats) const {
  for (const std::string_view entry : {latitudeEntry, longitudeEntry}) formats.add(entry, degrees);
  formats.add(altitudeEntry, meters);
}

void PositionSection::show(const Dictionary& report) {
  const auto position = positionIn(report);
  const auto showNumber = [&](std::string_view entry, const Format& format, std::optional<double> number) {
    if (!number)
      sectionRef.setText(entry, {});
    else if (_identities == Identities::Hidden)
      sectionRef.setText(entry, presentText);
    else
      sectionRef.setReal(entry, format, *number);
  };
  showNumber(latitudeEntry, degrees, position ? std::optional(position->latitude) : std::nullopt);
  showNumber(longitudeEntry, degrees, position ? std::optional(position->longitude) : std::nullopt);
  showNumber(altitudeEntry, meters, position ? position->altitude_m : std::nullopt);
  sectionRef.setText("Time", position && position->time ? dateDescription(*position->time) : std::string());
  sectionRef.setText("Source", position ? position->source : std::string());
}

}  // namespace varnel::modem

#include "programs/varnel-decode/EventWriter.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "host/Printable.h"
#include "programs/shared/CsvField.h"
#include "programs/shared/Timestamps.h"
#include "programs/varnel-decode/StandardOutput.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

// Two blanks stand between the columns: the longest kind, and the longest section of one SIM card.
constexpr std::size_t timeWidth = 24, kindWidth = 17, sectionWidth = 30;

std::string padded(std::string text, std::size_t width) {
  text.resize(std::max(text.size(), width), ' ');
  return text;
}

std::string asText(const DisplayEvent& event, const std::string& time) {
  std::string line = padded(time, timeWidth) + "  " + padded(std::string(nameOf(event.kind)), kindWidth) +
                     "  " + padded(event.section, sectionWidth) + "  ";
  if (!event.from.empty()) line += event.from + " -> ";
  return printable(line + event.to) + '\n';
}

std::string asCsv(const DisplayEvent& event, const std::string& time, const std::string& elapsed) {
  std::string line = time;
  for (const std::string_view field :
       {nameOf(event.kind), std::string_view(event.from), std::string_view(event.to),
        std::string_view(event.section), std::string_view(elapsed)})
    line += ',' + csvField(field);
  return line + '\n';
}

std::string asJson(const DisplayEvent& event, const std::string& time, const std::string& elapsed) {
  std::string line = "\"Time\":" + (time.empty() ? "null,\"Elapsed\":" + elapsed : jsonString(time));
  const std::pair<const char*, std::string> members[] = {{"Kind", std::string(nameOf(event.kind))},
                                                         {"From", event.from},
                                                         {"To", event.to},
                                                         {"Section", event.section}};
  for (const auto& [name, text] : members) line += ',' + jsonString(name) + ':' + jsonString(text);
  return line + "}\n";
}

}  // namespace

std::string eventTableHeader(EventColumns columns) {
  const std::string capture = columns == EventColumns::WithCapture ? "Capture," : "";
  return capture + "Time,Kind,From,To,Section,Elapsed\n";
}

void EventWriter::write(const DisplayEvent& event, Dating dating, std::chrono::nanoseconds elapsed) const {
  const std::string time = dating == Dating::Known ? timestamp(event.time) : std::string();
  const std::string seconds = secondsText(elapsed);
  switch (_format) {
    case EventFormat::Text:
      return writeOutput(_output, asText(event, time.empty() ? seconds + " s" : time));
    case EventFormat::Csv:
      return writeOutput(_output, (_captureName ? csvField(*_captureName) + ',' : std::string()) +
                                      asCsv(event, time, seconds));
    case EventFormat::Json:
      return writeOutput(
          _output, (_captureName ? "{\"Capture\":" + jsonString(*_captureName) + ',' : std::string("{")) +
                       asJson(event, time, seconds));
  }
}

}  // namespace varnel

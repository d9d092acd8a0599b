#include "LogGenerator/KLV/CellMonitor.h"

#include <string>

#include "platform/Log.h"
#include "platform/PropertyList.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

bool holdsText(const Dictionary& record, std::string_view key, std::string_view text) {
  const std::string* found = record.get(key).string();
  return found && *found == text;
}

}  // namespace

std::optional<Value> readCellMonitorArray(const Packet& packet) {
  auto list = readPropertyList(packet.payload());
  if (list && list->array()) return list;
  logError("Cell Info Array data could not be constructed");
  return std::nullopt;
}

const Dictionary* cellOfKind(const Value& record, std::string_view radioAccessTechnology,
                             std::string_view cellType) {
  const Dictionary* entries = record.dictionary();
  const bool matches = entries &&
                       holdsText(*entries, cellMonitor::radioAccessTechnology, radioAccessTechnology) &&
                       holdsText(*entries, cellMonitor::cellType, cellType);
  return matches ? entries : nullptr;
}

void showCellMonitorRows(Dictionary& section, const Dictionary& record,
                         std::span<const CellMonitorRow> rows) {
  for (const CellMonitorRow& row : rows) {
    if (const auto number = record.get(row.key).int32()) {
      section.setText(row.label, std::to_string(*number));
    } else {
      logError("%s", row.failureMessage);
    }
  }
}

}  // namespace varnel

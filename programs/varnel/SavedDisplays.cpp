#include "programs/varnel/SavedDisplays.h"

#include <filesystem>
#include <stdexcept>

#include "app/DateFormatter.h"
#include "host/SystemClock.h"
#include "host/captures/ByteSource.h"
#include "host/captures/ByteWindow.h"
#include "programs/shared/SnapshotFile.h"

namespace varnel {

std::optional<std::vector<Generation>> savedDisplays(const std::string& path) {
  std::error_code failure;
  // What a pipe gives can be read only once.
  if (!std::filesystem::is_regular_file(path, failure)) return std::nullopt;
  ByteWindow bytes(openFile(path, AtEndOfFile::Stop));
  if (!SnapshotFile::isPropertyList(bytes)) return std::nullopt;
  auto displays = SnapshotFile(bytes, captureName(path)).generations();
  if (displays.empty())
    throw std::runtime_error(captureName(path) +
                             " is a snapshot without a display; nothing had arrived when "
                             "it was saved");
  return displays;
}

std::string statusOfSaved(Time time) {
  return DateFormatter("'Display of' yyyy-MM-dd 'at' HH:mm:ss").string(time, SystemClock().zoneAt(time));
}

}  // namespace varnel

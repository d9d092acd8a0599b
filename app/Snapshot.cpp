#include "app/Snapshot.h"

#include "base/Dictionary.h"
#include "base/Log.h"

namespace varnel {

Value snapshotContents(Time created, const Value& saveContents,
                       const std::optional<std::string>& description) {
  Value contents = Value::ofDictionary();
  contents.dictionary()->set("Timestamp", dateDescription(created));
  contents.dictionary()->set("Data", saveContents.isAbsent() ? Value::ofArray() : saveContents);
  if (description) contents.dictionary()->set("Description", *description);
  return contents;
}

FileWriting writeSnapshot(DeviceFiles& files, const Clock& clock, const Value& contents) {
  const std::string path =
      std::string(snapshotFolder) + "/VarnelSnapshot-" + std::to_string(clock.now().seconds) + ".varnel";
  FileWriting writing = files.writePropertyList(contents, path);
  if (!writing.isDone()) logError("Unable to write snapshot to %s", path);
  return writing;
}

std::optional<FileWriting> saveSnapshotWithoutDescription(DeviceFiles& files, const Clock& clock,
                                                          const Value& saveContents) {
  if (!files.exists(std::string(internalDeviceMarker))) {
    logError("This device has no marker that allows snapshots: nothing is saved");
    return std::nullopt;
  }
  return writeSnapshot(files, clock, snapshotContents(clock.now(), saveContents, ""));
}

}  // namespace varnel

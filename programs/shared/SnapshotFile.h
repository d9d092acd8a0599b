#pragma once

#include <string>
#include <vector>

#include "base/Bytes.h"
#include "base/Value.h"
#include "host/captures/ByteWindow.h"
#include "programs/shared/Generation.h"

namespace varnel {

/// A snapshot that the viewer has saved.
class SnapshotFile {
 public:
  /// True when the bytes begin like a property list and not like a capture. Drops no bytes. Throws
  /// CaptureError.
  static bool isPropertyList(ByteWindow& bytes);

  /// Reads all bytes. The name is for errors. Throws std::runtime_error when they are no snapshot.
  SnapshotFile(ByteWindow& bytes, std::string name);

  /// The snapshot as the program shows it: its dictionary without raw messages and binary log.
  Value shown() const;
  /// The displays in it, the oldest first. The time of each is its own date, or the snapshot's date if it has
  /// none. Throws std::runtime_error when neither is a date.
  std::vector<Generation> generations() const;
  const Value& items() const;

 private:
  std::string _name;  // of the file, for errors
  Value _contents;    // a dictionary with an array "Data"
};

/// The binary log among the items of a snapshot; null when there is none.
const Bytes* binaryLogOf(const Value& items);

}  // namespace varnel

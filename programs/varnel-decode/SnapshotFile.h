#pragma once

#include <string>
#include <vector>

#include "base/Bytes.h"
#include "base/Value.h"
#include "host/captures/ByteWindow.h"
#include "programs/varnel-decode/Generation.h"

namespace varnel {

/// A snapshot as the viewer saves it.
class SnapshotFile {
 public:
  /// True when the bytes begin like a property list, and not like a capture. None of them is dropped. Throws
  /// CaptureError.
  static bool isPropertyList(ByteWindow& bytes);

  /// Reads them all; the name is that of errors. Throws std::runtime_error for what is no snapshot.
  SnapshotFile(ByteWindow& bytes, std::string name);

  /// The snapshot as it is shown: its dictionary without raw messages and binary log.
  Value shown() const;
  /// The displays in it, oldest first, each at its own date, or without one at that of the snapshot. Throws
  /// std::runtime_error when neither is one.
  std::vector<Generation> generations() const;
  const Value& items() const;

 private:
  std::string _name;  // of the file, as errors tell it
  Value _contents;    // a dictionary with an array "Data"
};

/// The binary log among the items of a snapshot; null when there is none.
const Bytes* binaryLogOf(const Value& items);

}  // namespace varnel

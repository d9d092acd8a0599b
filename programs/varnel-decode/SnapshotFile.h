#pragma once

#include <string>
#include <vector>

#include "base/Bytes.h"
#include "base/Value.h"
#include "programs/varnel-decode/Generation.h"

namespace varnel {

/// A snapshot as the viewer saves it.
class SnapshotFile {
 public:
  /// True when what the path names begins like a property list, and not like a capture. "-" is standard
  /// input, which stays as it was; of pipes by name nothing is read, and they are taken for captures.
  static bool isPropertyList(const std::string& path);

  /// Reads the file; "-" is standard input. Throws std::runtime_error for what is no snapshot.
  explicit SnapshotFile(const std::string& path);

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

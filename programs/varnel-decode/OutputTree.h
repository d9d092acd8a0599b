#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "host/FileIdentity.h"
#include "programs/varnel-decode/Options.h"

namespace varnel {

/// A file that an output must not overwrite, and how messages name it.
struct NamedFile {
  std::string name;
  FileIdentity identity;
};

/// Where the outputs of captures go when each capture has an output of its own: a folder with the tree of the
/// captures' names. Each output has the name of its capture with the ending of its format.
class OutputTree {
 public:
  OutputTree(std::filesystem::path folder, std::string_view ending)
      : _folder(std::move(folder)), _ending(ending) {}

  /// The output of a capture. A name that begins at the root, or that leads out of the current folder, is
  /// taken from the root: /data/a.bin and DIR/data/a.bin.json.
  std::filesystem::path outputOf(const std::string& capture) const;

  /// One sentence when two captures would have the same output, or when an output would overwrite one of the
  /// captures or of the other files. Asks the system about each file.
  std::optional<std::string> clash(const std::vector<std::string>& captures,
                                   const std::vector<NamedFile>& others = {}) const;

  /// Whether the output of a capture is there and newer than the capture.
  bool hasNewer(const std::string& capture) const;

 private:
  std::filesystem::path _folder;
  std::string _ending;
};

/// The ending of the outputs: ".jsonl".
std::string_view outputEnding(const Options& options);

}  // namespace varnel

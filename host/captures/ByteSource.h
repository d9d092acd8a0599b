#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>

namespace varnel {

/// Bytes in sequence.
class ByteSource {
 public:
  virtual ~ByteSource() = default;
  /// Waits until there is a byte. Reads as many bytes as there are, at most as many as there is room for; 0
  /// at the end. Throws CaptureError.
  virtual std::size_t read(std::span<std::uint8_t> room) = 0;
  /// How many bytes of the file were read so far.
  virtual std::uint64_t bytesRead() const = 0;
  /// The length of the file; absent for pipes and the like.
  virtual std::optional<std::uint64_t> fileSize() const = 0;
};

/// What happens at the current end of a file.
enum class AtEndOfFile {
  Stop,
  WaitForMore,  ///< the writer of the file may go on; a pipe still ends when its writer does
};

/// A file, a pipe, or a device; "-" is standard input. Throws CaptureError for folders, and for anything that
/// cannot be read.
std::unique_ptr<ByteSource> openFile(const std::string& path, AtEndOfFile atEnd);

/// The name of a path in errors.
std::string captureName(const std::string& path);

}  // namespace varnel

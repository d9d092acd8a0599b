#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>

namespace varnel {

/// Bytes that come one after the other.
class ByteSource {
 public:
  virtual ~ByteSource() = default;
  /// Waits until there is a byte, and reads what there is of as many as there is room for; 0 at the end.
  /// Throws CaptureError.
  virtual std::size_t read(std::span<std::uint8_t> room) = 0;
  /// How many bytes of the file have been taken in so far.
  virtual std::uint64_t bytesRead() const = 0;
  /// How long the file is; absent for pipes and the like.
  virtual std::optional<std::uint64_t> fileSize() const = 0;
};

/// What happens where a file ends for now.
enum class AtEndOfFile {
  Stop,
  WaitForMore,  ///< whoever writes the file may go on; a pipe still ends when its writer does
};

/// A file, a pipe, a device; "-" is standard input. Throws CaptureError for what cannot be read: what is not
/// there, and folders.
std::unique_ptr<ByteSource> openFile(const std::string& path, AtEndOfFile atEnd);

/// How errors tell a path.
std::string captureName(const std::string& path);

}  // namespace varnel

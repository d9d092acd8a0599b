#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "host/captures/ByteWindow.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// What a capture is read from.
struct CaptureInput {
  ByteWindow bytes;
  std::string name;  ///< as errors tell it
  /// Told of each record that is left out because it is too long, in one line; empty where nobody listens.
  std::function<void(const std::string& line)> tell{};
};

/// The messages of a modem, in the order in which they were captured, whatever they were captured as. Reading
/// is one pass, and takes no more memory for a long capture than for a short one. What comes from a pipe
/// comes out as soon as it is whole.
class Capture {
 public:
  Capture(const Capture&) = delete;
  Capture& operator=(const Capture&) = delete;
  virtual ~Capture() = default;

  /// Reads the next record; false at the end. Throws CaptureError where nothing that follows can be read; the
  /// records before it have been returned.
  virtual bool next(CaptureRecord& record) = 0;

  /// The technology that the capture itself names, not looked at; absent where it names none.
  virtual std::optional<std::string> technology() const { return std::nullopt; }

  /// What was left out so far.
  const LeftOut& leftOut() const { return _leftOut; }

  /// How many bytes of the file have been taken in so far, which runs ahead of the records a little.
  std::uint64_t bytesRead() const { return _input.bytes.bytesRead(); }
  /// How long the file is; absent for pipes and the like.
  std::optional<std::uint64_t> fileSize() const { return _input.bytes.fileSize(); }

 protected:
  explicit Capture(CaptureInput input) : _input(std::move(input)) {}

  ByteWindow& bytes() { return _input.bytes; }
  const std::string& name() const { return _input.name; }
  void tell(const std::string& line) const {
    if (_input.tell) _input.tell(line);
  }
  LeftOut& count() { return _leftOut; }

 private:
  CaptureInput _input;
  LeftOut _leftOut;
};

struct CaptureOptions {
  AtEndOfFile atEnd = AtEndOfFile::Stop;
  std::function<void(const std::string& line)> tell{};  ///< as in CaptureInput
};

/// Opens a capture of any kind; "-" is standard input. What it is tell its first bytes, never its name:
///
/// - the framed stream of a diagnostic port, and the one whose frames have a length instead of a checksum,
/// - either of them behind the header of a phone's own log file,
/// - log records without frames, also as binary logs of a viewer have them,
/// - pcap and pcapng of link type USER0 (147),
/// - any of these packed by gzip.
///
/// Throws CaptureError for all else; its text says what the file holds and what would help.
std::unique_ptr<Capture> openCapture(const std::string& path, CaptureOptions options = {});

/// The same of bytes that have been opened already.
std::unique_ptr<Capture> openCapture(CaptureInput input);

}  // namespace varnel

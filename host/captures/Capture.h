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

/// The input of a capture.
struct CaptureInput {
  ByteWindow bytes;
  std::string name;  ///< for errors
  /// Gets one line for each record that is left out because it is too long. May be empty.
  std::function<void(const std::string& line)> tell{};
};

/// The messages of a modem in the order in which they were captured, whatever the form of the capture.
/// Reading is one pass, and takes no more memory for a long capture than for a short one. A record from a
/// pipe is available as soon as it is whole.
class Capture {
 public:
  Capture(const Capture&) = delete;
  Capture& operator=(const Capture&) = delete;
  virtual ~Capture() = default;

  /// Reads the next record; false at the end. Throws CaptureError when nothing after this point can be read.
  /// The records before it have been returned.
  virtual bool next(CaptureRecord& record) = 0;

  /// The technology that the capture names, which is not checked; absent when it names none.
  virtual std::optional<std::string> technology() const { return std::nullopt; }

  /// What was left out so far.
  const LeftOut& leftOut() const { return _leftOut; }

  /// How many bytes of the file were read so far. This is a little ahead of the records.
  std::uint64_t bytesRead() const { return _input.bytes.bytesRead(); }
  /// The length of the file; absent for pipes and the like.
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

/// Opens a capture of any kind; "-" is standard input. The first bytes tell the kind, not the name:
///
/// - the framed stream of a diagnostic port, with checksums or with lengths,
/// - either of them after the header of a phone's own log file,
/// - log records without frames, also as in a viewer's binary log,
/// - pcap and pcapng of link type USER0 (147),
/// - any of these packed by gzip.
///
/// Throws CaptureError for everything else. Its text says what the file holds and what would help.
std::unique_ptr<Capture> openCapture(const std::string& path, CaptureOptions options = {});

/// The same for bytes that are already open.
std::unique_ptr<Capture> openCapture(CaptureInput input);

}  // namespace varnel

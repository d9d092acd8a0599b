#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>

#include "base/Bytes.h"
#include "base/Time.h"

struct pcap;

namespace varnel {

/// A capture that cannot be read. The text is one line that says what, which file, and where it
/// helps what to do.
class CaptureError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

struct CaptureRecord {
  Time time;
  ByteView message;  ///< valid until the next record is read
};

/// Reads the messages of a log channel from a pcap or pcapng file of link type USER0 (147), each record one
/// message.
class CaptureReader {
 public:
  /// "-" is standard input. Throws CaptureError for what is no such file.
  explicit CaptureReader(const std::string& path);

  /// Reads the next record; false at the end. Throws CaptureError for a record that is damaged or was cut
  /// short when it was captured; the records before it have been returned.
  bool next(CaptureRecord& record);

  /// How many bytes of the file have been taken in so far, which runs ahead of the records a little.
  std::uint64_t bytesRead() const;
  /// How long the file is; absent for pipes and the like.
  std::optional<std::uint64_t> fileSize() const;

 private:
  struct Closer {
    void operator()(pcap* capture) const;
  };

  std::string _name;           // of the file, as errors tell it
  std::FILE* _file = nullptr;  // belongs to the capture, unless it is standard input
  std::unique_ptr<pcap, Closer> _capture;
  std::size_t _recordsRead = 0;
};

}  // namespace varnel

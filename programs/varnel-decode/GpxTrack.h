#pragma once

#include <cstdint>
#include <cstdio>
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "LogGenerator/LogMessage.h"
#include "LogGenerator/Radios/Modem/ReportReader.h"
#include "LogGenerator/WriteTimes.h"
#include "base/Bytes.h"
#include "base/Time.h"
#include "base/Value.h"

namespace varnel {

/// Writes where a modem was, with the levels at each point, as a track of GPX 1.1. The positions come from
/// the modem reports, and the levels from the display of all radios. Each SIM card has a track of its own.
///
/// The points wait in temporary files, so a capture of any length takes the same memory.
class GpxTrack {
 public:
  /// The write times must outlive it. They tell which levels are old.
  GpxTrack(std::string file, const WriteTimes& writeTimes)
      : _file(std::move(file)), _writeTimes(writeTimes) {}

  /// A message was decoded. `time` is absent when its date is not known. `now` is the time of the decoders.
  /// Throws std::system_error when a temporary file cannot be written.
  void take(ByteView message, std::optional<Time> time, Time now, const Value& display);
  /// Writes the file. Throws std::runtime_error when there are no positions, or when it cannot be written.
  void finish(const std::string& inputName);

 private:
  struct CloseFile {
    void operator()(std::FILE* file) const { std::fclose(file); }
  };
  struct Track {
    std::unique_ptr<std::FILE, CloseFile> points;
    bool isInSegment = false;
    std::optional<Time> lastFix;
  };

  void addPoint(Track& track, const modem::Position& position, std::optional<Time> time, Time now,
                const Value& groups);

  const std::string _file;
  const WriteTimes& _writeTimes;
  modem::ReportReader _reports;
  std::map<std::uint8_t, Track> _tracks;  // by SIM card; 0 for none
};

}  // namespace varnel

#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

#include "LogGenerator/LogGenerator.h"

namespace varnel {

/// The time in a DLF version report.
struct DLFTime {
  std::uint32_t seconds = 0;     ///< since 1970-01-01 00:00:00 UTC
  std::int16_t zoneMinutes = 0;  ///< local time minus UTC
  std::uint8_t daylight = 0;     ///< 1 while daylight saving time is in force
};

enum class DLFStatus : int { Success = 0, BufferTooSmall = 3 };

/// The length of a version report record.
inline constexpr std::uint32_t dlfVersionReportLength = 161;

/// Writes the version report record (log code 0x1FFD) that begins every DLF file. `written` becomes the
/// length of the record, or 0 when the capacity is too small. Texts are cut to 6, 15, and 17 characters,
/// which is what their fields hold.
DLFStatus DLFAddVersionReport(std::uint8_t* buffer, std::uint32_t capacity, std::uint32_t& written,
                              std::uint16_t firstWord, std::uint16_t secondWord, std::string_view version,
                              std::string_view executableName, std::string_view buildDate,
                              const DLFTime& time);

/// The base of the generators that get log packets. It collects the raw bytes of each interval between two
/// displays, and exports them as a DLF binary log. The size of an interval is limited, so that a flood does
/// not fill the memory: a message that no longer fits is left out whole.
class KLVLogGenerator : public LogGenerator {
 public:
  using LogGenerator::LogGenerator;

  /// The most raw bytes per interval.
  static constexpr std::size_t mostRawBytes = std::size_t{16} << 20;

  /// The records of the history, then the DLF item if the export succeeded.
  Value getSaveContentsFromState(const Dictionary& state) const override;
  std::uint64_t messagesLeftOutOfLog() const override { return _leftOut; }
  void keepNoRawBytes() override;

 protected:
  /// Keeps the bytes of a message for the binary log, or counts the message as left out.
  void collect(ByteView message) {
    if (message.size() > _roomForRawBytes - _binData.size()) return leaveOut();
    _binData.insert(_binData.end(), message.begin(), message.end());
  }

  /// The version report and the raw bytes of every history record, the oldest first. Nothing when a record
  /// holds something else.
  std::optional<Bytes> generateDlfFromState(const Dictionary& state) const;

  /// The command that asks the telephony server for the packets of these log codes, the modem's and its own
  /// in a list each.
  static Value startCommandFor(std::span<const std::uint32_t> logCodes);

  /// Moves the collected bytes into the state's "DisplayState". If this interval lacks messages, logs how
  /// many.
  void storeBinDataInState(Dictionary& state);

  Bytes _binData;

 private:
  void leaveOut();

  std::size_t _roomForRawBytes = mostRawBytes;  // at least the collected bytes; 0 if none are kept
  std::uint64_t _leftOut = 0;
  std::uint64_t _leftOutBefore = 0;  // its value when this interval began
};

}  // namespace varnel

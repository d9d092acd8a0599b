#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "LogGenerator/Identities.h"
#include "base/Log.h"
#include "host/captures/ByteSource.h"
#include "programs/varnel-decode/CaptureList.h"
#include "programs/varnel-decode/EventWriter.h"
#include "programs/varnel-decode/GenerationWriters.h"
#include "programs/varnel-decode/MessagePackets.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

/// What goes to standard output.
enum class Output {
  Display,          ///< the last display; of a snapshot all displays in it
  EveryDisplay,     ///< a line of JSON for each display
  ValueTable,       ///< comma-separated values, a line for each display
  Events,           ///< a line for each event
  StatisticsTable,  ///< what became of the messages
  StatisticsJson,
};

/// A picture to draw.
struct PlotWish {
  std::string file;
  std::vector<std::string> paths;
};

/// What the program is asked to do.
struct Options {
  std::optional<std::string> technology;
  Output output = Output::Display;
  DisplayWriter writeDisplay = displayAsText;
  EventFormat eventFormat = EventFormat::Text;
  std::vector<std::string> tablePaths;  ///< the columns of a value table
  WritingStyle style;                   ///< of every display and of a value table
  /// The highest priority number that goes to standard error; -1 for none. The decoders' own remarks, such as
  /// that one of several decoders of a log code does not know it, are of no use beside counts.
  int logLevel = logErrorPriority - 1;
  std::optional<std::string> snapshotPath;   ///< where to write a snapshot file
  std::optional<std::string> binaryLogPath;  ///< where to write the binary log
  std::optional<std::string> recordsPath;    ///< where to write the records as a record stream
  std::optional<std::string> pcapPath;       ///< as pcap
  std::optional<std::string> framedPath;     ///< as a framed stream
  std::optional<std::string> messagesPath;   ///< where to write the RRC and NAS messages
  MessageForm messagesAs = MessageForm::UpperPdu;
  std::optional<std::string> gpxPath;  ///< where to write the positions, with the levels at each
  std::optional<PlotWish> plot;
  Identities identities = Identities::Hidden;
  /// Whose records alone are taken; absent for whichever is first, or for all, as the technology wants.
  std::optional<std::uint8_t> subscription;
  AtEndOfFile atEnd = AtEndOfFile::Stop;  ///< what happens where a capture ends
  unsigned jobs = 1;                      ///< how many captures are decoded at the same time
  bool namesEachCapture = false;          ///< text of several captures: a line before each says which it is
  bool isResuming = false;                ///< what is there, and newer than its capture, is left
  bool areSeveral = false;                ///< several captures, or a list with any number of them
  std::optional<Part> part;               ///< the only part of the captures that is decoded
  /// Captures and snapshots, at least one unless there is a list or parts are merged; "-" is standard input.
  /// `takeList` adds those of the list, and `takePart` takes away those of other parts.
  std::vector<std::string> captures;
  std::vector<std::uint64_t> sizes;         ///< of the captures, as the list tells them; else empty
  std::optional<std::string> listPath;      ///< a list of captures; "-" is standard input
  std::optional<std::string> writtenList;   ///< if there is one, the list with sizes is all that is written
  std::optional<std::string> outputFolder;  ///< each capture has an output of its own in this folder
  std::optional<std::string> reportPath;    ///< where to write what became of each capture
  std::optional<std::string> databasePath;  ///< the database that gets each capture
  std::vector<std::string> mergedParts;     ///< if there are any, they are added up, and nothing else is done
  std::vector<std::string>
      explainedPaths;  ///< if there are any, they are explained, and nothing else is done

  /// Whether events are written as a table, which begins with a header.
  bool isEventTable() const { return output == Output::Events && eventFormat == EventFormat::Csv; }
  /// Whether each capture is decoded in a process of its own.
  bool areMany() const { return areSeveral || part || outputFolder || reportPath || databasePath; }
  /// Whether several captures write to standard output, so that each of them must be named there.
  bool sharesOutput() const { return areSeveral && !outputFolder; }
};

/// The status to end with when the command line leaves nothing to do: 0 after help, 2 after a mistake.
struct ExitStatus {
  int code;
};

/// Tells a mistake of the user as one line on standard error.
ExitStatus mistake(const std::string& text);

/// Reads the command line, which may name one of those technologies. Help and the version go to standard
/// output, a mistake is one line on standard error.
std::variant<Options, ExitStatus> readOptions(int argumentCount, const char* const* arguments,
                                              const std::vector<std::string>& technologies,
                                              const std::string& version);

/// Reads the list of captures, if there is one. Throws std::runtime_error when the list cannot be read or is
/// no list.
void takeList(Options& options);

/// Leaves the part of the captures that is to be decoded.
void takePart(Options& options);

/// Writes the captures with their sizes of now. Throws std::system_error.
void writeList(const Options& options);

}  // namespace varnel

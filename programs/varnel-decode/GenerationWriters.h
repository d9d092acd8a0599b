#pragma once

#include <cstdio>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "programs/shared/Generation.h"
#include "programs/varnel-decode/DisplayJson.h"
#include "programs/varnel-decode/NearestPaths.h"
#include "programs/varnel-decode/TechnologyGuess.h"

namespace varnel {

/// Takes the generations of a capture or of a snapshot, one after the other.
class GenerationSink {
 public:
  virtual ~GenerationSink() = default;
  /// Throws std::runtime_error after a failure; the sink gets no more generations then.
  virtual void take(const Generation& generation) = 0;
  /// The capture or snapshot of that name has no more generations. Writes and tells what follows from all of
  /// them. Throws std::runtime_error after a failure.
  virtual void finish(const std::string& /*inputName*/) {}
};

/// Turns the path of a node as users write it ("Section/Label") into the path in the tree ("/Section/Label").
std::string treePath(std::string_view path);

/// The displays that are written.
enum class Displays {
  All,
  Changed,  ///< those that differ from the one before
};

/// The form of consecutive displays.
struct WritingStyle {
  ValuesAs valuesAs = ValuesAs::Texts;
  Displays displays = Displays::All;
};

/// One line of JSON per generation: {"Time": …, "Display": …}; without a date {"Time": null, "Elapsed": …,
/// …}. With a capture's name, "Capture" comes first. With numbers, "Units" comes last. If only changed
/// displays are written, the first line is whole; in later lines "Display" and "Units" are merge patches, and
/// "Units" is left out when no unit differs.
class EveryDisplay final : public GenerationSink {
 public:
  /// The formats decide what is a number. They must outlive the sink.
  EveryDisplay(std::FILE* output, std::optional<std::string> captureName, WritingStyle style,
               const NumberFormats& formats)
      : _output(output), _captureName(std::move(captureName)), _style(style), _formats(formats) {}
  void take(const Generation& generation) override;

 private:
  std::optional<std::string> membersOf(const Value& display);
  std::string wholeMembers(const DisplayJson& display) const;

  std::FILE* _output;
  std::optional<std::string> _captureName;
  const WritingStyle _style;
  const NumberFormats& _formats;
  std::optional<DisplayJson> _before;  // the last display, when only changes are written
};

/// The path of a table column with the seconds since the first record.
inline constexpr std::string_view elapsedPath = "/Elapsed";

/// The columns of a table of values. With several captures the first column is the capture's name.
enum class TableColumns { TimeAndValues, CaptureTimeAndValues };

/// The header line of the table. A path whose values have a unit is followed by that unit in brackets.
std::string csvHeader(const std::vector<std::string>& paths, TableColumns columns,
                      const NumberFormats& formats);

/// One line of comma-separated values per generation, quoted according to RFC 4180 and ended by a newline:
/// its time, then the value under each path. The path Elapsed gives the seconds since the first record, if no
/// display has a value of that name. A value that is absent is an empty field. Control characters other than
/// tab and line end are written like `\u001B`.
class ValueTable final : public GenerationSink {
 public:
  /// The formats decide what is a number. They must outlive the sink.
  ValueTable(std::FILE* output, const std::vector<std::string>& paths, std::optional<std::string> captureName,
             WritingStyle style, const NumberFormats& formats);
  void take(const Generation& generation) override;
  /// Tells which path gives a time when rows have none.
  void finish(const std::string& inputName) override;

 private:
  struct Column {
    std::string path;
    EntryFormats formats;
  };
  std::string valueIn(const Column& column, const Generation& generation) const;

  std::FILE* _output;
  std::vector<Column> _columns;
  std::optional<std::string> _captureName;
  const WritingStyle _style;
  std::optional<std::string> _before;  // the values of the last row
  bool _hasEmptyTimes = false;
};

/// Notes which of the paths have had a value.
class SeenPaths final : public GenerationSink {
 public:
  /// The guess must outlive the sink.
  SeenPaths(std::vector<std::string> paths, const TechnologyGuess& guess)
      : _unseen(std::move(paths)), _guess(guess) {}
  void take(const Generation& generation) override;
  /// Tells each path without a value, and the paths that it may mean. Says nothing when there was no display,
  /// or when the guess is needed: then another line says why.
  void finish(const std::string& inputName) override;

  /// The paths that had a value in no display, as they were given.
  const std::vector<std::string>& unseen() const { return _unseen; }
  /// Paths that displays have, and that an unseen path may mean.
  std::vector<std::string> nearestTo(std::string_view path) const { return _shown.to(path); }

 private:
  std::string adviceFor(const std::string& path) const;

  std::vector<std::string> _unseen;
  const TechnologyGuess& _guess;
  NearestPaths _shown;
  bool _isAnyShown = false;
};

}  // namespace varnel

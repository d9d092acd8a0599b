#pragma once

#include <cstdio>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "programs/varnel-decode/DisplayJson.h"
#include "programs/varnel-decode/Generation.h"
#include "programs/varnel-decode/NearestPaths.h"

namespace varnel {

/// What becomes of the generations of a capture or snapshot, one after the other.
class GenerationSink {
 public:
  virtual ~GenerationSink() = default;
  /// Throws std::runtime_error, after which there is no use in going on.
  virtual void take(const Generation& generation) = 0;
};

/// The path of a node as users write it ("Section/Label") as the tree keeps it ("/Section/Label").
std::string treePath(std::string_view path);

/// Which displays are written.
enum class Displays {
  All,
  Changed,  ///< those that differ from the one before
};

/// How displays are written one after the other.
struct WritingStyle {
  ValuesAs valuesAs = ValuesAs::Texts;
  Displays displays = Displays::All;
};

/// One line of JSON a generation: {"Time": …, "Display": …}; without a date {"Time": null, "Elapsed": …, …}.
/// With a capture's name it comes first, as "Capture"; with numbers "Units" comes last. Of changed displays
/// the first line is whole; from then on "Display" and "Units" are merge patches, and "Units" is left out
/// where none differ.
class EveryDisplay final : public GenerationSink {
 public:
  /// The formats say which numbers there are, and have to outlive the sink.
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
  std::optional<DisplayJson> _before;  // what was shown last, when changes alone are written
};

/// The path of a table's column that tells the seconds since the first record.
inline constexpr std::string_view elapsedPath = "/Elapsed";

/// The columns of a table of values; the name of the capture is the first when there are several.
enum class TableColumns { TimeAndValues, CaptureTimeAndValues };

/// The header line of the table. Paths whose values have a unit by these formats tell it in brackets.
std::string csvHeader(const std::vector<std::string>& paths, TableColumns columns,
                      const NumberFormats& formats);

/// One line of comma-separated values (quoted as RFC 4180 has it, ended by a newline) a generation: its time,
/// then the value under each path; of the path Elapsed the seconds since the first record, where no display
/// has a value of that name. A value that is absent is an empty field. Control characters are escapes
/// (`\u001B`) but for tabs and line ends.
class ValueTable final : public GenerationSink {
 public:
  /// The formats say which numbers there are, and have to outlive the sink.
  ValueTable(std::FILE* output, const std::vector<std::string>& paths, std::optional<std::string> captureName,
             WritingStyle style, const NumberFormats& formats);
  void take(const Generation& generation) override;

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
};

/// Notes which of the paths have had a value.
class SeenPaths final : public GenerationSink {
 public:
  explicit SeenPaths(std::vector<std::string> paths) : _unseen(std::move(paths)) {}
  void take(const Generation& generation) override;

  /// Those that no display has had, as they were given.
  const std::vector<std::string>& unseen() const { return _unseen; }
  /// Those that displays have had and that an unseen one may mean.
  std::vector<std::string> nearestTo(std::string_view path) const { return _shown.to(path); }

 private:
  std::vector<std::string> _unseen;
  NearestPaths _shown;
};

}  // namespace varnel

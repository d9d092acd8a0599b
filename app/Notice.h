#pragma once

#include <map>
#include <string>
#include <string_view>

namespace varnel {

/// What a viewer tells its user beside the status: at most one line a matter, the most urgent first.
class Notice {
 public:
  /// In the order in which their lines stand.
  enum class Matter {
    Saving,           ///< what became of the snapshot that the user wanted
    Link,             ///< why nothing arrives
    MissingTemplate,  ///< why nothing can be shown
    StandingDisplay,  ///< that what arrives is not shown any more
    Source,           ///< what the server says of where its messages come from
    DroppedByServer,
    TooLong,
    LeftOutOfLog,
    NotDecoded,
  };

  /// Sets the matter's line; an empty one takes it away. Control characters become escapes, and what is much
  /// too long for a line is cut. False when nothing has changed.
  bool set(Matter matter, std::string_view line);
  /// Takes every line away.
  void clear() { _lines.clear(); }
  /// The lines with a newline between them; empty when there are none.
  std::string text() const;

 private:
  std::map<Matter, std::string> _lines;
};

}  // namespace varnel

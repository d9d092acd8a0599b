#pragma once

#include <map>
#include <string>
#include <string_view>

namespace varnel {

/// What a viewer tells its user beside the status: at most one line per matter, the most urgent first.
class Notice {
 public:
  /// In the order of their lines.
  enum class Matter {
    Saving,           ///< what happened to the snapshot that the user wanted
    Link,             ///< why nothing arrives
    MissingTemplate,  ///< why nothing can be shown
    StandingDisplay,  ///< that new messages are not shown any more
    Mixture,          ///< that the display mixes several SIM cards
    Source,           ///< what the server says about where its messages come from
    DroppedByServer,
    TooLong,
    History,  ///< that the value history has lost some values before their time
    LeftOutOfLog,
    NotDecoded,
  };

  /// Sets the line of a matter. An empty line removes it. Control characters become escapes, and a line that
  /// is much too long is cut. False when nothing has changed.
  bool set(Matter matter, std::string_view line);
  /// Removes every line.
  void clear() { _lines.clear(); }
  /// The lines with a newline between them; empty when there are none.
  std::string text() const;

 private:
  std::map<Matter, std::string> _lines;
};

}  // namespace varnel

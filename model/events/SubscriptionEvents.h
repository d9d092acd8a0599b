#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/BoundEntry.h"
#include "base/Value.h"
#include "model/events/DisplayEvent.h"

namespace varnel {

/// Watches the sections of one SIM card, or those that belong to none.
class SubscriptionEvents {
 public:
  /// The path of the groups: "SIM 1/", or empty.
  explicit SubscriptionEvents(std::string_view path);

  /// Looks at these groups from now on. What was shown before is not forgotten.
  void bind(const Dictionary& groups);
  /// Adds what has happened since the last look.
  void look(Time time, std::vector<DisplayEvent>& events);

 private:
  // An entry, and what it showed at the last look.
  struct Entry {
    BoundEntry bound;
    std::string before{};

    explicit Entry(std::string_view name) : bound(name) {}
    // What it shows in the section now.
    const std::string& now(const Value& section);
  };

  // One line of the tables in the source file, by its index there; and the section, once it is there.
  struct CellWatch {
    std::size_t source;
    Value section{}, connection{};
    std::vector<Entry> entries;
    Entry connectionState;
    bool wasConnected = false;
  };
  struct StateWatch {
    std::size_t source;
    Value section{};
    Entry state, count;
    bool hasService = false;
    bool isLost = false;  // after it had been there
  };
  struct VersionWatch {
    std::string path;
    Value section{};
    Entry version;
    std::vector<std::string> told{};
  };

  void lookAtCell(CellWatch& watch);
  void lookAtState(StateWatch& watch);
  void lookAtService(StateWatch& watch, const std::string& text);
  void lookAtVersion(VersionWatch& watch);
  void bindVersions(const Dictionary& groups);
  void add(EventKind kind, std::string_view section, std::string from, std::string to);

  const std::string _path;
  std::vector<CellWatch> _cells;
  std::vector<StateWatch> _states;
  std::vector<VersionWatch> _versions;
  // Of the look that is going on.
  Time _time;
  std::vector<DisplayEvent>* _events = nullptr;
};

}  // namespace varnel

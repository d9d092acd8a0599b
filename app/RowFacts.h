#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "app/RecordSummary.h"
#include "app/RowAnswers.h"
#include "app/RowCourse.h"
#include "app/TreeChanges.h"
#include "app/TreeSearch.h"
#include "app/ValueHistory.h"
#include "platform/Clock.h"
#include "platform/ui/TableCell.h"

namespace varnel {

/// What panes show of a row beside its texts. It outlives the panes.
class RowFacts {
 public:
  using Node = std::shared_ptr<const VarnelModelNode>;

  /// Who knows something about rows. They outlive this.
  struct Sources {
    const Clock& clock;
    const ValueHistory* history = nullptr;  ///< null: no courses
    const RowAnswers* answers = nullptr;    ///< null: changes and courses only
    const RowCourses* courses = nullptr;    ///< null: those of the history
  };
  /// Whether messages go on changing the display.
  enum class Display { Renewed, Standing };
  /// A row of a pane.
  struct Row {
    const VarnelModelNode& node;
    const VarnelModelNode& pane;  ///< the node around it
    const NamePath& namesOfPane;  ///< without the root's
  };

  explicit RowFacts(const Sources& sources) : _sources(sources) {}

  /// The display comes from another generator now.
  void setFormats(NumberFormats formats);
  /// Rows of this tree are shown next. It follows the one of the call before; null forgets the tree before.
  void follow(Node root, Display display);
  /// True when rows that are shown already now have other facts, though the tree is the same.
  bool haveChanged(Display display);

  CellFacts of(const Row& row);
  /// What there is to say about the row: lines with a newline between them; empty for nothing.
  std::string explanation(const Row& row);

 private:
  // What a leaf shows, wherever the records around it stand.
  struct Kind {
    EntryFormats formats;
    std::optional<Explanation::Limits> limits;
  };

  std::vector<std::optional<double>> courseOf(const VarnelModelNode& row) const;
  const Kind& kindOf(const Row& row);
  std::optional<RecordSummaries::Level> levelIn(const Row& leaf);
  RecordSummary summaryOf(const Row& record);
  CellDimming dimmingOf(const Row& row);
  bool isOld(const Time& writtenAt);
  unsigned editionOfCourses() const { return _sources.courses ? _sources.courses->edition() : 0; }

  Sources _sources;
  NumberFormats _formats;
  std::unordered_map<std::string, Kind> _kinds;  // by path
  Node _root;
  TreeChanges _changes;
  Display _display = Display::Renewed;
  unsigned _editionOfCourses = 0;
  std::optional<Time> _nextAging;  // the first moment when a value that is shown becomes old
  std::unordered_map<const VarnelModelNode*, RecordSummaries> _summaries;  // by list of the tree
};

}  // namespace varnel

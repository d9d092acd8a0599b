#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "app/TreeSearch.h"
#include "app/ValueHistory.h"
#include "model/Explanations.h"
#include "model/VarnelModelNode.h"
#include "platform/Clock.h"
#include "platform/Resources.h"

namespace varnel {

/// What a viewer tells its user about a row of the display when he asks: what it means, how good its level
/// is, how old its value is, and whether there is a course. Every user interface asks here, so all of them
/// tell the same.
class RowAnswers final {
 public:
  /// The objects must outlive it. The resource is read when somebody asks for the first time. Only rows of
  /// the display that the history got last have a level or a course.
  RowAnswers(const Resources& resources, const Clock& clock, const ValueHistory& history)
      : _resources(resources), _clock(clock), _history(history) {}

  /// The path of these names, such as "/Cells/0/RSRP".
  static std::string pathOf(const NamePath& names);
  /// The names with an arrow between them, such as "Cells > 0 > RSRP".
  static std::string titleOf(const NamePath& names);

  /// What stands in the tooltip of a row: what it means, how good this level is, and how long ago the modem
  /// sent the value. A line for each of them that is known, with a newline between them.
  std::string explanation(const VarnelModelNode& row, std::string_view path,
                          const std::optional<SignalLevel>& level) const;

  /// What the row or section under this path means: lines that each end in a newline. Empty where nothing is
  /// known.
  std::string meaning(std::string_view path) const;
  /// How good the level in the row is; absent for a row that shows no level.
  std::optional<SignalLevel> level(const VarnelModelNode& row, std::string_view path) const;
  /// When the modem last sent the value: a sentence without a newline. Empty for a row that leads to others,
  /// and when the moment is not known.
  std::string age(const VarnelModelNode& row) const;
  /// All of this with the names and the value of the row, in lines that each end in a newline.
  std::string everything(const VarnelModelNode& row, const NamePath& names) const;

  /// The course of a row's number.
  struct Course {
    std::string title;            ///< the names, and what the record is about if the row is in a list
    ValueHistory::Number number;  ///< the series in the history; stays when the record changes its place
  };
  /// Absent for a row that is no number.
  std::optional<Course> course(const VarnelModelNode& row, const NamePath& names) const;

  /// Reads the resource if that was not done yet.
  const Explanations& explanations() const;

 private:
  const Resources& _resources;
  const Clock& _clock;
  const ValueHistory& _history;
  mutable std::optional<Explanations> _explanations;
};

}  // namespace varnel

#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "app/EventHistory.h"
#include "app/ValueHistory.h"
#include "programs/shared/Generation.h"
#include "programs/varnel/HistoryTrends.h"

namespace varnel {

/// The numbers of all displays of a snapshot, at the times when they were shown. There are no events: between
/// two displays anything may have happened.
class SavedHistory final {
 public:
  struct Wish {
    std::string path;
    std::vector<Generation> displays;
    NumberFormats formats{};
    /// Its zone is that of the axis; null for UTC. It must outlive the object.
    const Clock* clock = nullptr;
    std::function<std::optional<Time>()> shownTime{};  ///< of the display that is shown; may be empty
  };

  explicit SavedHistory(Wish wish);
  SavedHistory(const SavedHistory&) = delete;
  SavedHistory& operator=(const SavedHistory&) = delete;

  /// Why there are no courses: a sentence. Empty when there are some.
  std::string obstacle() const;
  /// The displays are read when somebody asks for the first time.
  HistoryTrends& trends();

 private:
  void read();

  const Wish _wish;
  bool _isRead = false;
  ValueHistory _numbers;
  EventHistory _events;  // none
  HistoryTrends _trends;
};

}  // namespace varnel

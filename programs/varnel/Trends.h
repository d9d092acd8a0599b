#pragma once

#include <QPointer>
#include <functional>
#include <memory>
#include <string>

#include "app/TreeSearch.h"
#include "programs/varnel/CaptureHistory.h"
#include "programs/varnel/HistoryTrends.h"
#include "programs/varnel/SavedHistory.h"
#include "programs/varnel/trends/TrendPage.h"
#include "widgets/WindowWidget.h"

namespace varnel {

/// Shows the courses of numbers on a page of the window. T shows that of the current row, Shift+T adds it to
/// the last picture. The view is in a module, which is loaded when it is needed.
class Trends final {
 public:
  struct Host {
    /// The numbers of the display.
    HistoryTrends& live;
    /// The key of the row in the history; nothing when the row has no course.
    std::function<std::optional<std::string>(const NamePath& path)> keyOf;
    /// Tells the user why no course can be shown.
    std::function<void(const std::string& why)> tellFailure;
  };

  explicit Trends(Host host) : _host(std::move(host)) {}

  /// Adds the commands to the window.
  void furnish(WindowWidget& window);
  /// Shows the course of a row, whatever the picture had before.
  void show(const NamePath& path);
  /// Adds the course of a row to those that the last picture had.
  void showAlso(const NamePath& path);
  /// A display was shown.
  void refresh();
  /// Shows the courses of this capture from now on, in place of those of the display. If it turns out to be
  /// no capture, those of the display are shown.
  void openCapture(CaptureHistory::Wish wish);
  /// Shows the courses over these displays from now on.
  void openSaved(SavedHistory::Wish wish);
  /// Shows the courses of the display again.
  void closeFile();
  /// The history of that capture. Null when there is none, or when it is no capture.
  const CaptureHistory* capture() const;

  /// Null while no page with courses is open.
  TrendPage* page() const { return _page && _window && _window->page() == _page ? _page.data() : nullptr; }

 private:
  enum class Picture { New, WithFormerRows };
  void open(const NamePath& path, Picture picture);
  std::optional<std::string> keyOf(const NamePath& path);
  HistoryTrends& source();
  void leavePage();

  Host _host;
  std::unique_ptr<CaptureHistory> _capture;
  std::unique_ptr<SavedHistory> _saved;
  QPointer<WindowWidget> _window;
  QPointer<TrendPage> _page;
};

}  // namespace varnel

#pragma once

#include <QAbstractListModel>
#include <QLabel>
#include <QLineEdit>
#include <QListView>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "widgets/TouchScrolling.h"

namespace varnel {

/// A row that was found somewhere in the display.
struct SearchResult {
  std::vector<std::string> path{};  ///< the names from below the root; the last one is the row's own
  std::string value{};              ///< empty for a row that leads to another pane

  friend bool operator==(const SearchResult&, const SearchResult&) = default;
};

/// The rows of a search. The text of an item is the row's name.
class SearchResults final : public QAbstractListModel {
 public:
  enum Role {
    SectionsRole = Qt::UserRole,  ///< the names above the row's own, with arrows between them
    ValueRole,
  };

  /// Replaces the rows. While they have the same paths as before, only changed values are told.
  void show(std::vector<SearchResult> rows);
  const SearchResult& row(const QModelIndex& index) const {
    return _rows.at(static_cast<std::size_t>(index.row()));
  }
  /// The item with this path; an invalid index when there is none.
  QModelIndex indexOf(const std::vector<std::string>& path) const;

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;

 private:
  bool haveSamePaths(const std::vector<SearchResult>& rows) const;

  std::vector<SearchResult> _rows;
};

/// The list of what was found. Touch scrolls it, and a tap chooses.
class SearchResultsView final : public QListView {
 public:
  /// `chosen` is called with the item that a click or a tap chooses.
  explicit SearchResultsView(const std::function<void(const QModelIndex& index)>& chosen);

  QSize sizeHint() const override { return {320, 200}; }

 protected:
  bool viewportEvent(QEvent* event) override;

 private:
  TouchScrolling _touch;
};

/// Finds rows in the whole display while the user types. Up, Down, Page Up, and Page Down choose among them,
/// Return or a click goes to one.
class SearchPage final : public QWidget {
  Q_OBJECT

 public:
  using Search = std::function<std::vector<SearchResult>(const std::string& words)>;
  using GoTo = std::function<void(const SearchResult& row)>;

  SearchPage(Search search, GoTo goTo);

  /// The display has changed. The current row stays current, and stays at its place on the screen, as long as
  /// it is still found.
  void searchAgain();
  /// The row that Return goes to; absent when nothing was found.
  std::optional<SearchResult> currentRow() const;
  /// Gives the keyboard to the words, and selects them.
  void startOver();

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void searchAnew();
  void goTo(const QModelIndex& index);
  void showCount();
  bool takeKey(const QObject* watched, QKeyEvent& event);

  const Search _search;
  const GoTo _goTo;
  QLineEdit _words;
  QLabel _count;
  SearchResults _rows;
  SearchResultsView _view;
};

}  // namespace varnel

#pragma once

#include <functional>
#include <string>
#include <vector>

#include "terminal/Overlay.h"
#include "terminal/TerminalTextField.h"

namespace varnel {

/// A row that was found somewhere in the tree.
struct FoundRow {
  std::vector<std::string> path{};  ///< the names from the top of the tree; the last one is the row's own
  std::string value{};              ///< empty for a row that leads to another pane
};

/// Finds a row by its name and value, and the names of the panes above it. The rows appear while the user
/// types. Return goes to the chosen one, Escape leaves.
class FindPage final : public Overlay {
 public:
  using Search = std::function<std::vector<FoundRow>(const std::string& words)>;
  using GoTo = std::function<void(const FoundRow& row)>;

  FindPage(Search search, GoTo goTo);

  Wish take(const Key& key) override;
  void paint(CellGrid& grid, const Glyphs& glyphs) override;

 private:
  void moveBy(int rows);
  void searchAgain();
  void paintRow(CellGrid& grid, int line, const FoundRow& row, const Look& look, const Glyphs& glyphs) const;

  const Search _search;
  const GoTo _goTo;
  TerminalTextField _words;
  std::vector<FoundRow> _rows;
  int _focus = 0;
  int _top = 0;
  int _page = 1;
};

}  // namespace varnel

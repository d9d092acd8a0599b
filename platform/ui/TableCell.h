#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ui/Font.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/Label.h"
#include "platform/ui/ScrollContainer.h"

namespace varnel {

/// What the host puts into a cell.
enum class CellStyle {
  Default,        ///< one text
  NameAndDetail,  ///< a name on the left, a detail on the right
};

/// The mark at a row's right edge.
enum class CellAccessory {
  None,
  DisclosureIndicator,  ///< the row leads to another pane
  Checkmark,
};

/// Whether a row is as it was before the last refresh.
enum class CellChange { None, Changed };

/// How good the level is that a row shows, if it shows one.
enum class CellLevel { None, Poor, Fair, Good, Excellent };

/// What of a row is out of date.
enum class CellDimming {
  None,
  Value,  ///< no packet has renewed the value for some time
  All,    ///< nothing renews the display
};

/// What a host may show of a row beside its texts.
struct CellFacts {
  CellChange change = CellChange::None;
  CellLevel level = CellLevel::None;
  CellDimming dimming = CellDimming::None;
  /// What is in the record to which the row leads: parts, the most important one first. Empty for other rows.
  std::vector<std::string> summary{};
  /// The course of the row's value, the oldest first, one value per equal stretch of time; nothing where
  /// there was none. Empty when the value is no number.
  std::vector<std::optional<double>> course{};

  friend bool operator==(const CellFacts&, const CellFacts&) = default;
};

/// The visible part of a cell. A table makes it.
class CellView {
 public:
  virtual ~CellView() = default;
  /// Does the host's own layout. Afterwards the content area has the size that it has in a row of the table's
  /// current width.
  virtual void layOut() = 0;
  /// The content area in its own coordinates: the row without the room of the accessory.
  virtual Rect contentBounds() const = 0;

  /// Adds parts to the content area. They live as long as the view.
  virtual Label& addLabel() = 0;
  virtual ScrollContainer& addScrollContainer() = 0;

  virtual void setAccessory(CellAccessory accessory) = 0;
  /// The style's built-in text and its font. A long text is cut.
  virtual void setText(std::string_view text) = 0;
  virtual void setTextFont(const Font& font) = 0;

  /// What may be shown beside the texts. A host that shows nothing of it need not keep it.
  virtual void setFacts(CellFacts&& /*facts*/) {}
};

/// A cell: its view, and what its maker keeps with it.
class TableCell {
 public:
  TableCell(std::unique_ptr<CellView> cellView, std::string_view reuseIdentifier)
      : _cellView(std::move(cellView)), _reuseIdentifier(reuseIdentifier) {}
  TableCell(const TableCell&) = delete;
  TableCell& operator=(const TableCell&) = delete;
  virtual ~TableCell() = default;

  CellView& cellView() const { return *_cellView; }
  /// The name under which the table hands it out again.
  const std::string& reuseIdentifier() const { return _reuseIdentifier; }
  /// The table calls it when the width of a cell in use has changed.
  virtual void layOutAgain() {}

 private:
  std::unique_ptr<CellView> _cellView;
  std::string _reuseIdentifier;
};

}  // namespace varnel

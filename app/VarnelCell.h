#pragma once

#include <memory>
#include <string_view>

#include "platform/ui/TableView.h"
#include "platform/ui/TextMetrics.h"

namespace varnel {

/// A row of a pane: a name only, or a name and a value. When the row is too short for name and value, both
/// scroll sideways together.
class VarnelCell final : public TableCell {
 public:
  /// The cell with a name only. The key is the built-in text of the cell.
  static std::unique_ptr<VarnelCell> initWithStyleKey_reuseIdentifier(TableView& table,
                                                                      const TextMetrics& metrics,
                                                                      CellStyle style,
                                                                      std::string_view reuseIdentifier);
  /// The cell with a name and a value. Key and value are in a scroll container.
  static std::unique_ptr<VarnelCell> initWithStyle_reuseIdentifier(TableView& table,
                                                                   const TextMetrics& metrics,
                                                                   CellStyle style,
                                                                   std::string_view reuseIdentifier);

  Label& key() const { return *_key; }
  /// Null in a cell with a name only.
  Label* value() const { return _value; }

  /// Lays out a row with a name only.
  void setLayoutKey();
  /// Lays out a row with a name and a value. The value is at the right edge if there is room, else after the
  /// name.
  void setLayout();
  /// Repeats the last layout.
  void layOutAgain() override;

 private:
  VarnelCell(std::unique_ptr<CellView> cellView, std::string_view reuseIdentifier, const TextMetrics& metrics)
      : TableCell(std::move(cellView), reuseIdentifier), _metrics(metrics) {}

  Rect layOutBase();
  Size measured(const Label* label) const;
  Size placeKey(const Rect& content);

  const TextMetrics& _metrics;
  Label* _key = nullptr;
  Label* _value = nullptr;
  ScrollContainer* _view = nullptr;
  void (VarnelCell::*_lastLayout)() = nullptr;
};

}  // namespace varnel

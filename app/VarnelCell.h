#pragma once

#include <memory>
#include <string_view>

#include "platform/ui/TableView.h"
#include "platform/ui/TextMetrics.h"

namespace varnel {

/// The row of a pane: a name alone, or a name and a value that scroll sideways together when the row is too
/// short for them.
class VarnelCell final : public TableCell {
 public:
  /// The name-only cell: the key stands in the cell itself.
  static std::unique_ptr<VarnelCell> initWithStyleKey_reuseIdentifier(TableView& table,
                                                                      const TextMetrics& metrics,
                                                                      CellStyle style,
                                                                      std::string_view reuseIdentifier);
  /// The name-and-value cell: key and value stand in a scroll container.
  static std::unique_ptr<VarnelCell> initWithStyle_reuseIdentifier(TableView& table,
                                                                   const TextMetrics& metrics,
                                                                   CellStyle style,
                                                                   std::string_view reuseIdentifier);

  Label& key() const { return *_key; }
  /// Null in a name-only cell.
  Label* value() const { return _value; }

  /// Lays out a row of a name alone.
  void setLayoutKey();
  /// Lays out a row of a name and a value: the value at the right edge when there is room, else behind the
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

#include "app/VarnelCell.h"

namespace varnel {

namespace {

constexpr double fontSize = 15;
constexpr double keyInset = 10;
constexpr double gapBeforeValue = 50;
constexpr double containerHeight = 50;

const Font keyFont = Font::boldSystem(fontSize);
const Font valueFont = Font::system(fontSize);

Rect centered(double x, const Size& size, double height) {
  return {x, (height - size.height) / 2, size.width, size.height};
}

}  // namespace

std::unique_ptr<VarnelCell> VarnelCell::initWithStyleKey_reuseIdentifier(TableView& table,
                                                                         const TextMetrics& metrics,
                                                                         CellStyle style,
                                                                         std::string_view reuseIdentifier) {
  std::unique_ptr<VarnelCell> cell(new VarnelCell(table.makeCellView(style), reuseIdentifier, metrics));
  cell->_key = &cell->cellView().addLabel();
  cell->_key->setFont(keyFont);
  return cell;
}

std::unique_ptr<VarnelCell> VarnelCell::initWithStyle_reuseIdentifier(TableView& table,
                                                                      const TextMetrics& metrics,
                                                                      CellStyle style,
                                                                      std::string_view reuseIdentifier) {
  std::unique_ptr<VarnelCell> cell(new VarnelCell(table.makeCellView(style), reuseIdentifier, metrics));
  cell->_view = &cell->cellView().addScrollContainer();
  cell->_key = &cell->_view->addLabel();
  cell->_key->setFont(keyFont);
  cell->_value = &cell->_view->addLabel();
  cell->_value->setFont(valueFont);
  return cell;
}

void VarnelCell::setLayoutKey() {
  _lastLayout = &VarnelCell::setLayoutKey;
  placeKey(layOutBase());
}

void VarnelCell::setLayout() {
  _lastLayout = &VarnelCell::setLayout;
  const Rect content = layOutBase();
  const Size keySize = placeKey(content);
  if (!_view) return;  // a cell with a name only, used again for a leaf

  const Size valueSize = measured(_value);
  const double need = keySize.width + keyInset + gapBeforeValue + valueSize.width;
  const double behindKey = content.x + keyInset + keySize.width + gapBeforeValue;
  const double valueX = need < content.width ? content.width - valueSize.width : behindKey;
  _value->setFrame(centered(valueX, valueSize, content.height));
  // Kept: the scrolled content is wider than key and value need.
  const double contentWidth =
      need > content.width ? content.width + keySize.width + valueSize.width : content.width;
  _view->setContentSize({contentWidth, containerHeight});
  _view->setFrame({content.x, content.y, content.width, containerHeight});
}

void VarnelCell::layOutAgain() {
  if (_lastLayout) (this->*_lastLayout)();
}

Rect VarnelCell::layOutBase() {
  cellView().layOut();
  return cellView().contentBounds();
}

// Kept: the value too is measured in bold, though it is drawn in regular.
Size VarnelCell::measured(const Label* label) const { return _metrics.sizeOfText(label->text(), keyFont); }

Size VarnelCell::placeKey(const Rect& content) {
  const Size size = measured(_key);
  _key->setFrame(centered(content.x + keyInset, size, content.height));
  return size;
}

}  // namespace varnel

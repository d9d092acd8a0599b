#include "widgets/ToolbarWidget.h"

#include <QHelpEvent>
#include <QLabel>
#include <QPainter>
#include <QStyle>
#include <QToolTip>
#include <algorithm>
#include <utility>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"
#include "widgets/SpinnerWidget.h"
#include "widgets/TextButton.h"

namespace varnel {

namespace {

constexpr int barHeight = 48;
constexpr int inset = 10;

// A text that ends in three dots where it is cut. A tooltip then has all of it.
class StatusLabel final : public QLabel {
 protected:
  bool event(QEvent* event) override {
    if (event->type() != QEvent::ToolTip) return QLabel::event(event);
    if (isCut())
      QToolTip::showText(static_cast<const QHelpEvent&>(*event).globalPos(), plainTooltip(text()), this);
    else
      QToolTip::hideText();
    return true;
  }
  void paintEvent(QPaintEvent* event) override {
    if (!isCut()) return QLabel::paintEvent(event);
    QPainter painter(this);
    style()->drawItemText(&painter, rect(), Qt::AlignLeft | Qt::AlignVCenter, palette(), isEnabled(),
                          fontMetrics().elidedText(text(), Qt::ElideRight, width()), foregroundRole());
  }

 private:
  bool isCut() const { return fontMetrics().horizontalAdvance(text()) > width(); }
};

QLabel* makeLabel() {
  auto* label = new StatusLabel;
  label->setTextFormat(Qt::PlainText);
  // Lets the window be narrower than the text.
  label->setMinimumWidth(1);
  return label;
}

// The widget of an item; null for a space.
QWidget* makeWidget(const ToolbarItem& item) {
  if (std::holds_alternative<ActivityIndicator>(item)) return new SpinnerWidget;
  if (std::holds_alternative<ToolbarLabel>(item)) return makeLabel();
  if (std::holds_alternative<BarButton>(item)) return new TextButton;
  return nullptr;
}

QString titleOf(BarButton::SystemItem item) {
  switch (item) {
    case BarButton::SystemItem::Save:
      return QStringLiteral("Save");
  }
  return {};
}

void display(const ActivityIndicator& indicator, QWidget& widget) {
  static_cast<SpinnerWidget&>(widget).setAnimating(indicator.isAnimating);
}

void display(const ToolbarLabel& label, QWidget& widget) {
  auto& shown = static_cast<QLabel&>(widget);
  const QFont font = qtFont(label.font);
  if (shown.font() != font) shown.setFont(font);
  shown.setText(singleLine(label.text));
}

void display(const BarButton& button, QWidget& widget) {
  static_cast<TextButton&>(widget).setText(titleOf(button.item));
}

void display(const FlexibleSpace&, QWidget&) {}

}  // namespace

ToolbarWidget::ToolbarWidget(QWidget* parent) : QWidget(parent), _row(this) {
  setFixedHeight(barHeight);
  _row.setContentsMargins(inset, 0, 0, 0);
  _row.setSpacing(inset);
}

void ToolbarWidget::setItems(std::vector<ToolbarItem> items) {
  const bool isSame = hasSameKinds(items);
  // Keeps the old items until the end: the running action may belong to one of them.
  const auto former = std::exchange(_items, std::move(items));
  if (!isSame) rebuild(_items);
  for (std::size_t index = 0; index < _items.size(); ++index) showItem(index);
}

bool ToolbarWidget::hasSameKinds(const std::vector<ToolbarItem>& items) const {
  return std::ranges::equal(items, _items, [](const ToolbarItem& one, const ToolbarItem& other) {
    return one.index() == other.index();
  });
}

void ToolbarWidget::rebuild(const std::vector<ToolbarItem>& items) {
  for (QWidget* widget : _widgets) {
    if (!widget) continue;
    widget->hide();
    widget->deleteLater();
  }
  _widgets.clear();
  while (QLayoutItem* placed = _row.takeAt(0)) delete placed;
  for (std::size_t index = 0; index < items.size(); ++index) {
    QWidget* widget = _widgets.emplace_back(makeWidget(items[index]));
    if (!widget) {
      _row.addStretch(1);
      continue;
    }
    _row.addWidget(widget);
    if (auto* button = dynamic_cast<QAbstractButton*>(widget))
      connect(button, &QAbstractButton::clicked, this, [this, index] { perform(index); });
  }
}

void ToolbarWidget::showItem(std::size_t index) {
  if (!_widgets[index]) return;
  std::visit([&](const auto& item) { display(item, *_widgets[index]); }, _items[index]);
}

void ToolbarWidget::perform(std::size_t index) {
  const auto* button = std::get_if<BarButton>(&_items[index]);
  if (!button) return;
  // A copy: the action may set other items.
  if (const auto action = button->action) action();
}

bool ToolbarWidget::press(BarButton::SystemItem item) {
  for (std::size_t index = 0; index < _items.size(); ++index) {
    const auto* button = std::get_if<BarButton>(&_items[index]);
    if (!button || button->item != item) continue;
    perform(index);
    return true;
  }
  return false;
}

void ToolbarWidget::fallSilent() {
  for (ToolbarItem& item : _items) {
    if (auto* button = std::get_if<BarButton>(&item)) button->action = nullptr;
  }
}

void ToolbarWidget::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  painter.fillRect(QRectF(0, 0, width(), 1 / devicePixelRatioF()), separatorColor(palette()));
}

}  // namespace varnel

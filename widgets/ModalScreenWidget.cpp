#include "widgets/ModalScreenWidget.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QMouseEvent>
#include <utility>

#include "widgets/FocusCycle.h"
#include "widgets/QtValues.h"
#include "widgets/TextButton.h"

namespace varnel {

namespace {

constexpr int widestRows = 640;

template <class Widgets>
auto widgetNamed(const Widgets& widgets, std::string_view outlet) {
  const auto found = widgets.find(outlet);
  return found == widgets.end() ? nullptr : found->second;
}

// The title of the button that answers to the key; empty when there is none.
std::string_view titleForKey(const QKeyEvent& event) {
  if (event.matches(QKeySequence::Save)) return "Save";
  if (event.matches(QKeySequence::Cancel) || event.key() == Qt::Key_Back) return "Cancel";
  return {};
}

}  // namespace

ModalScreenWidget::ModalScreenWidget(const ScreenLayout& layout, Actions actions)
    : _actions(std::move(actions)), _backgroundAction(layout.backgroundAction) {
  setAutoFillBackground(true);
  setFocusPolicy(Qt::ClickFocus);
  auto* sides = new QHBoxLayout(this);
  const int margin = qRound(layout.margin);
  sides->setContentsMargins(margin, margin, margin, margin);
  auto* rows = new QWidget;
  rows->setMaximumWidth(widestRows);
  rows->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
  sides->addWidget(rows);
  auto* column = new QVBoxLayout(rows);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(qRound(layout.spacing));
  column->addWidget(&_notice);
  for (const auto& row : layout.rows) addRow(*column, row, qRound(layout.spacing));
  column->addStretch(0);
}

void ModalScreenWidget::addRow(QVBoxLayout& column, const std::vector<ScreenElement>& elements, int spacing) {
  auto* row = new QHBoxLayout;
  row->setSpacing(spacing);
  for (const ScreenElement& element : elements) addElement(*row, element);
  const bool hasTable = std::ranges::any_of(
      elements, [](const ScreenElement& element) { return element.kind == ScreenElement::Kind::Table; });
  column.addLayout(row, hasTable ? 1 : 0);
}

void ModalScreenWidget::addElement(QBoxLayout& row, const ScreenElement& element) {
  switch (element.kind) {
    case ScreenElement::Kind::Button:
      row.addWidget(makeButton(element));
      return;
    case ScreenElement::Kind::TextField:
      row.addWidget(_fields[element.outlet] = new TextFieldWidget(singleLine(element.title)), 1);
      return;
    case ScreenElement::Kind::Table:
      row.addWidget(_tables[element.outlet] = new TableWidget, 1, Qt::Alignment());
      _tables[element.outlet]->setAccessibleName(singleLine(element.title));
      return;
    case ScreenElement::Kind::Space:
      row.addStretch(1);
      return;
  }
}

QWidget* ModalScreenWidget::makeButton(const ScreenElement& element) {
  auto* button = new TextButton;
  button->setText(singleLine(element.title));
  _actionsOfButtons.emplace(element.title, element.action);
  connect(button, &QAbstractButton::clicked, this, [this, action = element.action] { perform(action); });
  return button;
}

void ModalScreenWidget::perform(const std::string& action) {
  if (_actions && !action.empty()) _actions(action);
}

void ModalScreenWidget::setFrame(const Rect& frame) { setGeometry(qtPixels(frame)); }

TableView* ModalScreenWidget::table(std::string_view outlet) { return widgetNamed(_tables, outlet); }

TextField* ModalScreenWidget::textField(std::string_view outlet) { return widgetNamed(_fields, outlet); }

void ModalScreenWidget::enter(QWidget& below) {
  setParent(&below);
  setGeometry(below.rect());
}

void ModalScreenWidget::leave() {
  _actions = nullptr;
  for (const auto& [outlet, table] : _tables) table->fallSilent();
  for (const auto& [outlet, field] : _fields) field->setDelegate(nullptr);
  hide();
  setParent(nullptr);
}

void ModalScreenWidget::takeKeyboard() {
  QWidget* first = this;
  if (!_fields.empty()) first = _fields.begin()->second;
  first->setFocus(Qt::OtherFocusReason);
}

void ModalScreenWidget::keyPressEvent(QKeyEvent* event) {
  // No key goes to the panes below.
  event->accept();
  const auto found = _actionsOfButtons.find(titleForKey(*event));
  if (found != _actionsOfButtons.end()) perform(std::string(found->second));
}

void ModalScreenWidget::mousePressEvent(QMouseEvent* event) {
  event->accept();
  perform(std::string(_backgroundAction));
}

bool ModalScreenWidget::focusNextPrevChild(bool next) {
  return cycleFocusWithin(*this, next ? FocusDirection::Next : FocusDirection::Previous);
}

}  // namespace varnel

#include "widgets/AlertWidget.h"

#include <QAccessible>
#include <QApplication>
#include <QEvent>
#include <QKeyEvent>
#include <QLabel>
#include <QMouseEvent>
#include <QPainter>
#include <QVBoxLayout>
#include <utility>

#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr int widestCard = 320;
constexpr int margin = 16;
constexpr double titleSize = 17;
constexpr double messageSize = 15;
const QColor shade(0, 0, 0, 110);

QLabel* makeLabel(const std::string& text, const Font& font) {
  auto* label = new QLabel(singleLine(text));
  label->setTextFormat(Qt::PlainText);
  label->setFont(qtFont(font));
  label->setAlignment(Qt::AlignCenter);
  label->setWordWrap(true);
  return label;
}

}  // namespace

AlertWidget::AlertWidget(const Alert& alert, QWidget& window, std::function<void()> closed)
    : QWidget(&window), _card(new QWidget), _button(new TextButton), _closed(std::move(closed)) {
  setGeometry(window.rect());
  window.installEventFilter(this);
  setAccessibleName(singleLine(alert.title));
  setAccessibleDescription(singleLine(alert.message));

  auto* layout = new QVBoxLayout(this);
  layout->setContentsMargins(margin, margin, margin, margin);
  layout->addStretch();
  auto* middle = new QHBoxLayout;
  middle->addWidget(_card);
  layout->addLayout(middle);
  layout->addStretch();

  _card->setAutoFillBackground(true);
  _card->setMaximumWidth(widestCard);
  auto* column = new QVBoxLayout(_card);
  column->setContentsMargins(margin, margin, margin, margin / 2);
  column->addWidget(makeLabel(alert.title, Font::boldSystem(titleSize)));
  column->addWidget(makeLabel(alert.message, Font::system(messageSize)));
  column->addWidget(_button, 0, Qt::AlignHCenter);
  _button->setText(singleLine(alert.buttonTitle));

  connect(_button, &QAbstractButton::clicked, this, [this] { close(); });
  connect(qApp, &QApplication::focusChanged, this, [this](QWidget*, QWidget* now) { keepKeyboard(now); });
  show();
  raise();
  _button->setFocus(Qt::OtherFocusReason);
  QAccessibleEvent announcement(this, QAccessible::Alert);
  QAccessible::updateAccessibility(&announcement);
}

bool AlertWidget::isOnTop() const { return parentWidget() && parentWidget()->children().last() == this; }

void AlertWidget::keepKeyboard(const QWidget* holder) {
  if (!holder || !isOnTop() || isAncestorOf(holder) || holder->window() != window()) return;
  _button->setFocus(Qt::OtherFocusReason);
}

void AlertWidget::close() {
  hide();
  setParent(nullptr);
  deleteLater();
  if (_closed) _closed();
}

void AlertWidget::paintEvent(QPaintEvent*) { QPainter(this).fillRect(rect(), shade); }

void AlertWidget::keyPressEvent(QKeyEvent* event) {
  event->accept();
  if (event->matches(QKeySequence::Cancel)) close();
}

void AlertWidget::mousePressEvent(QMouseEvent* event) { event->accept(); }

bool AlertWidget::focusNextPrevChild(bool) { return true; }

bool AlertWidget::eventFilter(QObject* watched, QEvent* event) {
  if (watched == parent() && event->type() == QEvent::Resize) setGeometry(parentWidget()->rect());
  return QWidget::eventFilter(watched, event);
}

}  // namespace varnel

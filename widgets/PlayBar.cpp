#include "widgets/PlayBar.h"

#include <QAccessible>
#include <QActionGroup>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QMenu>
#include <QMouseEvent>
#include <QPainter>
#include <QPointer>
#include <QStyle>
#include <QStyleOptionSlider>
#include <QVBoxLayout>
#include <initializer_list>

#include "platform/ui/Font.h"
#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

using Button = PlayBarState::Button;

constexpr int barHeight = 52;
constexpr int spacing = 4;
constexpr int widthForDates = 480;
constexpr double timeSize = 13, progressSize = 12, menuSize = 15;
constexpr int keyPause_ms = 300;
constexpr double speeds[] = {0.5, 1, 2, 5, 10, 60, 600};

constexpr double grooveHeight = 4, handleRadius = 7;

// Goes to the place that is clicked, not a page towards it. The groove of the desktop's style cannot be seen
// on black, so the slider paints itself.
class PlaceSlider final : public QSlider {
 public:
  using QSlider::QSlider;

 protected:
  void paintEvent(QPaintEvent*) override {
    QStyleOptionSlider option;
    initStyleOption(&option);
    const QRectF handle = style()->subControlRect(QStyle::CC_Slider, &option, QStyle::SC_SliderHandle, this);
    const QColor ground = palette().color(QPalette::Window);
    const QColor accent = accentColor(palette(), ground);
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    const QRectF groove(handleRadius, (height() - grooveHeight) / 2, width() - 2 * handleRadius,
                        grooveHeight);
    paintGroove(painter, groove, seenOn(ground, markColor(palette()), palette().color(QPalette::WindowText)));
    QRectF passed = groove;
    option.upsideDown ? passed.setLeft(handle.center().x()) : passed.setRight(handle.center().x());
    paintGroove(painter, passed, accent);
    painter.setBrush(accent);
    painter.drawEllipse(handle.center(), handleRadius, handleRadius);
    if (!hasFocus()) return;
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(accent, 2));
    painter.drawRoundedRect(QRectF(rect()).adjusted(1, 1, -1, -1), 4, 4);
  }
  void mousePressEvent(QMouseEvent* event) override {
    if (event->button() == Qt::LeftButton) {
      QStyleOptionSlider option;
      initStyleOption(&option);
      const QRect handle = style()->subControlRect(QStyle::CC_Slider, &option, QStyle::SC_SliderHandle, this);
      if (!handle.contains(event->position().toPoint())) {
        const int room = width() - handle.width();
        const int at = static_cast<int>(event->position().x()) - handle.width() / 2;
        setSliderDown(true);  // the release of the mouse button tells the place
        setSliderPosition(QStyle::sliderValueFromPosition(minimum(), maximum(), at, room, option.upsideDown));
      }
    }
    QSlider::mousePressEvent(event);
  }

 private:
  static void paintGroove(QPainter& painter, const QRectF& groove, const QColor& color) {
    painter.setBrush(color);
    painter.drawRoundedRect(groove, grooveHeight / 2, grooveHeight / 2);
  }
};

QLabel* makeLabel(double size) {
  auto* const label = new QLabel;
  label->setTextFormat(Qt::PlainText);
  label->setFont(qtFont(Font::system(size)));
  return label;
}

QString speedText(double speed) { return QLocale::c().toString(speed, 'g', 6) + u'×'; }

}  // namespace

PlayBar::PlayBar(QWidget* parent)
    : QWidget(parent),
      _play(new GlyphButton),
      _slider(new PlaceSlider(Qt::Horizontal)),
      _time(makeLabel(timeSize)),
      _progress(makeLabel(progressSize)),
      _speed(new TextButton),
      _message(makeLabel(timeSize)),
      _remedy(new TextButton),
      _close(new GlyphButton) {
  auto* const row = new QHBoxLayout(this);
  row->setContentsMargins(spacing, 0, spacing, 0);
  row->setSpacing(spacing);
  row->addWidget(_play);
  row->addWidget(_slider, 1);
  auto* const texts = new QVBoxLayout;
  texts->setSpacing(0);
  texts->addStretch();
  texts->addWidget(_time, 0, Qt::AlignTrailing);
  texts->addWidget(_progress, 0, Qt::AlignTrailing);
  texts->addStretch();
  row->addLayout(texts);
  row->addWidget(_speed);
  row->addWidget(_message, 1);
  row->addWidget(_remedy);
  row->addWidget(_close);
  _message->setWordWrap(true);
  _message->setMinimumWidth(1);
  _message->setMargin(2 * spacing);
  _slider->setMinimumWidth(1);
  _slider->setAccessibleName(tr("Place in the capture"));
  _slider->setFocusPolicy(Qt::StrongFocus);
  _close->setGlyph(GlyphButton::Glyph::Close, tr("Close the file"));
  _speed->setToolTip(tr("Speed"));
  _keysAreDone.setSingleShot(true);
  _keysAreDone.setInterval(keyPause_ms);

  connect(_play, &QAbstractButton::clicked, this, &PlayBar::press);
  connect(_speed, &QAbstractButton::clicked, this, &PlayBar::chooseSpeed);
  connect(_remedy, &QAbstractButton::clicked, this, &PlayBar::remedyWanted);
  connect(_close, &QAbstractButton::clicked, this, &PlayBar::closeWanted);
  connect(_slider, &QSlider::sliderMoved, this, &PlayBar::dragged);
  connect(_slider, &QSlider::sliderReleased, this, [this] { Q_EMIT jumpWanted(_slider->value()); });
  connect(_slider, &QSlider::actionTriggered, this, [this] { sliderWasMoved(); });
  connect(&_keysAreDone, &QTimer::timeout, this, [this] { Q_EMIT jumpWanted(_slider->value()); });
  setState({});
}

QSize PlayBar::sizeHint() const { return {width(), barHeight}; }

void PlayBar::setState(const PlayBarState& state) {
  const bool hasNewMessage = state.message != _state.message && !state.message.isEmpty();
  const QPointer<QWidget> holder = focusWidget();
  const bool hadKeyboard = holder && holder->hasFocus();
  _state = state;
  const bool isPlaying = state.message.isEmpty();
  showButton();
  _slider->setVisible(isPlaying && state.length > 0);
  if (!_slider->isSliderDown() && !_keysAreDone.isActive()) {
    _slider->setRange(0, state.length);
    _slider->setSingleStep(state.step);
    _slider->setPageStep(6 * state.step);
    _slider->setValue(state.place);
    _progress->setText(state.progress);
  }
  showTime();
  _progress->setVisible(isPlaying && !state.progress.isEmpty());
  _speed->setVisible(isPlaying && state.speed);
  if (state.speed) {
    _speed->setText(speedText(*state.speed));
    _speed->setAccessibleName(tr("Speed %1").arg(_speed->text()));
    _speed->updateGeometry();
  }
  _message->setVisible(!isPlaying);
  _message->setText(state.message);
  _message->setToolTip(plainTooltip(state.message));
  _remedy->setVisible(!isPlaying && !state.remedy.isEmpty());
  _remedy->setText(state.remedy);
  _remedy->updateGeometry();
  setAccessibleName(state.name);
  setToolTip(plainTooltip(state.name));
  if (hadKeyboard && holder && !holder->isVisibleTo(this)) passKeyboardOn();
  if (!hasNewMessage) return;
  setAccessibleDescription(state.message);
  QAccessibleEvent spoken(this, QAccessible::Alert);
  QAccessible::updateAccessibility(&spoken);
}

void PlayBar::setWayToClose(const QString& text) {
  if (text != _close->text()) _close->setGlyph(GlyphButton::Glyph::Close, text);
}

// What had the keyboard is hidden. The toolkit would give it to the button that closes everything.
void PlayBar::passKeyboardOn() {
  for (QWidget* const next : std::initializer_list<QWidget*>{_play, _remedy})
    if (next->isVisibleTo(this)) return next->setFocus(Qt::OtherFocusReason);
  Q_EMIT keyboardLeft();
}

void PlayBar::setProgress(const QString& progress) { _progress->setText(progress); }

void PlayBar::showButton() {
  using Glyph = GlyphButton::Glyph;
  _play->setVisible(_state.message.isEmpty() && _state.button != Button::None);
  switch (_state.button) {
    case Button::Play:
      return _play->setGlyph(Glyph::Play, tr("Play"));
    case Button::Pause:
      return _play->setGlyph(Glyph::Pause, tr("Pause"));
    case Button::Again:
      return _play->setGlyph(Glyph::Again, tr("Play again"));
    case Button::None:
      break;
  }
}

void PlayBar::showTime() {
  const bool isWide = width() >= widthForDates && !_state.date.isEmpty();
  _time->setText(isWide ? _state.date + u' ' + _state.clock : _state.clock);
  _time->setVisible(_state.message.isEmpty() && !_state.clock.isEmpty());
}

void PlayBar::press() {
  switch (_state.button) {
    case Button::Play:
      Q_EMIT playWanted();
      break;
    case Button::Pause:
      Q_EMIT pauseWanted();
      break;
    case Button::Again:
      Q_EMIT againWanted();
      break;
    case Button::None:
      break;
  }
}

// By keys or the wheel: with the mouse, the release of its button tells the end.
void PlayBar::sliderWasMoved() {
  if (_slider->isSliderDown()) return;
  Q_EMIT dragged(_slider->sliderPosition());
  _keysAreDone.start();
}

void PlayBar::chooseSpeed() {
  auto* const menu = new QMenu(this);
  menu->setAttribute(Qt::WA_DeleteOnClose);
  menu->setFont(qtFont(Font::system(menuSize)));
  auto* const group = new QActionGroup(menu);
  for (const double speed : speeds) {
    QAction* const choice = menu->addAction(speedText(speed));
    choice->setCheckable(true);
    choice->setChecked(_state.speed == speed);
    group->addAction(choice);
    connect(choice, &QAction::triggered, this, [this, speed] { Q_EMIT speedWanted(speed); });
  }
  menu->popup(_speed->mapToGlobal(QPoint(0, -menu->sizeHint().height())));
}

QString PlayBar::texts() const {
  QStringList shown;
  for (const QLabel* label : {_time, _progress, _message})
    if (!label->isHidden()) shown.append(label->text());
  return shown.join(QStringLiteral(" | "));
}

void PlayBar::keyPressEvent(QKeyEvent* event) {
  if (!event->matches(QKeySequence::Cancel)) return event->ignore();
  Q_EMIT keyboardLeft();
}

void PlayBar::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  showTime();
}

void PlayBar::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  painter.fillRect(QRectF(0, 0, width(), 1 / devicePixelRatioF()), separatorColor(palette()));
}

}  // namespace varnel

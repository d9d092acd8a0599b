#include "widgets/StartPage.h"

#include <QEvent>
#include <QKeyEvent>
#include <QMenu>
#include <QPainter>

#include "platform/ui/Font.h"
#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr int widestColumn = 420;
constexpr int margin = 12;
constexpr double titleSize = 17, explanationSize = 14, menuSize = 15;
constexpr int offerHeight = 64;

// Something to choose, with a sentence that explains it, in as many lines as it needs. Its text is the title.
class OfferButton final : public QAbstractButton {
 public:
  OfferButton(const QString& title, QString explanation) : _explanation(std::move(explanation)) {
    setText(title);
    setAccessibleDescription(_explanation);
    setFocusPolicy(Qt::StrongFocus);
    QSizePolicy policy(QSizePolicy::Expanding, QSizePolicy::Preferred);
    policy.setHeightForWidth(true);
    setSizePolicy(policy);
  }
  QSize sizeHint() const override { return {widestColumn, heightForWidth(widestColumn)}; }
  QSize minimumSizeHint() const override { return {0, offerHeight}; }
  int heightForWidth(int width) const override {
    const QFontMetrics metrics(qtFont(Font::system(explanationSize)));
    const auto heightIn = [&](int room) {
      return metrics.boundingRect(QRect(0, 0, room, QWIDGETSIZE_MAX), Qt::TextWordWrap, _explanation)
          .height();
    };
    return offerHeight + heightIn(width - 2 * margin) - heightIn(QWIDGETSIZE_MAX);
  }

 protected:
  void paintEvent(QPaintEvent*) override {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setOpacity(isDown() ? 0.4 : 1);
    const QColor accent = accentColor(palette(), palette().color(QPalette::Base));
    painter.setPen(QPen(hasFocus() ? accent : separatorColor(palette()), hasFocus() ? 2 : 1));
    painter.drawRoundedRect(QRectF(rect()).adjusted(1, 1, -1, -1), 6, 6);
    const QRect room = rect().adjusted(margin, margin / 2, -margin, -margin / 2);
    const int titleHeight = (offerHeight - margin) / 2;
    paintLine(painter, {room.left(), room.top(), room.width(), titleHeight}, text(),
              Font::boldSystem(titleSize), accent);
    painter.setFont(qtFont(Font::system(explanationSize)));
    painter.setPen(palette().color(QPalette::Text));
    painter.drawText(room.adjusted(0, titleHeight, 0, 0),
                     Qt::AlignLeading | Qt::AlignVCenter | Qt::TextWordWrap, _explanation);
  }
  void keyPressEvent(QKeyEvent* event) override {
    if (event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter) return click();
    QAbstractButton::keyPressEvent(event);
  }

 private:
  static void paintLine(QPainter& painter, const QRect& room, const QString& line, const Font& font,
                        const QColor& color) {
    const QFont shown = qtFont(font);
    painter.setFont(shown);
    painter.setPen(color);
    painter.drawText(room, Qt::AlignLeading | Qt::AlignVCenter | Qt::TextSingleLine,
                     QFontMetricsF(shown).elidedText(line, Qt::ElideRight, room.width()));
  }

  const QString _explanation;
};

// The list of choices below the button that asks for one.
QMenu* menuBelow(QAbstractButton& button, const std::vector<StartPage::Choice>& choices,
                 const std::function<void(const QString& id)>& choose) {
  auto* const menu = new QMenu(&button);
  menu->setAttribute(Qt::WA_DeleteOnClose);
  menu->setFont(qtFont(Font::system(menuSize)));
  for (const auto& [id, name] : choices) {
    QString text = name;
    text.replace(u'&', QStringLiteral("&&"));
    QObject::connect(menu->addAction(text), &QAction::triggered, &button, [id = id, choose] { choose(id); });
  }
  menu->popup(button.mapToGlobal(QPoint(margin, button.height())));
  return menu;
}

}  // namespace

StartPage::StartPage(QWidget& table) : QWidget(&table) {
  auto* const row = new QHBoxLayout(this);
  row->setContentsMargins(margin, margin, margin, margin);
  auto* const page = new QWidget;
  page->setMaximumWidth(widestColumn);
  row->addWidget(page, 1);
  _column = new QVBoxLayout(page);
  _column->setContentsMargins(0, 0, 0, 0);
  _column->addStretch();
  QAbstractButton& modem = addOffer(tr("Simulated modem"), tr("See how it looks, without a modem"));
  _first = &modem;
  connect(&modem, &QAbstractButton::clicked, this, [this, &modem] {
    menuBelow(modem, _modems, [this](const QString& id) { Q_EMIT modemWanted(id); });
  });
  QAbstractButton& file = addOffer(tr("Open a file…"), tr("Or drop a capture or a snapshot here"));
  connect(&file, &QAbstractButton::clicked, this, &StartPage::fileWanted);
  QAbstractButton& port = addOffer(tr("Connect to a port"), tr("Show what a modem sends now"));
  connect(&port, &QAbstractButton::clicked, this, [this, &port] {
    menuBelow(port, _ports ? _ports() : std::vector<Choice>(),
              [this](const QString& id) { Q_EMIT portWanted(id); });
  });
  _column->addStretch();
  setGeometry(table.rect());
  table.installEventFilter(this);
}

QAbstractButton& StartPage::addOffer(const QString& title, const QString& explanation) {
  auto* const button = new OfferButton(title, explanation);
  _column->addWidget(button);
  return *button;
}

bool StartPage::eventFilter(QObject* watched, QEvent* event) {
  if (watched == parent() && event->type() == QEvent::Resize) setGeometry(parentWidget()->rect());
  return QWidget::eventFilter(watched, event);
}

// The table below must not shine through.
void StartPage::paintEvent(QPaintEvent*) { QPainter(this).fillRect(rect(), palette().color(QPalette::Base)); }

}  // namespace varnel

#include "widgets/HelpPage.h"

#include <QKeySequence>
#include <QScrollBar>
#include <QStringList>
#include <utility>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr double textSize = 14;
constexpr double margin = 10;

QString fromUtf8(const std::string& text) { return QString::fromStdString(text); }

QString heading(const QString& text) {
  return QStringLiteral("<h3>") + text.toHtmlEscaped() + QStringLiteral("</h3>");
}

}  // namespace

const std::vector<KeyHelp>& keysOfPanes() {
  static const std::vector<KeyHelp> keys = {
      {QStringLiteral("Up, Down"), QStringLiteral("go from row to row")},
      {QStringLiteral("Home, End"), QStringLiteral("go to the first and the last row")},
      {QStringLiteral("Page Up, Page Down"), QStringLiteral("go a page up or down")},
      {QStringLiteral("Return, Space, Right"), QStringLiteral("open the row")},
      {QStringLiteral("Escape, Left, Backspace"), QStringLiteral("go back")},
      {QStringLiteral("Left, Right"),
       QStringLiteral("with two panes side by side, go from one to the other")},
      {QStringLiteral("Shift+Left, Shift+Right"), QStringLiteral("scroll a long value")},
      {QStringLiteral("S"), QStringLiteral("sort a table with columns by the current one")},
      {QStringLiteral("Ctrl+S"), QStringLiteral("open the save screen, on devices that allow it")},
  };
  return keys;
}

std::vector<KeyHelp> keysOf(const QList<QAction*>& actions) {
  std::vector<KeyHelp> keys;
  for (const QAction* const action : actions) {
    QStringList names;
    for (const QKeySequence& key : action->shortcuts()) names.append(key.toString(QKeySequence::NativeText));
    if (!names.isEmpty() && !action->text().isEmpty())
      keys.push_back({names.join(QStringLiteral(", ")), action->text()});
  }
  return keys;
}

HelpPage::HelpPage(std::function<std::string()> about, std::vector<KeyHelp> keys)
    : _about(std::move(about)), _keys(std::move(keys)) {
  setFrameShape(QFrame::NoFrame);
  setFont(qtFont(Font::system(textSize)));
  document()->setDocumentMargin(margin);
  setAccessibleName(QStringLiteral("Help"));
  updateAbout();
}

void HelpPage::updateAbout() {
  const QString about = fromUtf8(_about());
  if (about == _shown && !document()->isEmpty()) return;
  _shown = about;
  const int place = verticalScrollBar()->value();
  setHtml(sheet(about));
  verticalScrollBar()->setValue(place);
}

QString HelpPage::sheet(const QString& about) const {
  QString html;
  if (!about.isEmpty()) {
    html += heading(QStringLiteral("What it means"));
    QString lines = about.toHtmlEscaped();
    html += QStringLiteral("<p>") + lines.trimmed().replace(u'\n', QStringLiteral("<br>")) +
            QStringLiteral("</p>");
  }
  html += heading(QStringLiteral("Keys")) +
          QStringLiteral("<table width=\"100%\" cellspacing=\"0\" cellpadding=\"3\">");
  for (const KeyHelp& key : _keys) {
    html += QStringLiteral("<tr><td width=\"42%\"><b>") + key.keys.toHtmlEscaped() +
            QStringLiteral("</b>&nbsp;</td><td>") + key.deed.toHtmlEscaped() + QStringLiteral("</td></tr>");
  }
  html += QStringLiteral("</table><p>");
  html +=
      QStringLiteral(
          "The right mouse button, a finger that rests on a row, and the three dots in the title bar open "
          "a menu with what can be done. With two panes, it is for the row of the pane with the keyboard; "
          "marks in the other pane are paler. A click on the title bar's arrow goes back.")
          .toHtmlEscaped();
  return html + QStringLiteral("</p>");
}

}  // namespace varnel

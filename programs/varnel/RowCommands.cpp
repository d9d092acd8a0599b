#include "programs/varnel/RowCommands.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QToolTip>
#include <utility>

#include "programs/varnel/RowCopies.h"
#include "widgets/HelpPage.h"
#include "widgets/QtValues.h"
#include "widgets/RowMenu.h"
#include "widgets/SearchPage.h"

namespace varnel {

namespace {

constexpr int shownOfCopy = 60;  // characters

// Says what was copied, since nothing else on the screen changes.
void confirm(WindowWidget& window, const QString& copied) {
  QString first = copied.section(u'\n', 0, 0).simplified();
  if (first.size() > shownOfCopy || copied.trimmed().contains(u'\n'))
    first = first.left(shownOfCopy) + QStringLiteral("…");
  QToolTip::showText(placeOfFocus(window), plainTooltip(QStringLiteral("Copied: ") + first), &window);
}

void tellNothingToCopy(WindowWidget& window) {
  QToolTip::showText(placeOfFocus(window), QStringLiteral("No row is chosen"), &window);
}

}  // namespace

RowCommands::RowCommands(VarnelApp& app, const RowAnswers& answers) : _app(app), _answers(answers) {
  _app.observeDisplay([this] { followDisplay(); });
}

void RowCommands::addTo(WindowWidget& window) {
  _window = &window;
  auto* const menu = new RowMenu(window);
  window.addCommand(QStringLiteral("Find a row"),
                    {QKeySequence(Qt::CTRL | Qt::Key_F), QKeySequence(Qt::Key_Slash)}, [this] { find(); });
  menu->setRowActions(
      {addCopy(Subject::Row, QStringLiteral("Copy the value"), {QKeySequence(Qt::CTRL | Qt::Key_C)},
               copied(copyOfValue)),
       addCopy(Subject::Row, QStringLiteral("Copy the row"), {QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_C)},
               copied(copyOfRow)),
       addCopy(Subject::Section, QStringLiteral("Copy the section as text"), {}, copied(copyOfSectionAsText)),
       addCopy(Subject::Section, QStringLiteral("Copy the section as JSON"), {}, copied(copyOfSectionAsJson)),
       addCopy(Subject::Section, QStringLiteral("Copy the path"), {}, [](const NamePath& names) {
         return names.empty() ? std::string("/") : RowAnswers::pathOf(names);
       })});
  window.addCommand(QStringLiteral("Help"), {QKeySequence(Qt::Key_F1), QKeySequence(Qt::Key_Question)},
                    [this] { help(); });
  const QAction& open =
      window.addCommand(QStringLiteral("Menu of the row"),
                        {QKeySequence(Qt::Key_Menu), QKeySequence(Qt::SHIFT | Qt::Key_F10)}, [this, menu] {
                          if (!_window->page()) menu->open();
                        });
  menu->leaveOut(open);
}

QAction* RowCommands::addCopy(Subject subject, const QString& text, const QList<QKeySequence>& keys,
                              std::function<std::string(const NamePath&)> contents) {
  QAction& action = _window->addCommand(text, keys, [this, subject, contents = std::move(contents)] {
    if (!has(subject)) return tellNothingToCopy(*_window);
    const std::string text = contents(names());
    if (text.empty()) return;
    const QString copied = QString::fromStdString(text);
    QGuiApplication::clipboard()->setText(copied);
    confirm(*_window, copied);
  });
  _window->offerOnlyIf(action, [this, subject] { return has(subject); });
  return &action;
}

std::function<std::string(const NamePath&)> RowCommands::copied(Copy copy) const {
  return [this, copy](const NamePath& names) {
    const VarnelModelNode* const root = _app.nodeAt({});
    return root ? copy(*root, names) : std::string();
  };
}

// The row of the search while it is open, else the row with the keyboard's focus.
NamePath RowCommands::names() const {
  if (const auto* const page = qobject_cast<SearchPage*>(_window->page())) {
    const auto row = page->currentRow();
    return row ? row->path : NamePath();
  }
  return _window->pathOfFocus();
}

// A pane without a current row is still a section.
bool RowCommands::has(Subject subject) const {
  if (!_app.hasDisplay()) return false;
  if (subject == Subject::Section) return true;
  if (const auto* const page = qobject_cast<SearchPage*>(_window->page()))
    return page->currentRow().has_value();
  return _window->stack() && _window->stack()->hasRowWithFocus();
}

void RowCommands::find() {
  if (auto* const page = qobject_cast<SearchPage*>(_window->page())) return page->startOver();
  const auto search = [this](const std::string& words) {
    std::vector<SearchResult> rows;
    for (auto& node : _app.find(words)) rows.push_back({std::move(node.path), std::move(node.value)});
    return rows;
  };
  const auto goTo = [this](const SearchResult& row) {
    _window->closePage();
    _app.goTo(row.path);
  };
  _window->showPage(QStringLiteral("Find"), std::make_unique<SearchPage>(search, goTo));
}

void RowCommands::help() {
  if (qobject_cast<HelpPage*>(_window->page())) return _window->closePage();
  const NamePath row = names();
  const auto about = [this, row] {
    const VarnelModelNode* const node = row.empty() ? nullptr : _app.nodeAt(row);
    return node ? _answers.everything(*node, row) : std::string();
  };
  std::vector<KeyHelp> keys = keysOfPanes();
  for (KeyHelp& key : keysOf(_window->actions())) keys.push_back(std::move(key));
  _window->showPage(QStringLiteral("Help"), std::make_unique<HelpPage>(about, std::move(keys)));
}

void RowCommands::followDisplay() const {
  if (!_window) return;
  if (auto* const page = qobject_cast<SearchPage*>(_window->page())) page->searchAgain();
  if (auto* const page = qobject_cast<HelpPage*>(_window->page())) page->updateAbout();
}

}  // namespace varnel

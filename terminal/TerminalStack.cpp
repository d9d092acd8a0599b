#include "terminal/TerminalStack.h"

#include <algorithm>
#include <utility>

#include "terminal/Characters.h"
#include "terminal/TerminalWindow.h"

namespace varnel {

namespace {

constexpr Look barLook{false, true, Ink::Plain};
constexpr std::wstring_view separator = L" — ";  // in the title of the window
constexpr std::wstring_view saveText = L" s Save ";
constexpr std::wstring_view helpText = L" ? Help ";

// The user interface that made this stack made its panes and screens too.
TerminalPane& paneOf(PaneController& controller) { return static_cast<TerminalPane&>(controller.pane()); }
TerminalModalScreen& screenOf(ModalController& controller) {
  return static_cast<TerminalModalScreen&>(controller.screen());
}

// What fits of the end of the text, after the mark.
std::wstring cutAtItsBeginning(std::wstring_view text, int columns, std::wstring_view mark) {
  if (columnsOf(text) <= columns) return std::wstring(text);
  while (!text.empty() && columnsOf(text) > columns - columnsOf(mark)) text.remove_prefix(1);
  return std::wstring(fitting(mark, std::max(0, columns))).append(text);
}

std::wstring withDashes(std::wstring_view title, std::wstring_view dash) {
  std::wstring text;
  for (auto end = title.find(separator); end != std::wstring_view::npos; end = title.find(separator)) {
    text.append(title.substr(0, end)).append(dash);
    title.remove_prefix(end + separator.size());
  }
  return text.append(title);
}

}  // namespace

TerminalStack::TerminalStack(std::shared_ptr<PaneController> root, Repainting& repainting)
    : _repainting(repainting) {
  _controllers.push_back(std::move(root));
  adopt(*_controllers.back());
}

TerminalStack::~TerminalStack() {
  if (_window) _window->forgetRoot();
  if (_modal) screenOf(*_modal).leave();
  for (const auto& controller : _controllers) release(*controller);
}

void TerminalStack::adopt(PaneController& controller) { controller.setNavigationController(this); }

void TerminalStack::release(PaneController& controller) {
  paneOf(controller).fallSilent();
  controller.setNavigationController(nullptr);
}

TerminalPane& TerminalStack::topPane() const { return paneOf(*_controllers.back()); }

TerminalPane& TerminalStack::paneBelow() const { return paneOf(*_controllers[_controllers.size() - 2]); }

void TerminalStack::appear() {
  topController()->viewWillAppear(Animation::None);
  layOut();
}

void TerminalStack::push(std::shared_ptr<PaneController> controller, Animation animation) {
  auto controllers = _controllers;
  controllers.push_back(std::move(controller));
  changeTop(std::move(controllers), animation);
}

void TerminalStack::popTo(const PaneController& controller, Animation animation) {
  const auto kept = std::ranges::find(_controllers, &controller, &std::shared_ptr<PaneController>::get);
  if (kept == _controllers.end() || kept + 1 == _controllers.end()) return;
  changeTop({_controllers.begin(), kept + 1}, animation);
}

void TerminalStack::changeTop(std::vector<std::shared_ptr<PaneController>> controllers, Animation) {
  const auto former = std::exchange(_controllers, std::move(controllers));
  if (_controllers.size() > former.size()) adopt(*_controllers.back());
  former.back()->viewWillDisappear(Animation::None);
  topController()->viewWillAppear(Animation::None);
  if (_delegate)
    _delegate->navigationController_willShowViewController_animated(*this, *topController(), Animation::None);
  layOut();
  for (std::size_t index = _controllers.size(); index < former.size(); ++index) {
    release(*former[index]);
    _repainting.releaseLater(former[index]);
  }
  _repainting.want();
}

void TerminalStack::showToolbar() {
  _showsToolbar = true;
  layOut();
}

void TerminalStack::setNotice(std::string_view text) {
  if (text == _notice) return;
  _notice = text;
  layOut();
  _repainting.want();
}

void TerminalStack::present(std::shared_ptr<ModalController> controller, Animation animation) {
  dismiss(animation);
  _modal = std::move(controller);
  _modal->viewDidLoad();
  _modal->viewWillAppear(Animation::None);
  layOut();
  _repainting.want();
}

void TerminalStack::dismiss(Animation) {
  if (!_modal) return;
  screenOf(*_modal).leave();
  _repainting.releaseLater(std::exchange(_modal, nullptr));
  _repainting.want();
}

void TerminalStack::setArea(const Area& area) {
  _area = area;
  layOut();
}

// From the top: the title, the notice, the tables, and the toolbar. The tables keep at least a row.
void TerminalStack::layOut() {
  const int toolbar = _showsToolbar ? 1 : 0;
  const int rest = std::max(0, _area.rows - 1 - toolbar);
  _noticeLines = wrapped(_notice, _area.columns);
  const auto most = static_cast<std::size_t>(rest > 1 ? std::max(1, rest / 2) : 0);
  if (_noticeLines.size() > most) _noticeLines.resize(most);
  const Area below{_area.column, _area.row + 1 + rowsOfNotice(), _area.columns,
                   std::max(0, rest - rowsOfNotice())};
  if (_modal) {
    Area whole = below;
    whole.rows += toolbar;
    screenOf(*_modal).setArea(whole);
  }
  if (_area.columns <= 0) return;
  if (!showsTwoPanes()) return topPane().table().setArea(below);
  Area left = below;
  left.columns = (below.columns - 1) / 2;
  Area right = below;
  right.column += left.columns + 1;
  right.columns -= left.columns + 1;
  paneBelow().table().setArea(left);
  topPane().table().setArea(right);
}

void TerminalStack::goBack() {
  if (_controllers.size() < 2) return;
  const auto below = _controllers[_controllers.size() - 2];
  popTo(*below, Animation::None);
}

KeyUse TerminalStack::take(const Key& key) {
  if (_modal) {
    const auto modal = _modal;  // it may leave meanwhile
    screenOf(*modal).take(key);
    return KeyUse::Used;
  }
  if (key.isMouse()) return takeMouse(key);
  const auto top = topController();  // it may leave meanwhile
  if (topPane().table().take(key) == KeyUse::Used) return KeyUse::Used;
  return takeAsOwn(key);
}

KeyUse TerminalStack::takeAsOwn(const Key& key) {
  switch (key.kind) {
    case Key::Kind::Escape:
    case Key::Kind::Left:
    case Key::Kind::Backspace:
      goBack();
      return KeyUse::Used;
    default:
      break;
  }
  if (key.is(L'h')) {
    goBack();
    return KeyUse::Used;
  }
  const auto save = topPane().toolbar().save;
  if (save && (key.is(L's') || key.isControl(L's'))) {
    save();
    return KeyUse::Used;
  }
  return KeyUse::Unused;
}

KeyUse TerminalStack::takeMouse(const Key& key) {
  if (key.kind == Key::Kind::Click) {
    if (key.row == _area.row) {
      goBack();
      return KeyUse::Used;
    }
    if (const auto save = topPane().toolbar().save; save && saveButton().contains(key.column, key.row)) {
      save();
      return KeyUse::Used;
    }
    if (showsTwoPanes()) {
      // The pane on the left is not the top one: it first becomes the top one.
      if (const auto row = paneBelow().table().rowAt(key)) {
        goBack();
        topPane().table().choose(*row);
        return KeyUse::Used;
      }
    }
  } else if (showsTwoPanes() && paneBelow().table().take(key) == KeyUse::Used) {
    return KeyUse::Used;
  }
  const auto top = topController();
  return topPane().table().take(key);
}

std::vector<std::wstring> TerminalStack::pathOfFocus() const {
  std::vector<std::wstring> path;
  for (std::size_t i = 1; i < _controllers.size(); ++i) path.push_back(paneOf(*_controllers[i]).title());
  if (const TerminalRow* const row = topPane().table().focusedRow()) path.push_back(row->name());
  return path;
}

void TerminalStack::paint(CellGrid& grid, const Glyphs& glyphs, std::wstring_view windowTitle,
                          unsigned step) const {
  paintTitle(grid, glyphs, windowTitle);
  paintNotice(grid);
  if (_modal) return screenOf(*_modal).paint(grid, glyphs);
  if (showsTwoPanes()) {
    const Area left = paneBelow().table().area();
    paneBelow().table().paint(grid, TerminalRow::Emphasis::Opened, glyphs);
    Look line;
    line.ink = Ink::Mark;
    for (int row = left.row; row < left.row + left.rows; ++row)
      grid.write(left.column + left.columns, row, glyphs.divider, line);
  }
  topPane().table().paint(grid, TerminalRow::Emphasis::Focus, glyphs);
  if (_showsToolbar) paintToolbar(grid, glyphs, step);
}

// On the left where the user is, on the right the rest of the window's name.
void TerminalStack::paintTitle(CellGrid& grid, const Glyphs& glyphs, std::wstring_view windowTitle) const {
  const Area bar{_area.column, _area.row, _area.columns, 1};
  grid.fill(bar, barLook);
  std::wstring path;
  for (std::size_t i = 1; i < _controllers.size(); ++i) {
    if (i > 1) path += glyphs.step;
    path += paneOf(*_controllers[i]).title();
  }
  if (_controllers.size() > 1 && windowTitle.starts_with(topPane().title())) {
    windowTitle.remove_prefix(topPane().title().size());
    if (windowTitle.starts_with(separator)) windowTitle.remove_prefix(separator.size());
  }
  std::wstring rest = withDashes(windowTitle, glyphs.dash);
  if (path.empty()) path = std::exchange(rest, {});
  Look bold = barLook;
  bold.isBold = true;
  const int room = bar.columns - 2;
  grid.write(bar.column + 1, bar.row, cutAtItsBeginning(path, room, glyphs.more), bold, bar);
  const int left = room - columnsOf(path) - 2;
  if (columnsOf(rest) <= left)
    grid.write(bar.column + bar.columns - 1 - columnsOf(rest), bar.row, rest, barLook, bar);
}

void TerminalStack::paintNotice(CellGrid& grid) const {
  Look look;
  look.ink = Ink::Notice;
  look.isBold = true;
  for (int line = 0; line < rowsOfNotice(); ++line)
    grid.write(_area.column, _area.row + 1 + line, _noticeLines[static_cast<std::size_t>(line)], look, _area);
}

Area TerminalStack::saveButton() const {
  const int columns = columnsOf(saveText);
  return {_area.column + _area.columns - columnsOf(helpText) - columns, _area.row + _area.rows - 1, columns,
          1};
}

void TerminalStack::paintToolbar(CellGrid& grid, const Glyphs& glyphs, unsigned step) const {
  const Area bar{_area.column, _area.row + _area.rows - 1, _area.columns, 1};
  const TerminalPane::Toolbar& toolbar = topPane().toolbar();
  grid.fill(bar, barLook);
  std::wstring status = L" ";
  if (toolbar.isWheelTurning) status.append(glyphs.wheel[step % glyphs.wheel.size()]).append(L" ");
  status += toolbar.status;
  grid.write(bar.column, bar.row, cutTo(status, bar.columns, glyphs.more), barLook, bar);
  // From the right to the left, as far as there is room.
  int end = bar.column + bar.columns;
  const std::wstring position = topPane().table().position() + L" ";
  for (const std::wstring_view text :
       {helpText, toolbar.save ? saveText : std::wstring_view(), std::wstring_view(position)}) {
    if (end - columnsOf(text) <= bar.column + columnsOf(status)) return;
    end -= columnsOf(text);
    grid.write(end, bar.row, text, barLook, bar);
  }
}

}  // namespace varnel

#include "terminal/TerminalUserInterface.h"

#include <algorithm>
#include <utility>

#include "terminal/AlertBox.h"
#include "terminal/Characters.h"
#include "terminal/LinesPage.h"

namespace varnel {

namespace {

constexpr std::chrono::milliseconds wheelInterval(500);

constexpr std::string_view keysOfHelp =
    "\n"
    "Up Down j k, Home End g G   go from row to row, to the first and the last one\n"
    "Page Up, Page Down          go a page up or down\n"
    "Enter Space Right l         open the row\n"
    "Escape Left Backspace h     go back\n"
    "< > Shift+Left Shift+Right  scroll a long value\n"
    "/                           find a row in the whole display by name or value\n"
    "s Ctrl+S                    save a snapshot, on devices that allow it\n"
    "R Ctrl+R                    start over with an empty display\n"
    "T                           the course of the row's value over time\n"
    "L                           the last log lines\n"
    "Ctrl+L                      draw the screen anew\n"
    "Ctrl+Z                      back to the shell; fg returns\n"
    "? F1                        this help\n"
    "q Ctrl+Q Ctrl+C             end\n"
    "\n"
    "The mouse works where the terminal has one: the wheel, a click on a row, and a click on the title to go "
    "back. With Shift the terminal selects text.\n"
    "\n"
    "A mark before a row says that the row has changed with the last refresh.\n";

}  // namespace

TerminalUserInterface::TerminalUserInterface(MainQueue& queue, Wishes wishes, Display display,
                                             const Glyphs& glyphs)
    : _queue(queue),
      _wishes(std::move(wishes)),
      _display(std::move(display)),
      _glyphs(glyphs),
      _repainting(queue, [this] {
        turnWheel();
        _display(picture());
      }) {}

std::unique_ptr<Window> TerminalUserInterface::makeWindow(const Rect&) {
  auto window = std::make_unique<TerminalWindow>(_area, _repainting, [this] { _window = nullptr; });
  _window = window.get();
  return window;
}

std::unique_ptr<TablePane> TerminalUserInterface::makeTablePane() {
  return std::make_unique<TerminalPane>(_repainting);
}

std::unique_ptr<NavigationStack> TerminalUserInterface::makeNavigationStack(
    std::shared_ptr<PaneController> root) {
  return std::make_unique<TerminalStack>(std::move(root), _repainting);
}

std::unique_ptr<ModalScreen> TerminalUserInterface::makeModalScreen(const ScreenLayout& layout,
                                                                    ModalScreen::Actions actions) {
  return std::make_unique<TerminalModalScreen>(layout, std::move(actions));
}

void TerminalUserInterface::showAlert(const Alert& alert) { open(std::make_unique<AlertBox>(alert)); }

void TerminalUserInterface::open(std::unique_ptr<Overlay> overlay) {
  _overlays.push_back(std::move(overlay));
  _repainting.want();
}

void TerminalUserInterface::resize(int columns, int rows) {
  _area = {0, 0, std::max(1, columns), std::max(1, rows)};
  if (_window) _window->setArea(_area);
  _repainting.want();
}

void TerminalUserInterface::take(const Key& key) {
  _repainting.want();
  // These work everywhere, since no text field needs them.
  if (key.isControl(L'c') || key.isControl(L'q')) {
    if (_wishes.close) _wishes.close();
    return;
  }
  if (key.isControl(L'z')) {
    if (_wishes.suspend) _wishes.suspend();
    return;
  }
  if (key.isControl(L'l')) {
    if (_wishes.redraw) _wishes.redraw();
    return;
  }
  if (key.kind == Key::Kind::Help && !_help) return showHelp();
  if (!_overlays.empty()) {
    Overlay* const top = _overlays.back().get();
    const auto own = keyFor(*top, key);
    if (own && top->take(*own) == Overlay::Wish::Close) {
      std::erase_if(_overlays, [top](const auto& overlay) { return overlay.get() == top; });
      if (top == _help) _help = nullptr;
    }
    return;
  }
  if (TerminalStack* const root = stack(); root && root->take(key) == KeyUse::Used) return;
  takeAsOwn(key);
}

KeyUse TerminalUserInterface::takeAsOwn(const Key& key) {
  const auto call = [](const std::function<void()>& wish) {
    if (wish) wish();
    return KeyUse::Used;
  };
  if (key.is(L'q')) return call(_wishes.close);
  if (key.is(L'R') || key.isControl(L'r')) return call(_wishes.startOver);
  if (key.is(L's') || key.isControl(L's')) return call(_wishes.save);
  const bool isOnHelpButton = key.kind == Key::Kind::Click && key.row == _area.rows - 1;
  if (key.is(L'?') || isOnHelpButton) {
    showHelp();
    return KeyUse::Used;
  }
  if (key.is(L'/') && _wishes.find && _wishes.goTo) {
    open(std::make_unique<FindPage>(_wishes.find, _wishes.goTo));
    return KeyUse::Used;
  }
  if (key.is(L'T') && _wishes.course) {
    showCourse();
    return KeyUse::Used;
  }
  if (key.is(L'L') && _wishes.heldLines) {
    open(std::make_unique<LinesPage>(L"Log lines", _wishes.heldLines, LinesPage::Start::End));
    return KeyUse::Used;
  }
  return KeyUse::Unused;
}

std::vector<std::string> TerminalUserInterface::pathOfFocus() const {
  std::vector<std::string> path;
  if (!stack()) return path;
  for (const std::wstring& name : stack()->pathOfFocus()) path.push_back(utf8(name));
  return path;
}

void TerminalUserInterface::showHelp() {
  // Nothing about a row that is not in sight.
  const bool isRowShown = _overlays.empty() && stack() && !stack()->isCovered();
  const auto path = pathOfFocus();
  auto help = std::make_unique<LinesPage>(L"Help", [this, path, isRowShown] {
    const std::string about = isRowShown && _wishes.explain ? _wishes.explain(path) : std::string();
    return about + std::string(keysOfHelp.substr(about.empty() ? 1 : 0));
  });
  _help = help.get();
  open(std::move(help));
}

void TerminalUserInterface::showCourse() {
  if (auto source = _wishes.course(pathOfFocus())) {
    open(std::make_unique<CoursePage>(std::move(source)));
  } else {
    showAlert({"No course", "The value of this row is no number.", "Close"});
  }
}

void TerminalUserInterface::turnWheel() {
  const bool turns = _overlays.empty() && stack() && stack()->isWheelTurning();
  if (!turns) {
    _wheel.reset();
  } else if (!_wheel) {
    _wheel = _queue.repeating(wheelInterval, [this] {
      ++_wheelStep;
      _repainting.want();
    });
  }
}

CellGrid TerminalUserInterface::picture() {
  CellGrid grid(_area.columns, _area.rows);
  if (const TerminalStack* const root = stack()) root->paint(grid, _glyphs, _window->title(), _wheelStep);
  for (const auto& overlay : _overlays) paint(*overlay, grid);
  return grid;
}

// The stack has painted the notice below its title. There it stays, and the rest of a page goes on below it.
void TerminalUserInterface::paint(Overlay& overlay, CellGrid& grid) const {
  if (overlay.kind() == Overlay::Kind::Box) return overlay.paint(grid, _glyphs);
  const int notice = rowsOfNotice();
  CellGrid page(grid.columns(), grid.rows() - notice);
  overlay.paint(page, _glyphs);
  grid.hideCursor();
  for (int row = 0; row < page.rows(); ++row) grid.copyRow(row == 0 ? 0 : row + notice, page, row);
}

// With the row in the overlay's own grid; nothing for a click on the notice.
std::optional<Key> TerminalUserInterface::keyFor(const Overlay& overlay, const Key& key) const {
  if (key.kind != Key::Kind::Click || overlay.kind() == Overlay::Kind::Box || key.row == 0) return key;
  const int notice = rowsOfNotice();
  if (key.row <= notice) return std::nullopt;
  Key own = key;
  own.row -= notice;
  return own;
}

}  // namespace varnel

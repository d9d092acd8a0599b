#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/MainQueue.h"
#include "platform/ui/UserInterface.h"
#include "terminal/CellGrid.h"
#include "terminal/CoursePage.h"
#include "terminal/FindPage.h"
#include "terminal/Glyphs.h"
#include "terminal/Key.h"
#include "terminal/Overlay.h"
#include "terminal/Repainting.h"
#include "terminal/TerminalMetrics.h"
#include "terminal/TerminalWindow.h"

namespace varnel {

/// The user interface on a grid of characters. It knows neither the terminal nor its bytes: keys come in by
/// `take`, and the picture goes out as a grid.
class TerminalUserInterface final : public UserInterface {
 public:
  /// What the user may want from the application itself. The names in a path begin below the root.
  struct Wishes {
    std::function<void()> close{};
    std::function<void()> startOver{};
    /// The user wants a snapshot, but the pane has no Save button.
    std::function<void()> save{};
    FindPage::Search find{};
    FindPage::GoTo goTo{};
    /// Lines about the row with the focus; absent names mean that there is none.
    std::function<std::string(const std::vector<std::string>& path)> explain{};
    /// The course of the value of that row; empty when there is none.
    std::function<CoursePage::Source(const std::vector<std::string>& path)> course{};
    /// The last lines that were held back while the screen is in use.
    std::function<std::string()> heldLines{};
    /// The user wants the shell back for a while.
    std::function<void()> suspend{};
    /// The screen shall be drawn anew, since something else has written on it.
    std::function<void()> redraw{};
  };

  /// Shows the picture of the screen.
  using Display = std::function<void(const CellGrid& grid)>;

  TerminalUserInterface(MainQueue& queue, Wishes wishes, Display display,
                        const Glyphs& glyphs = unicodeGlyphs);

  Rect screenBounds() const override { return frameOf(_area); }
  Rect applicationFrame() const override { return frameOf(_area); }
  const TextMetrics& textMetrics() const override { return _textMetrics; }

  std::unique_ptr<Window> makeWindow(const Rect& frame) override;
  std::unique_ptr<TablePane> makeTablePane() override;
  std::unique_ptr<NavigationStack> makeNavigationStack(std::shared_ptr<PaneController> root) override;
  std::unique_ptr<ModalScreen> makeModalScreen(const ScreenLayout& layout,
                                               ModalScreen::Actions actions) override;
  void showAlert(const Alert& alert) override;

  /// The size of the terminal. Call it first, and whenever the size changes.
  void resize(int columns, int rows);
  void take(const Key& key);
  /// Repaints soon.
  void repaint() { _repainting.want(); }
  CellGrid picture();

 private:
  KeyUse takeAsOwn(const Key& key);
  void open(std::unique_ptr<Overlay> overlay);
  void paint(Overlay& overlay, CellGrid& grid) const;
  std::optional<Key> keyFor(const Overlay& overlay, const Key& key) const;
  int rowsOfNotice() const { return stack() ? stack()->rowsOfNotice() : 0; }
  void showHelp();
  void showCourse();
  std::vector<std::string> pathOfFocus() const;
  void turnWheel();
  TerminalStack* stack() const { return _window ? _window->visibleRoot() : nullptr; }

  MainQueue& _queue;
  const Wishes _wishes;
  const Display _display;
  const Glyphs& _glyphs;
  TerminalMetrics _textMetrics;
  Area _area{0, 0, 80, 24};
  Repainting _repainting;
  TerminalWindow* _window = nullptr;  // the newest window
  std::vector<std::unique_ptr<Overlay>> _overlays;
  const Overlay* _help = nullptr;  // one of the overlays
  unsigned _wheelStep = 0;
  std::unique_ptr<RepeatingTimer> _wheel;  // set while a wheel turns
};

}  // namespace varnel

#include "terminal/TerminalPane.h"

#include "terminal/Characters.h"

namespace varnel {

void TerminalPane::setTitle(std::string_view title) {
  _title = charactersOf(title);
  _repainting.want();
}

void TerminalPane::setToolbarItems(std::vector<ToolbarItem> items, Animation) {
  _toolbar = {};
  for (const ToolbarItem& item : items) {
    if (const auto* const wheel = std::get_if<ActivityIndicator>(&item))
      _toolbar.isWheelTurning = wheel->isAnimating;
    if (const auto* const label = std::get_if<ToolbarLabel>(&item))
      _toolbar.status = charactersOf(label->text);
    if (const auto* const button = std::get_if<BarButton>(&item)) _toolbar.save = button->action;
  }
  _repainting.want();
}

void TerminalPane::fallSilent() {
  _table.fallSilent();
  _toolbar.save = nullptr;
}

}  // namespace varnel

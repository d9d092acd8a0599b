#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "platform/ui/ModalScreen.h"
#include "platform/ui/ScreenLayout.h"
#include "terminal/Glyphs.h"
#include "terminal/TerminalTable.h"
#include "terminal/TerminalTextField.h"

namespace varnel {

/// A screen over the panes, made from a layout. Tab goes from element to element.
///
/// A button whose title names a standard action answers to its key: "Save" to Ctrl+S, "Cancel" to Escape.
class TerminalModalScreen final : public ModalScreen {
 public:
  TerminalModalScreen(const ScreenLayout& layout, Actions actions);

  void setFrame(const Rect&) override {}
  TableView* table(std::string_view outlet) override;
  TextField* textField(std::string_view outlet) override;

  /// Makes no more calls.
  void leave();
  void setArea(const Area& area);
  /// Takes every key.
  void take(const Key& key);
  void paint(CellGrid& grid, const Glyphs& glyphs) const;

 private:
  struct Element {
    ScreenElement described;
    std::size_t line = 0;  // the row of the layout that it is in
    std::unique_ptr<TerminalTable> table{};
    std::unique_ptr<TerminalTextField> field{};
    Area area{};
    bool isNarrow = false;  // a button without blanks around its title
  };

  bool canHaveFocus(const Element& element) const {
    return element.described.kind != ScreenElement::Kind::Space;
  }
  void perform(std::string action);
  void pressButton(std::string_view title);
  void moveFocus(int direction);
  void focusButton(std::string_view title);
  void takeClick(const Key& key);
  static std::wstring buttonText(const Element& button);
  /// What the elements of the line need besides those that take what is left.
  int columnsOfLine(std::size_t line) const;
  void layOutLine(std::size_t line, const Area& area);

  Actions _actions;
  std::string _backgroundAction;
  int _margin;
  int _spacing;
  std::size_t _lines;
  std::vector<Element> _elements;
  std::size_t _focus = 0;
};

}  // namespace varnel

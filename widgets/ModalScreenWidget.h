#pragma once

#include <QVBoxLayout>
#include <QWidget>
#include <map>
#include <string>

#include "platform/ui/ModalScreen.h"
#include "platform/ui/ScreenLayout.h"
#include "widgets/NoticeWidget.h"
#include "widgets/TableWidget.h"
#include "widgets/TextFieldWidget.h"

namespace varnel {

/// A screen over the panes, made from a layout. Its rows are limited to a width that is easy to read.
///
/// A button whose title names a standard action answers to its key: "Save" to Ctrl+S, "Cancel" to Escape.
class ModalScreenWidget final : public QWidget, public ModalScreen {
 public:
  ModalScreenWidget(const ScreenLayout& layout, Actions actions);

  void setFrame(const Rect& frame) override;
  TableView* table(std::string_view outlet) override;
  TextField* textField(std::string_view outlet) override;

  /// Places the screen over this widget, hidden for now.
  void enter(QWidget& below);
  /// Removes the screen from that widget. Its actions are not called any more.
  void leave();
  /// The notice above its rows.
  NoticeWidget& notice() { return _notice; }
  /// Gives the keyboard focus to the first text field, else to the screen itself.
  void takeKeyboard();

 protected:
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  bool focusNextPrevChild(bool next) override;

 private:
  void addRow(QVBoxLayout& column, const std::vector<ScreenElement>& elements, int spacing);
  void addElement(QBoxLayout& row, const ScreenElement& element);
  QWidget* makeButton(const ScreenElement& element);
  void perform(const std::string& action);

  NoticeWidget _notice;
  Actions _actions;
  std::string _backgroundAction;
  std::map<std::string, TableWidget*, std::less<>> _tables;           // by outlet
  std::map<std::string, TextFieldWidget*, std::less<>> _fields;       // by outlet
  std::map<std::string, std::string, std::less<>> _actionsOfButtons;  // by the title of the button
};

}  // namespace varnel

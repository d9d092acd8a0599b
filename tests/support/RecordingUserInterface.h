#pragma once

#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/ui/UserInterface.h"
#include "tests/support/RecordingTable.h"

namespace varnel {

/// What happened to the objects of a user interface, the oldest first.
using RecordedEvents = std::vector<std::string>;

class RecordingPane final : public TablePane {
 public:
  RecordingTable& table() override { return _table; }
  void setTitle(std::string_view title) override { this->title = title; }
  void setToolbarItems(std::vector<ToolbarItem> items, Animation animation) override {
    toolbar = std::move(items);
    toolbarAnimation = animation;
    ++toolbars;
  }
  void resignFirstResponder() override { ++resignations; }

  /// The toolbar in one line: "[wheel] [Connecting] [space] [Save]". A wheel that stands still is a "hidden
  /// wheel".
  std::string toolbarText() const {
    std::string text;
    for (const ToolbarItem& item : toolbar) text += (text.empty() ? "[" : " [") + described(item) + "]";
    return text;
  }
  void pressSave() const { std::get<BarButton>(toolbar.at(3)).action(); }

  std::string title;
  std::vector<ToolbarItem> toolbar;
  Animation toolbarAnimation = Animation::None;
  unsigned toolbars = 0;  ///< how often the items were set
  unsigned resignations = 0;

 private:
  static std::string described(const ToolbarItem& item) {
    if (const auto* wheel = std::get_if<ActivityIndicator>(&item))
      return wheel->isAnimating ? "wheel" : "hidden wheel";
    if (const auto* label = std::get_if<ToolbarLabel>(&item)) return label->text;
    return std::holds_alternative<FlexibleSpace>(item) ? "space" : "Save";
  }

  RecordingTable _table;
};

class RecordingTextField final : public TextField {
 public:
  void setDelegate(TextFieldDelegate* delegate) override { this->delegate = delegate; }
  std::optional<std::string> text() const override { return typed; }
  void resignFirstResponder() override { ++resignations; }

  TextFieldDelegate* delegate = nullptr;
  std::optional<std::string> typed = "";
  unsigned resignations = 0;
};

class RecordingModalScreen final : public ModalScreen {
 public:
  RecordingModalScreen(const ScreenLayout& layout, Actions actions)
      : layout(layout), _actions(std::move(actions)) {
    for (const auto& row : layout.rows) {
      for (const ScreenElement& element : row) {
        if (element.kind == ScreenElement::Kind::Table) tables[element.outlet];
        if (element.kind == ScreenElement::Kind::TextField) fields[element.outlet];
      }
    }
  }

  void setFrame(const Rect& frame) override { this->frame = frame; }
  TableView* table(std::string_view outlet) override { return found(tables, outlet); }
  TextField* textField(std::string_view outlet) override { return found(fields, outlet); }

  /// Presses the button with this title.
  void press(const std::string& title) const {
    for (const auto& row : layout.rows) {
      for (const ScreenElement& element : row) {
        if (element.kind == ScreenElement::Kind::Button && element.title == title)
          return _actions(element.action);
      }
    }
    throw std::logic_error("no button has that title");
  }
  void touchBackground() const { _actions(layout.backgroundAction); }

  const ScreenLayout layout;
  Rect frame;
  std::map<std::string, RecordingTable, std::less<>> tables;
  std::map<std::string, RecordingTextField, std::less<>> fields;

 private:
  template <class Element>
  static Element* found(std::map<std::string, Element, std::less<>>& elements, std::string_view outlet) {
    const auto element = elements.find(outlet);
    return element == elements.end() ? nullptr : &element->second;
  }

  Actions _actions;
};

class RecordingStack final : public NavigationStack {
 public:
  RecordingStack(RecordedEvents& events, std::shared_ptr<PaneController> root) : _events(events) {
    root->setNavigationController(this);
    _controllers.push_back(std::move(root));
  }
  RecordingStack(const RecordingStack&) = delete;
  RecordingStack& operator=(const RecordingStack&) = delete;
  ~RecordingStack() override {
    for (const auto& controller : _controllers) controller->setNavigationController(nullptr);
  }

  void setDelegate(NavigationStackDelegate* delegate) override { _delegate = delegate; }
  std::vector<std::shared_ptr<PaneController>> controllers() const override { return _controllers; }
  std::shared_ptr<PaneController> topController() const override { return _controllers.back(); }

  void push(std::shared_ptr<PaneController> controller, Animation animation) override {
    _events.push_back(described("push", animation));
    const auto formerTop = topController();
    controller->setNavigationController(this);
    _controllers.push_back(std::move(controller));
    showTop(*formerTop, animation);
  }
  void popTo(const PaneController& controller, Animation animation) override {
    _events.push_back(described("pop", animation));
    const auto formerTop = topController();
    if (formerTop.get() == &controller) return;
    while (topController().get() != &controller) {
      topController()->setNavigationController(nullptr);
      _controllers.pop_back();
    }
    showTop(*formerTop, animation);
  }
  void showToolbar() override { isToolbarShown = true; }
  void setNotice(std::string_view text) override { notice = text; }

  void present(std::shared_ptr<ModalController> controller, Animation animation) override {
    _events.push_back(described("present", animation));
    _presented = std::move(controller);
    _presented->viewDidLoad();
    _presented->viewWillAppear(animation);
    for (auto& [outlet, table] : screen().tables) table.appear();
  }
  void dismiss(Animation animation) override {
    if (!_presented) return;
    _events.push_back(described("dismiss", animation));
    _presented.reset();
  }

  /// The window has become visible.
  void appear() const {
    topController()->viewWillAppear(Animation::None);
    pane().table().appear();
  }
  /// The user goes back by one pane.
  void goBack() { popTo(*_controllers.at(_controllers.size() - 2), Animation::Animated); }

  RecordingPane& pane(std::size_t index) const {
    return static_cast<RecordingPane&>(_controllers.at(index)->pane());
  }
  /// The top pane.
  RecordingPane& pane() const { return pane(_controllers.size() - 1); }
  bool isPresenting() const { return _presented != nullptr; }
  /// The presented screen.
  RecordingModalScreen& screen() const { return static_cast<RecordingModalScreen&>(_presented->screen()); }

  bool isToolbarShown = false;
  std::string notice;

 private:
  void showTop(PaneController& formerTop, Animation animation) {
    formerTop.viewWillDisappear(animation);
    const auto top = topController();
    top->viewWillAppear(animation);
    if (_delegate) _delegate->navigationController_willShowViewController_animated(*this, *top, animation);
    pane().table().appear();
  }
  static std::string described(const char* what, Animation animation) {
    return what + std::string(animation == Animation::Animated ? " animated" : "");
  }

  RecordedEvents& _events;
  NavigationStackDelegate* _delegate = nullptr;
  std::vector<std::shared_ptr<PaneController>> _controllers;
  std::shared_ptr<ModalController> _presented;
};

class RecordingWindow final : public Window {
 public:
  explicit RecordingWindow(RecordedEvents& events) : _events(events) {}
  RecordingWindow(const RecordingWindow&) = delete;
  RecordingWindow& operator=(const RecordingWindow&) = delete;
  ~RecordingWindow() override { _events.emplace_back("window destroyed"); }

  void setRoot(NavigationStack& stack) override {
    _root = static_cast<RecordingStack*>(&stack);
    _events.emplace_back("window gets its root");
  }
  void makeKeyAndVisible() override {
    _events.emplace_back("window visible");
    _root->appear();
  }
  void setTitle(std::string_view title) override { this->title = title; }
  void hide() override { _events.emplace_back("window hidden"); }

  std::string title;

 private:
  RecordedEvents& _events;
  RecordingStack* _root = nullptr;
};

/// A user interface whose user is a test, on a screen of 320 by 480 with a status bar 20 high.
class RecordingUserInterface final : public UserInterface {
 public:
  Rect screenBounds() const override { return {0, 0, 320, 480}; }
  Rect applicationFrame() const override { return {0, 20, 320, 460}; }
  const TextMetrics& textMetrics() const override { return _metrics; }

  std::unique_ptr<Window> makeWindow(const Rect& frame) override {
    windowFrame = frame;
    events.emplace_back("window made");
    return std::make_unique<RecordingWindow>(events);
  }
  std::unique_ptr<TablePane> makeTablePane() override { return std::make_unique<RecordingPane>(); }
  std::unique_ptr<NavigationStack> makeNavigationStack(std::shared_ptr<PaneController> root) override {
    auto made = std::make_unique<RecordingStack>(events, std::move(root));
    stack = made.get();
    return made;
  }
  std::unique_ptr<ModalScreen> makeModalScreen(const ScreenLayout& layout,
                                               ModalScreen::Actions actions) override {
    return std::make_unique<RecordingModalScreen>(layout, std::move(actions));
  }
  void showAlert(const Alert& alert) override {
    events.push_back("alert " + alert.title + ": " + alert.message + " [" + alert.buttonTitle + "]");
  }

  RecordedEvents events;
  Rect windowFrame;
  /// The newest stack. It belongs to the caller that asked for it.
  RecordingStack* stack = nullptr;

 private:
  LetterMetrics _metrics;
};

}  // namespace varnel

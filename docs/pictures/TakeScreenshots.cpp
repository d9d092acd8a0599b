// varnel_screenshots PICTURES_FOLDER RUNTIME_FOLDER DEVICE_ROOT: pictures of a small window on the LTE modem
// of the server there.
//
// varnel_screenshots PICTURES_FOLDER CAPTURE: pictures of a wide window that plays this capture of all
// radios.

#include <QApplication>
#include <QKeyEvent>
#include <QPixmap>
#include <QTimer>
#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <functional>
#include <iostream>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/BuildInfo.h"
#include "programs/varnel/WindowView.h"
#include "widgets/DesktopColors.h"
#include "widgets/PlayBar.h"
#include "widgets/WindowWidget.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

// The whole viewer runs as users run it. This runs beside it, as its user.
class Photographer final {
 public:
  explicit Photographer(std::string folder) : _folder(std::move(folder)) {}

  // The deed is done when the condition holds, after those before it.
  void when(std::function<bool()> condition, std::function<void()> deed) {
    _steps.push_back({std::move(condition), std::chrono::milliseconds::zero(), std::move(deed)});
  }
  void after(std::chrono::milliseconds time, std::function<void()> deed) {
    _steps.push_back({[] { return true; }, time, std::move(deed)});
  }
  void begin() { wait(); }
  bool hasAll() const { return _step == _steps.size() && !_hasFailed; }

  static WindowWidget* window() {
    for (QWidget* const widget : QApplication::topLevelWidgets()) {
      auto* const window = dynamic_cast<WindowWidget*>(widget);
      if (window && window->isVisible()) return window;
    }
    return nullptr;
  }
  static bool hasRow(const QString& name) {
    if (!window() || !window()->stack()) return false;
    const auto rows = window()->stack()->topPane().tableWidget().visibleRows();
    return std::ranges::any_of(rows, [&](const RowWidget* row) { return row->name() == name; });
  }

  static void press(int key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QKeyEvent down(QEvent::KeyPress, key, modifiers);
    QWidget* const focus = QApplication::focusWidget();
    QApplication::sendEvent(focus ? focus : window(), &down);
  }
  static void type(const QString& text) {
    for (const QChar letter : text) {
      QKeyEvent down(QEvent::KeyPress, 0, Qt::NoModifier, QString(letter));
      QApplication::sendEvent(QApplication::focusWidget(), &down);
    }
  }
  // What an action of the window does, by its text.
  static void act(const QString& text) {
    for (QAction* const action : window()->actions()) {
      if (action->text() == text) return action->trigger();
    }
    std::cerr << "varnel_screenshots: there is no '" << text.toStdString() << "'\n";
    std::exit(EXIT_FAILURE);
  }

  enum class Schemes { Light, Both };
  void take(const std::string& name, Schemes schemes = Schemes::Light) {
    save(name + "-light.png");
    if (schemes == Schemes::Light) return;
    DesktopColors::apply(DesktopColors::Scheme::Dark);
    save(name + "-dark.png");
    DesktopColors::apply(DesktopColors::Scheme::Light);
  }

 private:
  struct Step {
    std::function<bool()> condition;
    std::chrono::milliseconds time;
    std::function<void()> deed;
  };
  static constexpr std::chrono::minutes patience{5};

  void save(const std::string& name) {
    QApplication::processEvents();
    const std::string file = _folder + "/" + name;
    if (window()->grab().save(QString::fromStdString(file))) return;
    std::cerr << "varnel_screenshots: " << file << " cannot be written\n";
    _hasFailed = true;
  }

  void wait() {
    if (_step == _steps.size()) {
      window()->close();
      return;
    }
    const auto now = std::chrono::steady_clock::now();
    if (!_since) _since = now;
    const Step& step = _steps[_step];
    if (now - *_since >= step.time && window() && step.condition()) {
      _since.reset();
      step.deed();
      ++_step;
    } else if (now - *_since > patience + step.time) {
      std::cerr << "varnel_screenshots: step " << _step << " cannot begin\n";
      _hasFailed = true;
      if (!window()) std::exit(EXIT_FAILURE);
      _step = _steps.size();
    }
    QTimer::singleShot(100ms, qApp, [this] { wait(); });
  }

  const std::string _folder;
  std::vector<Step> _steps;
  std::size_t _step = 0;
  std::optional<std::chrono::steady_clock::time_point> _since;
  bool _hasFailed = false;
};

Photographer* photographer = nullptr;

void startWithTheApplication() {
  QTimer::singleShot(0, qApp, [] { photographer->begin(); });
}

// The root pane, its first section, and the search.
void planSmallWindow(Photographer& user) {
  user.when([] { return Photographer::hasRow(QStringLiteral("Serving Cell Info")); },
            [] { Photographer::window()->resize(360, 640); });
  user.after(20s, [&user] { user.take("root", Photographer::Schemes::Both); });
  user.after(0s, [] {
    Photographer::press(Qt::Key_Down);
    Photographer::press(Qt::Key_Return);
  });
  user.after(1s, [&user] { user.take("section", Photographer::Schemes::Both); });
  user.after(0s, [] {
    Photographer::act(QStringLiteral("Find a row"));
    Photographer::type(QStringLiteral("rsrp"));
  });
  user.after(1s, [&user] { user.take("find"); });
  user.after(0s, [] {
    Photographer::window()->closePage();
    Photographer::act(QStringLiteral("Help"));
  });
  user.after(1s, [&user] { user.take("help"); });
}

// Two panes above the bar that plays the capture, and the trend of a row.
void planWideWindow(Photographer& user) {
  user.when([] { return Photographer::hasRow(QStringLiteral("SIM 1")); },
            [] { Photographer::window()->resize(1100, 700); });
  const auto bar = [] { return dynamic_cast<PlayBar*>(Photographer::window()->bar()); };
  user.when([bar] { return bar() && bar()->state().length > 0; },
            [bar] { Q_EMIT bar()->jumpWanted(bar()->state().length / 2); });
  user.when([bar] { return bar()->state().place >= bar()->state().length / 2; },
            [] {
              Photographer::act(QStringLiteral("Find a row"));
              Photographer::type(QStringLiteral("sim 1 lte measurements rsrp"));
            });
  user.after(3s, [] { Photographer::press(Qt::Key_Return); });
  // The lines that show the courses of values need some minutes.
  user.after(120s, [&user] { user.take("window", Photographer::Schemes::Both); });
  user.after(0s, [] { Photographer::act(QStringLiteral("Trend of this row")); });
  user.after(6s, [&user] { user.take("trend"); });
}

int run(int argumentCount, char** arguments) {
  if (argumentCount != 3 && argumentCount != 4) {
    std::cerr
        << "usage: varnel_screenshots PICTURES RUNTIME_FOLDER DEVICE_ROOT, or varnel_screenshots PICTURES "
           "CAPTURE\n";
    return 2;
  }
  Photographer user(arguments[1]);
  photographer = &user;
  ::qAddPreRoutine(startWithTheApplication);
  Options options;
  if (argumentCount == 4) {
    options.runtimeFolder = arguments[2];
    options.deviceRoot = arguments[3];
    planSmallWindow(user);
  } else {
    options.file = arguments[2];
    planWideWindow(user);
  }
  const ApplicationInfo application = applicationInfo();
  int count = 1;
  const int status = viewInWindow(count, arguments, options, application);
  return status == 0 && user.hasAll() ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace
}  // namespace varnel

int main(int argumentCount, char** arguments) {
  try {
    return varnel::run(argumentCount, arguments);
  } catch (const std::exception& failure) {
    std::cerr << "varnel_screenshots: " << failure.what() << '\n';
    return 1;
  }
}

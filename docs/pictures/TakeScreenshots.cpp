#include <QApplication>
#include <QKeyEvent>
#include <QPixmap>
#include <QTimer>
#include <QWidget>
#include <iostream>
#include <string>
#include <utility>

#include "app/VarnelApp.h"
#include "host/BuildInfo.h"
#include "programs/varnel/HostServices.h"
#include "widgets/DesktopColors.h"
#include "widgets/WidgetApplication.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {
namespace {

constexpr unsigned updatesToWaitFor = 10;

// The program's window, which is the only one.
QWidget& window() { return *QApplication::topLevelWidgets().constFirst(); }

void press(int key) {
  QKeyEvent down(QEvent::KeyPress, key, Qt::NoModifier);
  QWidget* receiver = QApplication::focusWidget();
  QApplication::sendEvent(receiver ? receiver : &window(), &down);
}

// Takes pictures of a viewer that shows a living display, in the folder: the root pane and its first section,
// light and dark.
class Photographer {
 public:
  Photographer(WidgetApplication& host, std::string folder) : _host(host), _folder(std::move(folder)) {}

  void takeAll() {
    take("root");
    press(Qt::Key_Down);
    press(Qt::Key_Return);
    QTimer::singleShot(milliseconds, [this] {
      take("section");
      _host.end(_haveAll ? 0 : 1);
    });
  }

 private:
  static constexpr int milliseconds = 1000;  // until a pane has slid in

  void take(const std::string& pane) {
    for (const auto& [scheme, name] :
         {std::pair{DesktopColors::Scheme::Light, "light"}, std::pair{DesktopColors::Scheme::Dark, "dark"}}) {
      DesktopColors::apply(scheme);
      QApplication::processEvents();
      const std::string file = _folder + "/" + pane + "-" + name + ".png";
      if (window().grab().save(QString::fromStdString(file))) continue;
      std::cerr << "varnel_screenshots: " << file << " cannot be written\n";
      _haveAll = false;
    }
    DesktopColors::apply(DesktopColors::Scheme::Light);
  }

  WidgetApplication& _host;
  std::string _folder;
  bool _haveAll = true;
};

int run(int argumentCount, char** arguments) {
  if (argumentCount != 4) {
    std::cerr << "varnel_screenshots: call it with the runtime folder of a server, a device root and a "
                 "folder for the pictures\n";
    return 2;
  }
  Options options;
  options.runtimeFolder = arguments[1];
  options.deviceRoot = arguments[2];
  const ApplicationInfo application = applicationInfo();
  WidgetApplication host(argumentCount, arguments);
  HostServices services(options, application);
  WidgetUserInterface userInterface({.close = [&host] { host.end(1); }, .startOver = [] {}});
  VarnelApp app({services.model(), services.files(), services.preferences(), userInterface});
  Photographer photographer(host, arguments[3]);
  app.afterUpdates(updatesToWaitFor, [&photographer] { photographer.takeAll(); });
  app.applicationDidFinishLaunching();
  window().resize(360, 640);
  return host.run();
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

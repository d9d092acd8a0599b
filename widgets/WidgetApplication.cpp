#include "widgets/WidgetApplication.h"

#include <pthread.h>

#include <QIcon>
#include <cerrno>
#include <clocale>
#include <csignal>
#include <cstdlib>
#include <iostream>
#include <stdexcept>
#include <utility>
#include <vector>

#include "host/SessionBus.h"
#include "widgets/DesktopColors.h"
#include "widgets/Display.h"
#include "widgets/Motion.h"

namespace varnel {

namespace {

// Used while the application object is made. Without it the toolkit would write several lines and abort.
void endInsteadOfAborting(QtMsgType type, const QMessageLogContext&, const QString&) {
  if (type != QtFatalMsg) return;
  std::cerr << program_invocation_short_name << ": cannot open a window on " << wantedDisplay()
            << "; --ui text needs no display\n";
  std::_Exit(EXIT_FAILURE);
}

std::unique_ptr<QApplication> makeApplication(int& argumentCount, char** arguments) {
  if (wantedDisplay().empty())
    throw std::runtime_error(
        "there is no display (neither WAYLAND_DISPLAY nor DISPLAY is set); --ui text needs none");
  if (!displayIsThere())
    throw std::runtime_error("cannot reach " + wantedDisplay() + "; --ui text needs no display");
  const QtMessageHandler formerHandler = qInstallMessageHandler(endInsteadOfAborting);
  // The toolkit's threads must leave signals to this thread.
  sigset_t everySignal;
  sigset_t formerMask;
  ::sigfillset(&everySignal);
  ::pthread_sigmask(SIG_SETMASK, &everySignal, &formerMask);
  auto application = std::make_unique<QApplication>(argumentCount, arguments);
  ::pthread_sigmask(SIG_SETMASK, &formerMask, nullptr);
  qInstallMessageHandler(formerHandler);
  return application;
}

}  // namespace

WidgetApplication::WidgetApplication(int& argumentCount, char** arguments)
    : _application(makeApplication(argumentCount, arguments)) {
  std::setlocale(LC_NUMERIC, "C");  // the application object has set the user's locale
  QApplication::setQuitOnLastWindowClosed(false);
  if (const auto bus = sessionBusAddress()) {
    std::vector<DesktopSettings::Setting> settings = motionSettings();
    settings.push_back(DesktopColors::setting());
    _settings = std::make_unique<DesktopSettings>(*bus, std::move(settings));
  }
  QApplication::setApplicationDisplayName(QStringLiteral("Varnel"));
  // The desktop finds the installed menu entry and icon by this identity.
  const QString applicationID = QStringLiteral("org.varnel.Varnel");
  QGuiApplication::setDesktopFileName(applicationID);
  QApplication::setWindowIcon(QIcon::fromTheme(applicationID));
}

int WidgetApplication::run() { return QApplication::exec(); }

void WidgetApplication::end(int exitStatus) {
  // The call is queued, so an end that is requested before the event loop runs counts too.
  QMetaObject::invokeMethod(
      _application.get(), [exitStatus] { QApplication::exit(exitStatus); }, Qt::QueuedConnection);
}

}  // namespace varnel

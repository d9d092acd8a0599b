// window-soak [HOURS]: the window viewer gets so many hours of simulated data (default 8) with all their
// refreshes, on an invisible screen. Time is simulated too, so this takes minutes. Meanwhile a user goes from
// pane to pane, searches, and asks for help. From the time when the value history is full, the memory must
// not grow.

#include <malloc.h>
#include <unistd.h>

#include <QApplication>
#include <QTest>
#include <array>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/ViewerInMemory.h"

namespace varnel {
namespace {

constexpr int refreshesPerHour = 1800;
constexpr int refreshesBetweenSamples = 900;
// The history keeps an hour, and the first samples after it are still uneven.
constexpr int samplesBeforeItIsFull = 3;
constexpr std::size_t allowedGrowth = std::size_t{4} * 1024 * 1024;

struct Memory {
  std::size_t allocated;  // by the program, and not freed
  std::size_t resident;
};

Memory memoryNow() {
  std::size_t pages = 0, residentPages = 0;
  std::ifstream("/proc/self/statm") >> pages >> residentPages;
  const auto heap = ::mallinfo2();
  return {heap.uordblks + heap.hblkhd, residentPages * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE))};
}

std::size_t mebibytes(std::size_t bytes) { return bytes >> 20; }

void press(WindowWidget& window, Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
  QWidget* const focus = QApplication::focusWidget();
  QTest::keyClick(focus ? focus : &window, key, modifiers);
}

// What the user does at this refresh: the same every minute.
void act(ViewerInMemory& viewer, int refresh) {
  WindowWidget& window = viewer.window();
  switch (refresh % 30) {
    case 0:
      return viewer.app.goTo({"SIM 1", "LTE", "Measurements", "RSRP"});
    case 5:
      return press(window, Qt::Key_Escape);
    case 7:
      return press(window, Qt::Key_F, Qt::ControlModifier);
    case 8:
      return QTest::keyClicks(QApplication::focusWidget(), "rsrp");
    case 12:
      return press(window, Qt::Key_Return);
    case 14:
      return press(window, Qt::Key_F1);
    case 16:
      return press(window, Qt::Key_Escape);
    case 18:
      return press(window, Qt::Key_C, Qt::ControlModifier);
    case 20:
      return window.resize(1366, 768);
    case 22:
      return viewer.app.goTo({"SIM 1", "LTE", "Carriers", "Cells", "0", "RSRP"});
    case 26:
      return window.resize(360, 640);
    default:
      return;
  }
}

int soak(int hours) {
  ViewerInMemory viewer("all-radios");
  viewer.app.applicationDidFinishLaunching();
  viewer.window().setGeometry(0, 0, 360, 640);
  if (!QTest::qWaitForWindowActive(&viewer.window(), 60'000)) return EXIT_FAILURE;
  viewer.queue.run();
  const auto modem = simulatedModem("all-radios", 7);
  SimulatedMessage next = modem->next();
  std::size_t messages = 0;
  std::vector<Memory> samples;
  for (int refresh = 1; refresh <= hours * refreshesPerHour; ++refresh) {
    for (; next.at <= refresh * std::chrono::seconds(2); next = modem->next(), ++messages)
      viewer.deliver(next.bytes);
    viewer.refresh();
    act(viewer, refresh);
    QCoreApplication::processEvents();
    // Only an event loop of its own would do this by itself.
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    if (refresh % refreshesBetweenSamples != 0) continue;
    ::malloc_trim(0);
    samples.push_back(memoryNow());
    std::cout << refresh / 30 << " minutes, " << messages << " messages, "
              << mebibytes(samples.back().allocated) << " MiB allocated, "
              << mebibytes(samples.back().resident) << " MiB resident" << std::endl;
  }
  viewer.app.applicationWillTerminate();
  if (samples.size() <= samplesBeforeItIsFull) return EXIT_SUCCESS;
  const Memory& full = samples[samplesBeforeItIsFull];
  const Memory& last = samples.back();
  if (last.allocated <= full.allocated + allowedGrowth && last.resident <= full.resident + allowedGrowth)
    return EXIT_SUCCESS;
  std::cerr << "window-soak: grew from " << mebibytes(full.allocated) << " to " << mebibytes(last.allocated)
            << " MiB allocated, from " << mebibytes(full.resident) << " to " << mebibytes(last.resident)
            << " MiB resident\n";
  return EXIT_FAILURE;
}

}  // namespace
}  // namespace varnel

int main(int argumentCount, char** arguments) {
  ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
  ::unsetenv("DBUS_SESSION_BUS_ADDRESS");
  const int hours = argumentCount > 1 ? std::atoi(arguments[1]) : 8;
  const QApplication application(argumentCount, arguments);
  ::qInstallMessageHandler(
      [](QtMsgType, const QMessageLogContext&, const QString&) {});  // what this screen cannot do
  return varnel::soak(hours);
}

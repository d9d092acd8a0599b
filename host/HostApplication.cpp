#include "host/HostApplication.h"

#include <clocale>

namespace varnel {

HostApplication::HostApplication(int& argumentCount, char** arguments)
    : _application(argumentCount, arguments) {
  std::setlocale(LC_NUMERIC, "C");  // the application object has set the user's locale
}

int HostApplication::run() { return QCoreApplication::exec(); }

void HostApplication::end(int exitStatus) {
  // Queued: an end that is asked for before the event loop runs counts as well.
  QMetaObject::invokeMethod(
      &_application, [exitStatus] { QCoreApplication::exit(exitStatus); }, Qt::QueuedConnection);
}

}  // namespace varnel

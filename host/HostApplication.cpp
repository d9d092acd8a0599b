#include "host/HostApplication.h"

#include <clocale>

namespace varnel {

HostApplication::HostApplication(int& argumentCount, char** arguments)
    : _application(argumentCount, arguments) {
  std::setlocale(LC_NUMERIC, "C");  // the application object has set the user's locale
}

int HostApplication::run() { return QCoreApplication::exec(); }

void HostApplication::end(int exitStatus) {
  // The call is queued, so an end that is requested before the event loop runs counts too.
  QMetaObject::invokeMethod(
      &_application, [exitStatus] { QCoreApplication::exit(exitStatus); }, Qt::QueuedConnection);
}

}  // namespace varnel

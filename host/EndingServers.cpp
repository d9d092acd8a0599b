#include "host/EndingServers.h"

#include <utility>

namespace varnel {

void EndingServers::add(std::unique_ptr<ChildServer> server) {
  if (!server) return;
  ChildServer& added = *_servers.emplace_back(std::move(server));
  added.beginEnd([this, &added] {
    // The call comes from the object that goes.
    QMetaObject::invokeMethod(
        &_context,
        [this, &added] { std::erase_if(_servers, [&](const auto& each) { return each.get() == &added; }); },
        Qt::QueuedConnection);
  });
}

}  // namespace varnel

#include "app/TextViewer.h"

#include <cstdio>

#include "app/Snapshot.h"
#include "app/TreeText.h"
#include "platform/Log.h"

namespace varnel {

namespace {

constexpr const char* notConnected = "Connecting...";

std::string updateMessage(const Clock& clock) {
  const Time now = clock.now();
  const CalendarTime local = calendarTime(now, clock.zoneAt(now));
  char text[64];
  std::snprintf(text, sizeof text, "Updated %04lld-%02u-%02u at %02u:%02u:%02u",
                static_cast<long long>(local.year), local.month, local.day, local.hour, local.minute,
                local.second);
  return text;
}

}  // namespace

TextViewer::TextViewer(const ModelServices& services, DeviceFiles& files, TextOutput& output)
    : _services(services), _files(files), _output(output) {
  startOver();
}

void TextViewer::startOver() {
  _model = std::make_unique<VarnelModel>(_services, *this);
  show(notConnected, {});
  _model->restartMonitorLater();
}

void TextViewer::afterUpdates(unsigned count, std::function<void()> task) {
  _awaitedUpdates = _updates + count;
  _whenUpdated = std::move(task);
}

void TextViewer::save() {
  if (!_files.exists(std::string(internalDeviceMarker))) {
    logError("This device has no marker that allows snapshots: nothing is saved");
    return;
  }
  const Time now = _services.generator.clock.now();
  writeSnapshot(_files, _services.generator.clock, snapshotContents(now, _model->getSaveContents(), ""));
}

void TextViewer::updateViewControllerFromModel() {
  const auto root = _model->topLevelNodes();
  const std::string status = _model->isConnected() ? updateMessage(_services.generator.clock) : notConnected;
  show(status, root ? treeAsText(*root) : std::string());
  if (++_updates == _awaitedUpdates && _whenUpdated) _whenUpdated();
}

void TextViewer::show(const std::string& status, const std::string& tree) {
  _output.show(status + "\n" + tree);
}

}  // namespace varnel

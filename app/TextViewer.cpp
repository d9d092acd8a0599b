#include "app/TextViewer.h"

#include "app/DateFormatter.h"
#include "app/Snapshot.h"
#include "app/Status.h"
#include "app/TreeText.h"
#include "platform/Log.h"

namespace varnel {

namespace {

std::string updateMessage(const Clock& clock) {
  const Time now = clock.now();
  return DateFormatter(updateStatusPattern).string(now, clock.zoneAt(now));
}

}  // namespace

TextViewer::TextViewer(const ModelServices& services, DeviceFiles& files, TextOutput& output)
    : _services(services), _files(files), _output(output) {
  startOver();
}

void TextViewer::startOver() {
  _model = std::make_unique<VarnelModel>(_services, *this);
  show(std::string(notConnectedStatus), {});
  _model->restartMonitorLater();
}

void TextViewer::afterUpdates(unsigned count, std::function<void()> task) {
  _awaitedUpdates.await(count, std::move(task));
}

void TextViewer::save() {
  saveSnapshotWithoutDescription(_files, _services.generator.clock, _model->getSaveContents());
}

void TextViewer::updateViewControllerFromModel() {
  const auto root = _model->topLevelNodes();
  const std::string status =
      _model->isConnected() ? updateMessage(_services.generator.clock) : std::string(notConnectedStatus);
  show(status, root ? treeAsText(*root) : std::string());
  _awaitedUpdates.countOne();
}

void TextViewer::show(const std::string& status, const std::string& tree) {
  _output.show(status + "\n" + tree);
}

}  // namespace varnel

#include "app/TextViewer.h"

#include "app/DateFormatter.h"
#include "app/Snapshot.h"
#include "app/Status.h"
#include "app/TreeText.h"
#include "base/Log.h"

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
  _tree.clear();
  show(std::string(notConnectedStatus));
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
  _tree = root ? treeAsText(*root) : std::string();
  show(status);
  _awaitedUpdates.countOne();
}

void TextViewer::linkWasLost() {
  if (!_model->isConnected()) show(std::string(notConnectedStatus));
}

void TextViewer::show(const std::string& status) { _output.show(status + "\n" + _tree); }

}  // namespace varnel

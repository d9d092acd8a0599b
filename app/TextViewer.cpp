#include "app/TextViewer.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "app/DateFormatter.h"
#include "app/Snapshot.h"
#include "app/Status.h"
#include "app/TreeText.h"
#include "base/Log.h"

namespace varnel {

namespace {

constexpr std::string_view noticeMark = "Notice: ";

std::string updateMessage(const Clock& clock) {
  const Time now = clock.now();
  return DateFormatter(updateStatusPattern).string(now, clock.zoneAt(now));
}

}  // namespace

std::string TextPage::text() const {
  std::string text = status + '\n';
  for (std::string_view rest = notice; !rest.empty();) {
    const std::string_view line = rest.substr(0, rest.find('\n'));
    text.append(noticeMark).append(line) += '\n';
    rest.remove_prefix(std::min(line.size() + 1, rest.size()));
  }
  return text += tree;
}

TextViewer::TextViewer(const ModelServices& services, DeviceFiles& files, TextOutput& output,
                       std::string wayToStartOver, const Clock* usersClock)
    : _services(services),
      _files(files),
      _output(output),
      _usersClock(usersClock ? *usersClock : services.generator.clock),
      _notices(services, std::move(wayToStartOver), [this] { showIfNew(); }) {
  startOver();
}

void TextViewer::startOver() {
  _notices.end();
  _model = std::make_unique<VarnelModel>(_services, *this);
  _notices.begin(*_model);
  _updateMessage.reset();
  _page = {.status = std::string(notConnectedStatus)};
  show();
  _model->restartMonitorLater();
}

void TextViewer::afterUpdates(unsigned count, std::function<void()> task) {
  _awaitedUpdates.await(count, std::move(task));
}

void TextViewer::save() {
  const auto writing = saveSnapshotWithoutDescription(_files, _usersClock, _model->getSaveContents());
  if (writing) {
    _notices.snapshotWasWritten(*writing);
  } else {
    _notices.snapshotIsNotAllowed();
  }
}

void TextViewer::updateViewControllerFromModel() {
  const auto root = _model->topLevelNodes();
  if (_model->isConnected()) {
    _updateMessage = updateMessage(_usersClock);
    _page.status = *_updateMessage;
  } else {
    _page.status = notConnectedStatus;
  }
  _page.tree = root ? treeAsText(*root) : std::string();
  _notices.update();
  show();
  _awaitedUpdates.countOne();
}

void TextViewer::linkWasLost() {
  if (!_model->isConnected()) _page.status = notConnectedStatus;
  linkWasLookedAt();
}

// The first status stays until the first refresh.
void TextViewer::linkWasOpened() {
  if (_updateMessage) _page.status = *_updateMessage;
  linkWasLookedAt();
}

void TextViewer::linkWasLookedAt() {
  _notices.update();
  showIfNew();
}

void TextViewer::show() {
  _page.notice = _notices.text();
  _shown = _page;
  _output.show(_page);
}

void TextViewer::showIfNew() {
  _page.notice = _notices.text();
  if (_page != _shown) show();
}

}  // namespace varnel

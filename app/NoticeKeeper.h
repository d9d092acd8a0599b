#pragma once

#include <functional>
#include <memory>
#include <string>

#include "app/Notice.h"
#include "model/VarnelModel.h"
#include "platform/DeviceFiles.h"

namespace varnel {

/// Keeps the notice of a viewer true: it asks the model and the host what there is to tell, and takes away
/// what is over.
class NoticeKeeper {
 public:
  /// The way to start over is what the user does for it, as in "press R". The observer is called when the
  /// notice has become another one by itself or by an operation that says so. What the services stand for
  /// outlives the keeper.
  NoticeKeeper(const ModelServices& services, std::string wayToStartOver, std::function<void()> observer);

  /// That model is about to connect: what there was to tell is over. It stays until `end` or the next call.
  void begin(const VarnelModel& model);
  /// There is no model any more, and nothing to tell.
  void end();
  /// Asks again. The caller shows what comes of it, not the observer. False when the notice is as before.
  bool update();

  /// A snapshot was written, or was not. Calls the observer.
  void snapshotWasWritten(const FileWriting& writing);
  /// A snapshot was wanted on a device that allows none. Calls the observer.
  void snapshotIsNotAllowed();
  /// A snapshot is about to be described and written. Calls the observer when it will be an empty one.
  void snapshotIsWanted();

  /// Its lines with a newline between them; empty when there is nothing to tell.
  std::string text() const { return _notice.text(); }

 private:
  void awaitLink();
  void tellOfSaving(const std::string& line);
  LinkReport linkReport() const;
  std::string linkLine(const LinkReport& report) const;
  std::string failureLine(const LinkReport& report) const;
  std::string templateLine() const;
  std::string standingLine() const;

  ModelServices _services;
  std::string _wayToStartOver;
  std::function<void()> _observer;
  Notice _notice;
  const VarnelModel* _model = nullptr;
  bool _wasConnected = false;
  std::unique_ptr<RepeatingTimer> _patience;     // while it is too early to tell why nothing arrives
  std::unique_ptr<RepeatingTimer> _endOfSaving;  // while a snapshot is told of
};

}  // namespace varnel

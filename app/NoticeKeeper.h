#pragma once

#include <functional>
#include <memory>
#include <string>
#include <utility>

#include "app/Notice.h"
#include "model/VarnelModel.h"
#include "platform/DeviceFiles.h"

namespace varnel {

/// Keeps the viewer's notice true. It asks the model and the host what there is to tell, and removes what is
/// over.
class NoticeKeeper {
 public:
  /// `wayToStartOver` is what the user has to do, such as "press R". The observer is called when the notice
  /// has changed by itself, or by an operation whose comment says so. The objects in `services` must outlive
  /// the keeper.
  NoticeKeeper(const ModelServices& services, std::string wayToStartOver, std::function<void()> observer);

  /// This model is about to connect: clears the notice. The model must live until `end` or the next call.
  void begin(const VarnelModel& model);
  /// There is no model any more. Clears the notice.
  void end();
  /// Asks model and host again. The caller, not the observer, shows the change. False when the notice is as
  /// before.
  bool update();

  /// What the value history has to tell, or an empty line. `update` shows it.
  void tellOfHistory(std::string line) { _historyLine = std::move(line); }
  /// A snapshot was written, or could not be written. Calls the observer.
  void snapshotWasWritten(const FileWriting& writing);
  /// The user wanted a snapshot on a device that allows none. Calls the observer.
  void snapshotIsNotAllowed();
  /// The user wanted a snapshot of a display that comes from one. Calls the observer.
  void snapshotIsOpen();
  /// A snapshot is about to be described and written. Calls the observer when the snapshot is going to be
  /// empty.
  void snapshotIsWanted();

  /// The lines with a newline between them; empty when there is nothing to tell.
  std::string text() const { return _notice.text(); }

 private:
  void awaitLink();
  void tellOfSaving(const std::string& line);
  LinkReport linkReport() const;
  std::string linkLine(const LinkReport& report) const;
  std::string failureLine(const LinkReport& report) const;
  std::string templateLine() const;
  std::string standingLine() const;
  std::string mixtureLine(const LinkReport& report) const;

  ModelServices _services;
  std::string _wayToStartOver;
  std::function<void()> _observer;
  Notice _notice;
  std::string _historyLine;
  const VarnelModel* _model = nullptr;
  bool _wasConnected = false;
  std::unique_ptr<RepeatingTimer> _patience;     // set while it is too early to say why nothing arrives
  std::unique_ptr<RepeatingTimer> _endOfSaving;  // set while the notice tells about a snapshot
};

}  // namespace varnel

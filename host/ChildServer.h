#pragma once

#include <QDeadlineTimer>
#include <QProcess>
#include <QSocketNotifier>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/FileDescriptor.h"
#include "host/PrivateFolder.h"
#include "host/RuntimeFolder.h"

namespace varnel {

/// The telephony server's program: the one beside this process's own program, else the first one in PATH. The
/// bare name when there is none.
std::filesystem::path serverProgram();

/// A telephony server of this process's own: a child process that serves a private folder. It ends with this
/// object, and with this process, however that ends. The event loop calls the handlers, which must not
/// destroy the object.
class ChildServer final {
 public:
  struct Handlers {
    /// Viewers can connect.
    std::function<void()> ready;
    /// The server has ended by itself. The text is one sentence that says why.
    std::function<void(const std::string& why)> ended;
  };

  /// Starts the program with these arguments and the folder. Throws std::runtime_error when the folder cannot
  /// be made.
  ChildServer(const std::filesystem::path& program, const std::vector<std::string>& arguments,
              Handlers handlers);
  ChildServer(const ChildServer&) = delete;
  ChildServer& operator=(const ChildServer&) = delete;
  /// Asks the server to end, waits up to three seconds for that, and then kills it. The seconds are those
  /// since `beginEnd`.
  ~ChildServer();
  /// Asks the server to end, and kills it after three seconds, but waits for nothing. The event loop calls
  /// `gone` once there is no server; it calls the other handlers no more. Must not be called twice, nor by a
  /// handler.
  void beginEnd(const std::function<void()>& gone);

  RuntimeFolder folder() const { return _folder.path(); }
  /// Viewers can connect. Stays true when the server has ended.
  bool isReady() const { return _isReady; }
  /// Also true after `beginEnd`.
  bool hasEnded() const { return _hasEnded; }
  qint64 processId() const { return _process->processId(); }

 private:
  void takeState();
  void takeLines();
  void askToEnd();
  void end(const std::string& why);
  std::string whyItEnded() const;

  const PrivateFolder _folder;
  const Handlers _handlers;
  FileDescriptor _states;  // the server tells here that it is ready
  std::unique_ptr<QSocketNotifier> _stateNotifier;
  std::unique_ptr<QProcess> _process;
  std::string _lines;                       // the last ones that the server has written to standard error
  std::optional<QDeadlineTimer> _patience;  // with a server that was asked to end
  bool _isReady = false;
  bool _hasEnded = false;
};

}  // namespace varnel

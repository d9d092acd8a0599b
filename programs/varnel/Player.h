#pragma once

#include <QPointer>
#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "app/VarnelApp.h"
#include "base/WhileAlive.h"
#include "host/ChildServer.h"
#include "host/ControlClient.h"
#include "host/EndingServers.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/JumpStages.h"
#include "programs/varnel/SavedDisplays.h"
#include "widgets/PlayBar.h"
#include "widgets/StartPage.h"
#include "widgets/WindowWidget.h"

namespace varnel {

/// Chooses what the window shows: the telephony server that is there, a server of the viewer's own (which
/// plays a capture, simulates a modem, or reads a port), or the displays of a snapshot. Joins the application
/// to the bar below the stack and to the start page.
class Player final {
 public:
  /// A capture that is played.
  struct Capture {
    std::string path;
    std::optional<std::string> technology;  ///< absent: what the capture names
  };
  /// A snapshot whose displays are shown.
  struct Saved {
    std::string path;
    std::vector<Generation> displays;  ///< the oldest first
    NumberFormats formats;             ///< of their numbers
  };
  /// All objects in it must outlive this one.
  struct Parts {
    HostServices& services;
    VarnelApp& app;
    UserInterface& userInterface;
    const Options& options;
    /// Another capture is played from now on; without a capture, something else is shown. May be empty.
    std::function<void(const std::optional<Capture>& capture)> captureChanged{};
    /// The displays of this snapshot are shown from now on. May be empty.
    std::function<void(const Saved& saved)> savedIsShown{};
  };

  explicit Player(const Parts& parts);
  Player(const Player&) = delete;
  Player& operator=(const Player&) = delete;
  /// Ends the server.
  ~Player();

  /// Adds the commands to the application's window, and lets files be dropped onto it.
  void furnish(WindowWidget& window);
  /// Opens the file that the command line names. The application was launched just before.
  void begin();
  /// What is shown stays until the file can be shown. When it cannot, an alert says why.
  void open(const std::string& path, const std::optional<std::string>& technology = {});
  void simulate(const std::string& technology);
  /// The port may be "auto".
  void connectToPort(const std::string& port);
  /// Shows the telephony server that is there.
  void close();
  /// How far the capture is, by its clock; absent when nobody knows.
  std::optional<Time> playedTime() const;
  /// The time of the snapshot's display that is shown; absent when none is.
  std::optional<Time> savedTime() const;
  /// The capture that is played, or the snapshot whose displays are shown; empty when there is none.
  std::string openFile() const;
  /// The user wants an empty display.
  void startOver();

 private:
  enum class Kind { Usual, Replay, Simulation, Port, Snapshot };
  // How far the next stage of a jump is: it awaits the channel of a new model, the server has the request,
  // the server has replied, what it has sent arrives.
  enum class Step { AwaitsChannel, IsSent, IsTaken, Arrives };
  // A server of the viewer's own, or none.
  struct Own {
    Kind kind = Kind::Usual;
    std::string name{};                       // of the file, the technology, or the port
    std::optional<std::string> technology{};  // that the user names for the file
    std::vector<std::string> arguments{};     // of the server
    std::optional<Time> firstTime{};          // of the capture, if it is known
    bool keepsPanes = false;                  // when it is ready
    unsigned number = 0;                      // of the start
    bool isSlow = false;                      // to start
    std::unique_ptr<ChildServer> server{};
    std::optional<std::string> whyItEnded{};
  };

  void start(Own own);
  void startAgain();
  void startTakesLong(unsigned number);
  void serverIsReady(unsigned number);
  void serverHasEnded(unsigned number, const std::string& why);
  void giveUpStarting();
  void endServerOf(Own& own);
  void showSaved(std::vector<Generation> displays, const std::string& name);
  void showDisplay(std::size_t number);
  void leaveServer();
  void tellOfCapture() const;
  void alert(const std::string& title, const std::string& message);

  void applicationHasChanged();
  void play();
  void pause();
  void setSpeed(double speed);
  void dragTo(int place);
  void jump(int place);
  void hold();
  void setJump(const JumpStages& stages);
  void forgetJump();
  void endJump();
  void startOverFor(const JumpStages& stages);
  void setClock();
  void beginStages();
  void sendStage();
  void followJump(const ServerStatus* status);
  void awaitArrival(unsigned looks);
  void stageHasArrived();
  void ask(const ControlRequest& request);
  void poll();
  void take(const std::optional<ControlReply>& reply);
  void takeChannel(const ServerStatus& status);
  void followPlaying();
  void pollAsNeeded();
  std::optional<std::chrono::milliseconds> pollInterval() const;
  bool isAtEnd() const;
  bool isPaused() const;

  void showBar();
  bool showsStart() const;
  bool hasOwn() const;
  PlayBar& bar();
  QString wayToClose() const;
  PlayBarState barState() const;
  PlayBarState stateOfStart() const;
  PlayBarState stateOfSnapshot() const;
  PlayBarState stateOfStream() const;
  QString progressAt(int place) const;
  void showStartPage();
  void chooseFile();
  void choosePort(const std::string& id);

  const Parts _parts;
  QPointer<WindowWidget> _window;
  QAction* _close = nullptr;  // of the window
  QPointer<StartPage> _startPage;
  QString _folder;  // of the file that was opened last

  unsigned _starts = 0;
  EndingServers _ending;              // those that were shown before
  Own _own, _starting;                // shown; to be shown when it is ready
  std::vector<Generation> _displays;  // of a snapshot
  NumberFormats _formats;             // of their numbers
  std::size_t _display = 0;

  std::unique_ptr<ControlClient> _control;
  std::optional<ServerStatus> _status;
  std::unique_ptr<RepeatingTimer> _polling;
  std::chrono::milliseconds _pollingInterval{};
  std::optional<JumpStages> _jump;  // to a place that is not reached yet
  Step _step = Step::AwaitsChannel;
  unsigned _jumps = 0;
  bool _goesOnAfterJump = false;  // the stream is held for a jump alone
  bool _wasConnected = false;
  bool _hasLooked = false;  // the application has tried to connect
  WhileAlive _whileAlive;
};

}  // namespace varnel

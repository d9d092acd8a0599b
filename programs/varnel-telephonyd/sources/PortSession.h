#pragma once

#include <array>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>

#include "host/captures/CaptureRecord.h"
#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/sources/FrameStream.h"
#include "programs/varnel-telephonyd/sources/PortCommands.h"
#include "programs/varnel-telephonyd/sources/WantedCodes.h"

namespace varnel {

/// Why a port cannot be used.
struct PortFailure {
  enum class Kind {
    AnswersNothing,  ///< nothing that a diagnostic port would say
    AnswersText,     ///< it repeats what it gets, or speaks as a port for AT commands does
    Refuses,         ///< it is a diagnostic port that does not let its logs be read
    FallsSilent,     ///< it was a diagnostic port, and answers no more
  };
  Kind kind;
  std::string detail{};  ///< for `Refuses`, such as "error 0x13"
};

/// A talk with a diagnostic port, from the time when its device is opened. It asks whether it is such a port,
/// makes it quiet, asks which log codes there are, and keeps those switched on that are wanted. It sends one
/// request at a time and waits 2 s for the answer. Log records may come at any time.
class PortSession final {
 public:
  struct Setup {
    MainQueue& queue;
    /// Sends bytes to the port.
    std::function<void(ByteView bytes)> send;
    /// Gets each record. Its message is valid for the length of the call.
    std::function<void(const CaptureRecord& record)> record;
    /// Called once, when the numbers of log codes are known.
    std::function<void()> ready;
    /// Called at most once. Nothing is sent after that. It must not destroy the session.
    std::function<void(const PortFailure& failure)> failed;
    /// Called when the port does not switch on the codes of an equipment.
    std::function<void(std::size_t equipment, const std::string& detail)> refused;
    LeftOut& leftOut;  ///< counts frames that hold no record; must outlive the session
  };

  explicit PortSession(Setup setup);
  PortSession(const PortSession&) = delete;
  PortSession& operator=(const PortSession&) = delete;
  ~PortSession() = default;

  /// Sends the first request.
  void begin();
  /// Takes bytes that the port has sent.
  void take(ByteView bytes);
  /// The port will send no more.
  void takeEnd() { _frameStream.end(); }
  /// Switches these codes on, and no others. Without any, the port becomes quiet. May be called at any time.
  void setWanted(WantedCodes wanted);
  /// Makes the port quiet and then calls the function: after 4 s at the latest when it does not answer.
  void end(std::function<void()> ended);

  /// Whether the numbers of log codes are known.
  bool isReady() const { return _numbers.has_value(); }
  /// What the modem calls its build, or when it was made; empty while that is not known.
  const std::string& build() const { return _build; }
  /// How many of the wanted codes the modem does not have; 0 while that is not known.
  std::size_t missingCodes() const { return _numbers ? _wanted.missingFrom(*_numbers) : 0; }
  /// Whether codes are wanted that the modem has, and it has refused all of them.
  bool refusesAll() const;

 private:
  enum class Step { Version, Build, EventsOff, DebugTextOff, AllCodesOff, CodeNumbers, SetCodes };
  struct Request {
    Step step;
    Bytes contents;
    int attempt = 1;
  };

  void plan(Step step);
  void planBeginning();
  void planQuiet();
  void planCodes();
  Bytes setCodesRequest() const;
  void goOn();
  void transmit();
  void send(const Request& request) const;
  void timeIsUp(std::uint64_t number);
  void takeFrame(std::span<std::uint8_t> contents);
  void listenForText(ByteView bytes);
  bool hasHeardText() const;
  void answered(Step step, ByteView answer);
  void unanswered(Request request);
  void repeat(Request request);
  void takeNumbers(ByteView answer, const std::optional<std::string>& detail);
  void codesSet(const std::optional<std::string>& detail);
  void fail(const PortFailure& failure);
  void finish();

  const Setup _setup;
  FrameStream _frameStream;

  std::deque<Request> _requests;  // the first one is on its way when `_isWaiting`
  bool _isWaiting = false;
  std::uint64_t _sent = 0;  // requests so far, to tell old time limits from that of the last one

  std::uint64_t _frames = 0;  // sound ones, without those that repeat the request for the version
  Bytes _heard;               // the last bytes while there is no frame
  std::string _build;
  std::optional<CodeNumbers> _numbers;

  WantedCodes _wanted;
  CodeMasks _masks;  // as they shall be
  CodeMasks _set;    // as the modem has them
  std::array<std::optional<CodeMask>, equipments> _refusedMasks;
  std::size_t _equipment = 0;  // that the planned request is about
  CodeMask _mask;              // of that equipment, as it shall be
  bool _isQuiet = false;

  bool _isOver = false;
  std::function<void()> _ended;                            // empty until it is to end
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

}  // namespace varnel

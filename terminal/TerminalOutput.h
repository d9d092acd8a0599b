#pragma once

#include <csignal>

namespace varnel {

/// The way to a terminal that may stand still, because nobody reads it any more. A program that writes to
/// such a terminal waits, and would see no signal that ends it. There can be only one such object at a time.
///
/// Signals that end the program (SIGTERM, SIGHUP, SIGINT) are blocked and watched elsewhere. During a
/// `Writing`, each of them drops what the terminal has not taken, and what is still to be written. Then
/// it is raised again for whoever watches for it.
class TerminalOutput final {
 public:
  /// Signals that are not blocked now keep their effect.
  TerminalOutput();
  TerminalOutput(const TerminalOutput&) = delete;
  TerminalOutput& operator=(const TerminalOutput&) = delete;
  ~TerminalOutput();

  /// Something is written to standard output while this object lives.
  class Writing final {
   public:
    explicit Writing(const TerminalOutput& output);
    Writing(const Writing&) = delete;
    Writing& operator=(const Writing&) = delete;
    ~Writing();

   private:
    const TerminalOutput& _output;
    sigset_t _formerMask{};
  };

  /// The program ends. Drops what the terminal has not taken, so that there is room for what is left to say.
  /// When there is none even so, standard output goes nowhere from now on.
  void makeRoomToEnd() const;
  /// Standard output goes nowhere from now on if the terminal stands still.
  void dropTheRest() const;

 private:
  sigset_t _interrupting{};
};

}  // namespace varnel

#pragma once

#include <QSocketNotifier>
#include <functional>
#include <memory>
#include <ostream>
#include <streambuf>
#include <string>
#include <string_view>

#include "app/TextViewer.h"

namespace varnel {

/// Pages on standard output: one after the other, or, on a terminal, each in the place of the one before, cut
/// to what the terminal can show. Lines that others have to say there stand between two pages.
class StandardOutput final : public TextOutput {
 public:
  StandardOutput();
  StandardOutput(const StandardOutput&) = delete;
  StandardOutput& operator=(const StandardOutput&) = delete;
  ~StandardOutput() override;

  /// What is written there goes to standard output by whole lines, between two pages.
  std::ostream& lines() { return _lineStream; }
  /// Watches standard output, which needs an event loop. The handler is called from there, once, when nobody
  /// reads standard output any more or it cannot be written to: with 0 for a reader who has left, else with
  /// the system's error.
  void setEndHandler(std::function<void(int error)> handler);

  void show(const TextPage& page) override;
  /// Shows the last page again, as fits the terminal as it is now. Nothing happens elsewhere.
  void showAgain();
  bool isTerminal() const { return _isTerminal; }

 private:
  void write(std::string_view text);
  void end(int error);
  void add(std::string_view text);

  class LineBuffer final : public std::streambuf {
   public:
    explicit LineBuffer(StandardOutput& output) : _output(output) {}

   protected:
    std::streamsize xsputn(const char* text, std::streamsize count) override;
    int overflow(int character) override;

   private:
    StandardOutput& _output;
  };

  const bool _isTerminal;
  bool _hasShown = false;
  TextPage _page;        // shown last
  std::string _waiting;  // lines for the time between two pages
  LineBuffer _lineBuffer{*this};
  std::ostream _lineStream{&_lineBuffer};
  std::function<void(int)> _endHandler;
  std::unique_ptr<QSocketNotifier> _reader;
};

}  // namespace varnel

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

/// Pages on standard output. On a terminal each page replaces the one before, and is cut to what the terminal
/// can show; elsewhere the pages follow each other. Lines from elsewhere come between two pages.
class StandardOutput final : public TextOutput {
 public:
  StandardOutput();
  StandardOutput(const StandardOutput&) = delete;
  StandardOutput& operator=(const StandardOutput&) = delete;
  ~StandardOutput() override;

  /// Text written to this stream goes to standard output in whole lines, between two pages.
  std::ostream& lines() { return _lineStream; }
  /// Watches standard output. This needs an event loop, which calls the handler once: with 0 when nobody
  /// reads standard output any more, or with the system's error when it cannot be written to.
  void setEndHandler(std::function<void(int error)> handler);

  void show(const TextPage& page) override;
  /// Shows the last page again in the terminal's current size. Does nothing elsewhere.
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
  TextPage _page;        // the page shown last
  std::string _waiting;  // lines that wait for the time between two pages
  LineBuffer _lineBuffer{*this};
  std::ostream _lineStream{&_lineBuffer};
  std::function<void(int)> _endHandler;
  std::unique_ptr<QSocketNotifier> _reader;
};

}  // namespace varnel

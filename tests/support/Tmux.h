#pragma once

#include <string>
#include <vector>

#include "tests/support/Process.h"
#include "tests/support/Tool.h"

namespace varnel {

/// A shell in a terminal that tmux keeps: the test types keys and sees the screen as a user would.
class Tmux {
 public:
  explicit Tmux(int columns = 80, int rows = 24) {
    run({"-f", "/dev/null", "new-session", "-d", "-x", std::to_string(columns), "-y", std::to_string(rows),
         "PS1='$ ' exec sh"},
        {"LC_ALL=C.UTF-8", "TMUX", "TMUX_PANE", "NO_COLOR", "DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM",
         "TERM=xterm-256color", "ENV"});
    EXPECT_TRUE(eventually([this] { return screen().starts_with("$"); })) << screen();
  }
  Tmux(const Tmux&) = delete;
  Tmux& operator=(const Tmux&) = delete;
  ~Tmux() { run({"kill-server"}); }

  /// Presses keys by tmux's names for them ("Down", "C-c"), or types a character.
  void press(std::vector<std::string> keys) const {
    keys.insert(keys.begin(), {"send-keys", "--"});
    run(keys);
  }
  void type(const std::string& text) const { run({"send-keys", "-l", "--", text}); }
  /// Types a line for the shell.
  void command(const std::string& line) const {
    type(line);
    press({"Enter"});
  }
  /// The visible lines. Blanks at their ends are left out.
  std::string screen() const { return run({"capture-pane", "-p"}); }
  void resize(int columns, int rows) const {
    run({"resize-window", "-x", std::to_string(columns), "-y", std::to_string(rows)});
  }
  /// What tmux says about the terminal, such as "#{alternate_on}".
  std::string state(const std::string& format) const {
    std::string text = run({"display-message", "-p", format});
    if (text.ends_with('\n')) text.pop_back();
    return text;
  }
  /// From now on, every byte that is written to the terminal also goes into this file.
  void copyBytesTo(const std::string& path) const { run({"pipe-pane", "-O", "cat >> '" + path + "'"}); }

  /// Waits until the screen has this text, or has it no more.
  testing::AssertionResult shows(const std::string& text) const {
    if (eventually([&] { return screen().find(text) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not shown: " << text << "\n" << screen();
  }
  testing::AssertionResult showsNoMore(const std::string& text) const {
    if (eventually([&] { return screen().find(text) == std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "still shown: " << text << "\n" << screen();
  }

 private:
  std::string run(std::vector<std::string> arguments, std::vector<std::string> environment = {}) const {
    arguments.insert(arguments.begin(), {"-S", _folder.file("socket")});
    Process tmux(tool("tmux"), std::move(arguments), std::move(environment));
    EXPECT_TRUE(tmux.waitForEnd());
    EXPECT_EQ(tmux.exitStatus(), 0) << tmux.error();
    return tmux.output();
  }

  TemporaryFolder _folder;
};

}  // namespace varnel

#include <csignal>
#include <iostream>

#include "host/BuildInfo.h"
#include "host/Printable.h"
#include "host/ProgramStart.h"
#include "host/TerminateHandler.h"
#include "programs/varnel/Options.h"
#include "programs/varnel/TerminalView.h"
#include "programs/varnel/TextView.h"
#include "programs/varnel/WindowView.h"
#include "terminal/CursesScreen.h"
#include "widgets/Display.h"

namespace varnel {

namespace {

constexpr int generalError = 1;
constexpr int usageError = 2;

using View = int (*)(int&, char**, const Options&, const ApplicationInfo&);

View viewFor(const std::string& userInterface) {
  if (userInterface == "window") return viewInWindow;
  if (userInterface == "terminal") return viewInTerminal;
  if (userInterface == "text") return viewAsText;
  if (displayIsThere()) return viewInWindow;
  return terminalIsThere() ? viewInTerminal : viewAsText;
}

int run(int argumentCount, char** arguments) {
  const ApplicationInfo application = applicationInfo();
  Options options;
  CLI::App parser("", programName);
  declare(parser, options, application);
  try {
    parser.parse(argumentCount, arguments);
  } catch (const CLI::Success& wish) {  // help or version
    return parser.exit(wish);
  } catch (const CLI::ParseError& error) {
    std::cerr << programName << ": " << printable(error.what()) << "; see " << programName << " --help\n";
    return usageError;
  }
  try {
    return viewFor(options.userInterface)(argumentCount, arguments, options, application);
  } catch (const std::runtime_error& error) {
    std::cerr << programName << ": " << printable(error.what()) << '\n';
    return generalError;
  }
}

}  // namespace

}  // namespace varnel

int main(int argumentCount, char** arguments) {
  varnel::startProgram();
  varnel::installTerminateHandler(varnel::programName);
  // When the reader of the output leaves early, this is a failed write, not a signal that ends the program.
  std::signal(SIGPIPE, SIG_IGN);
  return varnel::run(argumentCount, arguments);
}

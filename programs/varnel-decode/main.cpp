#include <csignal>
#include <cstdio>
#include <ostream>
#include <string>
#include <variant>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "host/BuildInfo.h"
#include "host/FileResources.h"
#include "host/ProgramStart.h"
#include "host/TerminateHandler.h"
#include "programs/varnel-decode/InputDecoding.h"
#include "programs/varnel-decode/Jobs.h"
#include "programs/varnel-decode/Options.h"
#include "programs/varnel-decode/OutputClash.h"
#include "programs/varnel-decode/ProgramError.h"
#include "programs/varnel-decode/StandardOutput.h"
#include "programs/varnel-decode/TemplateWatch.h"

namespace varnel {

namespace {

constexpr int generalError = 1;

int decodeAll(const Options& options, const DecodingServices& services) {
  if (options.technology && !succeeds([] { static_cast<void>(readableResourceFolder()); }))
    return generalError;
  int status = generalError;
  const auto decodeOne = [&](std::size_t index) { return decodeInput(options, index, services); };
  const bool isPassedOn = succeeds([&] {
    const bool areSeveral = options.captures.size() > 1;
    if (areSeveral && options.output == Output::ValueTable)
      writeOutput(stdout, commonCsvHeader(options, services));
    if (areSeveral && options.isEventTable())
      writeOutput(stdout, eventTableHeader(EventColumns::WithCapture));
    status = areSeveral ? runJobs(options.captures, options.jobs, decodeOne) : decodeOne(0);
  });
  return isPassedOn ? status : generalError;
}

int run(int argumentCount, char** arguments) {
  const FileResources resources(resourceFolder());
  const ApplicationInfo application = applicationInfo();
  CaptureClock clock;
  // Generators write some lines to standard output. They would spoil the data there.
  std::ostream nowhere(nullptr);
  const TemplateWatch templates(resources);

  const auto names = LogGenerator::technologies();
  const std::vector<std::string> technologies(names.begin(), names.end());
  const auto choice =
      readOptions(argumentCount, arguments, technologies, application.version.value_or("(none)"));
  if (const auto* status = std::get_if<ExitStatus>(&choice)) return status->code;
  const auto& options = std::get<Options>(choice);
  if (const auto clash = outputClash(options)) return mistake(*clash).code;
  const Services services{templates, clock, application, nowhere, options.identities};
  return decodeAll(options, {services, clock, templates, technologies});
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

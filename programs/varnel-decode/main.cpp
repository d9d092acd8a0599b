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
#include "programs/varnel-decode/Explaining.h"
#include "programs/varnel-decode/InputDecoding.h"
#include "programs/varnel-decode/ManyCaptures.h"
#include "programs/varnel-decode/MergeParts.h"
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
  const bool isPassedOn = succeeds([&] {
    if (options.sharesOutput() && options.output == Output::ValueTable)
      writeOutput(stdout, commonCsvHeader(options, services));
    if (options.sharesOutput() && options.isEventTable())
      writeOutput(stdout, eventTableHeader(EventColumns::WithCapture));
    status = options.areMany() ? decodeMany(options, services) : decodeInput(options, 0, services);
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
  auto choice = readOptions(argumentCount, arguments, technologies, application.version.value_or("(none)"));
  if (const auto* status = std::get_if<ExitStatus>(&choice)) return status->code;
  auto& options = std::get<Options>(choice);
  if (!options.explainedPaths.empty()) return explain(options.explainedPaths, resources);
  if (!options.mergedParts.empty()) return mergeParts(options.mergedParts, options.databasePath);
  if (!succeeds([&] { takeList(options); })) return generalError;
  if (const auto clash = outputClash(options)) return mistake(*clash).code;
  if (options.writtenList) return succeeds([&] { writeList(options); }) ? 0 : generalError;
  takePart(options);
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

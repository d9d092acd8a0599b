#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "LogGenerator/Services.h"
#include "programs/varnel-decode/CaptureClock.h"
#include "programs/varnel-decode/Options.h"
#include "programs/varnel-decode/TemplateWatch.h"

namespace varnel {

/// What the decoders use. Clock and templates are those in the services.
struct DecodingServices {
  const Services& services;
  CaptureClock& clock;
  const TemplateWatch& templates;
  const std::vector<std::string>& technologies;  ///< all technologies
};

/// The header line of the one table for several captures. Looks into captures that are files to find their
/// technologies.
std::string commonCsvHeader(const Options& options, const DecodingServices& services);

/// Does everything that the options ask for with one of the captures or snapshots. Returns the exit status:
/// 0, 1 after a failure, or 2 after a mistake of the user. Standard error then has a line about it.
int decodeInput(const Options& options, std::size_t index, const DecodingServices& services);

}  // namespace varnel

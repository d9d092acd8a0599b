#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "LogGenerator/Services.h"
#include "programs/varnel-decode/CaptureClock.h"
#include "programs/varnel-decode/Options.h"
#include "programs/varnel-decode/TemplateWatch.h"

namespace varnel {

/// What the decoders get; clock and templates are those that the services show.
struct DecodingServices {
  const Services& services;
  CaptureClock& clock;
  const TemplateWatch& templates;
  const std::vector<std::string>& technologies;  ///< all that there are
};

/// The header line of the one table that several captures make. Looks into those that are files for the
/// technologies that they name.
std::string commonCsvHeader(const Options& options, const DecodingServices& services);

/// Does for one of the captures or snapshots all that the options ask for. The process's exit status: 0, 1
/// after a failure and 2 after a mistake of the user, each of which has been told on standard error.
int decodeInput(const Options& options, std::size_t index, const DecodingServices& services);

}  // namespace varnel

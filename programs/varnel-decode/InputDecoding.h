#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "LogGenerator/Services.h"
#include "programs/shared/CaptureClock.h"
#include "programs/varnel-decode/MessageStatistics.h"
#include "programs/varnel-decode/Options.h"
#include "programs/varnel-decode/TemplateWatch.h"
#include "programs/varnel-decode/database/ValueChanges.h"

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

/// Where those who decode many captures learn about each of them.
struct DecodingNotes {
  std::atomic<std::uint64_t>* bytesRead = nullptr;  ///< gets how far the capture was read; may be null
  MessageStatistics* statistics = nullptr;          ///< gets what became of the messages; may be null
  ValueChanges* changes = nullptr;                  ///< gets the displays; may be null
  bool isOutputBroken = false;  ///< set when standard output, or `changes`, cannot take any more
};

/// Does everything that the options ask for with one of the captures or snapshots. Returns the exit status:
/// 0, 1 after a failure, or 2 after a mistake of the user. Standard error then has a line about it. The notes
/// may be null.
int decodeInput(const Options& options, std::size_t index, const DecodingServices& services,
                DecodingNotes* notes = nullptr);

}  // namespace varnel

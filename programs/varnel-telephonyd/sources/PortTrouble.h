#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "programs/varnel-telephonyd/sources/PortSession.h"

namespace varnel {

// Each is one sentence for the user: what is wrong with a port, and what to do.

std::string troubleOf(const PortFailure& failure, const std::string& name);
std::string troubleOfUnplugged(const std::string& name);
/// The modem does not switch on the codes of one equipment, 0 to 15.
std::string troubleOfRefusedCodes(const std::string& name, std::size_t equipment, const std::string& detail);

/// There is no such device.
std::string troubleOfMissing(const std::string& name);
/// It is a file.
std::string troubleOfFile(const std::string& name);
/// It is a folder, or the like.
std::string troubleOfNoDevice(const std::string& name);
/// It is the terminal that the server was started from.
std::string troubleOfOwnTerminal(const std::string& name);
/// The user may not open it. The group is the one that may; empty when no group may.
std::string troubleOfPermission(const std::string& name, const std::string& group);
/// Others have it open, each as "ModemManager (process 812)"; at least one. The sentence names three at most.
std::string troubleOfBusy(const std::string& name, const std::vector<std::string>& holders);
/// Another program has it open, and the system does not show which one. A second sentence follows when
/// ModemManager runs.
std::string troubleOfUnknownHolder(const std::string& name, bool runsModemManager);
/// No device may be a diagnostic port. ModemManager runs or does not.
std::string troubleOfNoPort(bool hasModemManager);
/// Of the devices that may be one, none is and is free.
std::string troubleOfNoFreePort();
/// The system's error is none of the above.
std::string troubleOfSystem(const std::string& name, int error);

// Each is one sentence about ModemManager and the port that is served.

/// It goes on using the modem.
std::string noteOfModemManager();
/// It leaves the modem alone.
std::string noteOfInhibition(const std::string& name);
/// It does not use the modem, or does not run.
std::string noteOfNothingToInhibit(const std::string& name);

}  // namespace varnel

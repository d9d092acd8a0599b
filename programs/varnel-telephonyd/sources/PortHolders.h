#pragma once

#include <sys/types.h>

#include <filesystem>
#include <string>
#include <vector>

namespace varnel {

/// The other processes that have the device open, each as "ModemManager (process 812)", by ascending number.
/// A process that has the other end of a pseudo-terminal is its modem, and not among them. Empty when there
/// are none, or when the system does not show them to this user.
std::vector<std::string> holdersOf(dev_t device, const std::filesystem::path& processes = "/proc");

/// Whether a process named ModemManager runs, whose open devices only root sees.
bool runsModemManager(const std::filesystem::path& processes = "/proc");

}  // namespace varnel

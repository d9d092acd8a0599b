#include "programs/varnel-telephonyd/sources/PortTrouble.h"

#include <string_view>
#include <system_error>

namespace varnel {

namespace {

constexpr std::string_view otherPorts =
    "a modem has several ports, so try the next one (ls -l /dev/serial/by-id)";

// Such as "a, b, c, and 2 more". There is at least one name.
std::string inWords(std::vector<std::string> names) {
  constexpr std::size_t most = 3;
  if (names.size() > most) {
    const std::size_t more = names.size() - most;
    names.resize(most);
    names.push_back(std::to_string(more) + " more");
  }
  const std::string beforeLast = names.size() == 2 ? " and " : ", and ";
  std::string words = names[0];
  for (std::size_t i = 1; i < names.size(); ++i)
    words += (i + 1 < names.size() ? ", " : beforeLast) + names[i];
  return words;
}

}  // namespace

std::string troubleOf(const PortFailure& failure, const std::string& name) {
  switch (failure.kind) {
    case PortFailure::Kind::AnswersText:
      return name + " takes AT commands and is no diagnostic port; " + std::string(otherPorts);
    case PortFailure::Kind::AnswersNothing:
      return name + " does not answer as a diagnostic port, and may be the modem's port for AT commands; " +
             std::string(otherPorts) + ", or unplug the modem and plug it in again";
    case PortFailure::Kind::Refuses:
      return name + " refuses to switch on its logs (" + failure.detail +
             "); allow it in the settings of the modem, or use another modem";
    case PortFailure::Kind::FallsSilent:
      return name + " answers no more; if this goes on, unplug the modem and plug it in again";
  }
  return {};
}

std::string troubleOfUnplugged(const std::string& name) {
  return name + " is unplugged; plug it in again, and the display goes on";
}

std::string troubleOfRefusedCodes(const std::string& name, std::size_t equipment, const std::string& detail) {
  constexpr char digits[] = "0123456789ABCDEF";
  return name + " refuses to switch on the log codes from 0x" + digits[equipment % 16] + "000 on (" + detail +
         "); sections that need them stay empty";
}

std::string troubleOfMissing(const std::string& name) {
  return "there is no device " + name +
         "; plug the modem in, or look for its ports with ls /dev/tty* /dev/wwan*";
}

std::string troubleOfFile(const std::string& name) {
  return name + " is no device; to play a file back, type --replay " + name;
}

std::string troubleOfNoDevice(const std::string& name) {
  return name + " is no device; look for the modem's ports with ls /dev/tty* /dev/wwan*";
}

std::string troubleOfOwnTerminal(const std::string& name) {
  return name +
         " is the terminal of this server and no modem's port; name a port of the modem (ls -l "
         "/dev/serial/by-id)";
}

std::string troubleOfPermission(const std::string& name, const std::string& group) {
  if (group.empty()) return "you may not open " + name + ", and no group may; start the server with sudo";
  return "you may not open " + name + ", which belongs to the group " + group + "; type sudo usermod -aG " +
         group + " $USER, log out, and log in again";
}

std::string troubleOfBusy(const std::string& name, const std::vector<std::string>& holders) {
  if (holders.size() > 1) return inWords(holders) + " use " + name + "; end them first";
  const bool isModemManager = holders[0].starts_with("ModemManager ");
  return holders[0] + " uses " + name + "; " +
         (isModemManager
              ? "type --inhibit too, which cuts the modem's data connection, or sudo systemctl stop "
                "ModemManager"
              : "end it first");
}

std::string troubleOfUnknownHolder(const std::string& name, bool runsModemManager) {
  std::string trouble =
      "another program uses " + name + "; find it with sudo fuser -v " + name + ", and end it";
  if (runsModemManager)
    trouble +=
        ". ModemManager runs and may be that program; --inhibit asks it to leave the modem alone, which "
        "cuts the modem's data connection";
  return trouble;
}

std::string troubleOfNoPort(bool hasModemManager) {
  return std::string("ModemManager ") + (hasModemManager ? "knows no diagnostic port" : "does not run") +
         ", and udev marks no port as a modem's; plug the modem in, or name its port with --port DEVICE";
}

std::string troubleOfNoFreePort() {
  return "no port of a modem is a diagnostic port that is free; name another one with --port DEVICE";
}

std::string troubleOfSystem(const std::string& name, int error) {
  return "cannot open " + name + ": " + std::generic_category().message(error) +
         "; unplug the modem and plug it in again";
}

std::string noteOfModemManager() {
  return "ModemManager goes on using this modem; if the two disturb each other, type --port auto --inhibit, "
         "which cuts the modem's data connection while the server runs";
}

std::string noteOfInhibition(const std::string& name) {
  return "ModemManager leaves the modem of " + name +
         " alone until the server ends; until then the modem has no data connection";
}

std::string noteOfNothingToInhibit(const std::string& name) {
  return "ModemManager does not use the modem of " + name + ", so --inhibit does nothing";
}

}  // namespace varnel

#include "programs/varnel-telephonyd/live/ModemStatus.h"

#include <utility>

#include "programs/varnel-telephonyd/live/ModemInterfaces.h"

namespace varnel {

namespace {

using Use = ModemStatus::Use;

// In the service's enumeration of states. Those up to `connected` follow each other.
enum State : std::int8_t {
  Failed = -1,
  Initializing = 1,
  Locked = 2,
  Disabled = 3,
  Disabling = 4,
  Enabling = 5,
  Enabled = 6,
  Searching = 7,
  Connected = 11,
};
constexpr std::int64_t simMissing = 2;            // in the enumeration of failures
constexpr std::int64_t pinLock = 2, pukLock = 4;  // in the enumeration of locks

// What mmcli takes for this modem.
std::string indexOf(const std::string& path) { return path.substr(path.rfind('/') + 1); }

std::string sentenceOfFailure(const std::string& name, std::optional<std::int64_t> reason,
                              const std::string& index) {
  if (reason == simMissing) return name + " has no SIM card; put one in";
  return name + " cannot be used; mmcli -m " + index + " says why";
}

std::string sentenceOfLock(const std::string& name, std::optional<std::int64_t> lock) {
  if (lock == pukLock)
    return name + " is locked by the SIM card's PUK; type mmcli -i any --puk=PUK --pin=PIN";
  if (lock == pinLock) return name + " is locked by the SIM card's PIN; type mmcli -i any --pin=PIN";
  return name + " is locked; mmcli -m any says by what";
}

std::string sentenceOfNetwork(const std::string& name, std::int64_t state,
                              const busReading::Interfaces& modem) {
  const QVariantMap network = modem.value(modemInterfaces::network);
  std::string operatorName = busReading::text(network, "OperatorName");
  if (operatorName.empty()) operatorName = busReading::text(network, "OperatorCode");
  return name + (state == Connected ? " is connected" : " is registered") +
         (operatorName.empty() ? "" : " in " + operatorName);
}

}  // namespace

ModemStatus statusOf(ModemBus::Service service) {
  switch (service) {
    case ModemBus::Service::NoBus:
      return {Use::None, "the system bus cannot be reached, so ModemManager cannot be asked"};
    case ModemBus::Service::NotRunning:
      return {Use::None, "ModemManager does not run; type sudo systemctl start ModemManager"};
    case ModemBus::Service::NotAnswering:
      return {Use::None, "ModemManager does not answer; type sudo systemctl restart ModemManager"};
    case ModemBus::Service::Running:
      break;
  }
  return {};
}

ModemStatus statusWithoutModem(const std::string& wanted) {
  if (wanted.empty()) return {Use::None, "ModemManager knows no modem; plug one in"};
  return {Use::None, "ModemManager knows no modem " + wanted + "; mmcli -L lists its modems"};
}

ModemStatus statusOfLost(const std::string& name) {
  return {Use::None, name + " has gone; plug it in again"};
}

std::string nameOfModem(const std::string& path, const busReading::Interfaces& modem) {
  const QVariantMap properties = modem.value(modemInterfaces::modem);
  const std::string maker = busReading::text(properties, "Manufacturer");
  std::string model = busReading::text(properties, "Model");
  if (maker.empty() && model.empty()) return "modem " + indexOf(path);
  if (maker.empty() || model.starts_with(maker)) return model;
  return model.empty() ? maker : maker + ' ' + model;
}

ModemStatus statusOf(const std::string& path, const busReading::Interfaces& modem) {
  const QVariantMap properties = modem.value(modemInterfaces::modem);
  const std::string name = nameOfModem(path, modem);
  const std::int64_t state = busReading::number(properties, "State").value_or(0);
  switch (state) {
    case Failed:
      return {Use::None,
              sentenceOfFailure(name, busReading::number(properties, "StateFailedReason"), indexOf(path))};
    case Locked:
      return {Use::None, sentenceOfLock(name, busReading::number(properties, "UnlockRequired"))};
    case Disabled:
    case Disabling:
      return {Use::None, name + " is disabled; type mmcli -m " + indexOf(path) + " --enable"};
    case Enabling:
      return {Use::None, name + " is being enabled"};
    case Enabled:
    case Searching:
      return {Use::Waiting, name + " searches a network"};
    default:
      break;
  }
  if (state <= Initializing) return {Use::None, name + " is being prepared by ModemManager"};
  return {Use::Full, sentenceOfNetwork(name, state, modem)};
}

}  // namespace varnel

#include "programs/varnel-telephonyd/sources/PortChooser.h"

#include <algorithm>
#include <stdexcept>
#include <system_error>
#include <utility>

#include "programs/varnel-telephonyd/sources/DiagnosticPort.h"
#include "programs/varnel-telephonyd/sources/PortTrouble.h"

namespace varnel {

void PortChooser::search(std::function<void(const std::optional<std::string>& path)> ended) {
  _ended = std::move(ended);
  _known = _service.ports();
  std::vector<std::string> paths = candidates();
  if (paths.empty()) {
    _setup.tell(troubleOfNoPort(_known.has_value()));
    return _ended(std::nullopt);
  }
  _search = std::make_unique<PortSearch>(PortSearch::Setup{
      .queue = _setup.queue,
      .candidates = std::move(paths),
      .makeDevice = [](const std::string& path) { return std::make_unique<DiagnosticPort>(path); },
      .prepare = [this](const std::string& path) { return prepare(path); },
      .ended = [this](const std::optional<std::string>& path) { take(path); },
      .tell = _setup.tell});
  _search->begin();
}

void PortChooser::inhibitModemOf(const std::string& path) {
  std::error_code ignored;
  const auto device = std::filesystem::canonical(path, ignored);
  _known = _service.ports();
  if (!_known || !knownPort(device)) return _setup.tell(noteOfNothingToInhibit(path));
  if (const auto trouble = prepare(device)) throw std::runtime_error(*trouble);
  _setup.tell(noteOfInhibition(path));
}

// A port that ModemManager knows as one of another kind is none.
std::vector<std::string> PortChooser::candidates() const {
  std::vector<std::string> paths;
  if (_known)
    for (const ModemManager::Port& port : *_known)
      if (port.isDiagnostic) paths.push_back(port.path);
  if (!paths.empty()) return paths;
  paths = markedPorts(_setup.folders);
  std::erase_if(paths, [this](const std::string& path) { return knownPort(path) != nullptr; });
  return paths;
}

const ModemManager::Port* PortChooser::knownPort(const std::string& path) const {
  if (!_known) return nullptr;
  const auto found = std::ranges::find(*_known, path, &ModemManager::Port::path);
  return found == _known->end() ? nullptr : &*found;
}

std::optional<std::string> PortChooser::prepare(const std::string& path) {
  if (_setup.use == ModemManagers::Stays) return std::nullopt;
  const ModemManager::Port* const port = knownPort(path);
  if (port) return _service.inhibit(port->modem);
  _service.release();
  return std::nullopt;
}

void PortChooser::take(const std::optional<std::string>& path) {
  if (!path) {
    _service.release();
    _setup.tell(troubleOfNoFreePort());
    return _ended(std::nullopt);
  }
  if (knownPort(*path))
    _setup.tell(_setup.use == ModemManagers::IsInhibited ? noteOfInhibition(*path) : noteOfModemManager());
  _ended(lastingNameOf(*path, _setup.folders));
}

}  // namespace varnel

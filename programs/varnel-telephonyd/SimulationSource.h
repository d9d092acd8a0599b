#pragma once

#include <memory>
#include <utility>

#include "programs/varnel-telephonyd/MessageSource.h"
#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"

namespace varnel {

/// The messages of a simulated modem.
class SimulationSource final : public MessageSource {
 public:
  explicit SimulationSource(std::unique_ptr<SimulatedModem> modem) : _modem(std::move(modem)) {}

  std::optional<StreamMessage> next() override {
    SimulatedMessage message = _modem->next();
    return StreamMessage{message.at, std::move(message.bytes)};
  }

  /// A modem does not wait.
  Lateness lateness() const override { return Lateness::IsDropped; }

 private:
  const std::unique_ptr<SimulatedModem> _modem;
};

}  // namespace varnel

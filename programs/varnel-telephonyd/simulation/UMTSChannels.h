#pragma once

#include <vector>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"
#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"

namespace varnel::simulation {

/// The channels of a UMTS connection: the transmit power of the phone, and how well it receives.
class UMTSChannels {
 public:
  explicit UMTSChannels(Random random) : _random(random) {}

  /// The connection has entered this state. The counters of its transport channels start again.
  void configure(UTRANConnection::State state, std::chrono::milliseconds now);

  /// Samples of the transmit power, which follows the path loss. When the phone sends only in bursts, the
  /// samples between bursts are 0.
  Bytes transmitPower(const Situation& situation);
  /// The blocks of each transport channel since it was set up, and the number of wrong blocks.
  Bytes blockErrors(const Situation& situation);
  /// What the high-speed channels of one or two carriers have received since the last report.
  Bytes highSpeed(const Situation& situation);

 private:
  struct TransportChannel {
    int identity;
    int blocks;  // per second
    std::int64_t received = 0, wrong = 0;
  };

  std::int64_t power_cdbm(const Situation& situation);
  void receive(TransportChannel& channel, std::int64_t elapsed_ms, std::int64_t wrong_permille);
  void putProcesses(PacketWriter& packet, std::int64_t subframes);

  Random _random;
  bool _sendsInBursts = false;
  int _carriers = 1;
  std::vector<TransportChannel> _channels;
  std::chrono::milliseconds _counted{0}, _highSpeedTold{0};
};

}  // namespace varnel::simulation

#pragma once

#include <deque>
#include <string>

#include "programs/varnel-telephonyd/simulation/CellSelection.h"
#include "programs/varnel-telephonyd/simulation/PhoneActivity.h"
#include "programs/varnel-telephonyd/simulation/ScheduledModem.h"

namespace varnel::simulation {

/// A GSM modem that sends pictures instead of packets. Every message is a property list with everything about
/// the phone. There is one every second, and one for every change of the phone's activity.
class ObjectStreamModem final : public ScheduledModem {
 public:
  explicit ObjectStreamModem(std::uint64_t seed) : ObjectStreamModem(Random(seed)) {}

  std::string_view technology() const override;

 private:
  enum class Encoding { XML, Binary };

  explicit ObjectStreamModem(Random random);

  void step();
  void servingCellChanged(const Cell& previous);
  void activityChanged();
  void transfer();
  void chooseTemporaryIdentities();
  void note(const std::string& event);
  void sendPicture(Encoding encoding);

  Walk _walk;
  CellSelection _selection;
  PhoneActivity _activity;
  Random _random;
  std::uint32_t _temporaryIdentity, _packetTemporaryIdentity;
  std::int64_t _sent_bytes = 0, _received_bytes = 0;
  std::deque<std::string> _events;
  std::uint64_t _pictures = 0;
};

}  // namespace varnel::simulation

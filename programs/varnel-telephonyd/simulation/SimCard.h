#pragma once

#include <cstdint>
#include <string>

#include "base/Value.h"
#include "programs/varnel-telephonyd/simulation/Cell.h"
#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// The SIM card in the phone, which its home network has issued. Each seed has a card with another number.
class SimCard {
 public:
  SimCard(Random random, const Cell& cell, Network home = homeNetwork);

  /// The phone has registered in the area of this cell and got new temporary identities.
  void registerIn(const Cell& cell);

  /// The elementary files as the telephony server reports them: a dictionary of texts.
  Value files() const;

 private:
  Random _random;
  Network _home;
  std::string _number;  // the card's number with its check digit
  std::string _subscriberNumber;
  int _area;
  Network _network;
  std::uint32_t _temporaryIdentity;
  std::uint32_t _packetTemporaryIdentity;
};

}  // namespace varnel::simulation

#pragma once

#include "LogGenerator/Identities.h"
#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// The phone's registration in the network (EMM state, 3GPP TS 24.301), and the temporary identity that the
/// network gave it.
class Registration final : public VersionedDecoder {
 public:
  explicit Registration(Identities identities = Identities::Hidden);

 private:
  static const PacketLayout layouts[];

  void show(const Packet& body);
  void showIdentity(const Packet& body);

  const Identities _identities;
};

}  // namespace varnel::lte

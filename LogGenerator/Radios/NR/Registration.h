#pragma once

#include "LogGenerator/Identities.h"
#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::nr {

/// Fills the section "Registration" of NR: how far 5G mobility management (5GMM) is registered, and under
/// which identity (5G-GUTI).
class Registration final : public VersionedDecoder {
 public:
  explicit Registration(Identities identities = Identities::Hidden);

 private:
  static const PacketLayout layouts[];

  void update(const Packet& payload);
  void showIdentity(const Packet& identity);

  const Identities _identities;
};

}  // namespace varnel::nr

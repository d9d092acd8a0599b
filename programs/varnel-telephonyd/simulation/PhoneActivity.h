#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// What a GSM phone is busy with: it rests, tells the network where it is, calls and transfers packets.
class PhoneActivity {
 public:
  enum class Kind {
    Idle,
    LocationAccess,
    LocationUpdate,
    CallAccess,
    CallSetup,
    Call,
    CallRelease,
    PacketAccess,
    PacketTransfer,
  };

  /// A phone that has just been switched on and is about to tell where it is.
  explicit PhoneActivity(Random random);

  Kind kind() const { return _kind; }
  /// Whether a channel is the phone's alone.
  bool isDedicated() const;
  /// Whether the network knows where the phone is.
  bool isLocated() const { return _isLocated; }
  /// When the phone last told where it is.
  std::chrono::milliseconds locatedAt() const { return _locatedAt; }

  /// After that time at the latest the phone tells again where it is.
  static constexpr std::chrono::milliseconds locationPeriod{std::chrono::minutes(30)};

  /// Time passes; true when the phone is busy with something else from now on.
  bool update(std::chrono::milliseconds now);
  /// The phone has come into another area, and tells so once it is idle.
  void areaChanged() { _isLocated = false; }

 private:
  Kind nextKind();
  void enter(Kind kind, std::chrono::milliseconds now);

  Random _random;
  Kind _kind = Kind::Idle;
  bool _isLocated = false;
  Kind _nextWish = Kind::PacketAccess;  // calls and packets come in turn
  std::chrono::milliseconds _locatedAt{0};
  std::chrono::milliseconds _end;
};

}  // namespace varnel::simulation

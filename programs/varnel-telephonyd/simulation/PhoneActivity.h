#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// What a GSM phone does: it idles, reports its location, makes calls, and transfers packets.
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

  /// The phone has just been switched on and is about to report its location.
  explicit PhoneActivity(Random random);

  Kind kind() const { return _kind; }
  /// Whether the phone has a channel of its own.
  bool isDedicated() const;
  /// Whether the network knows where the phone is.
  bool isLocated() const { return _isLocated; }
  /// When the phone last reported its location.
  std::chrono::milliseconds locatedAt() const { return _locatedAt; }

  /// After this time at most, the phone reports its location again.
  static constexpr std::chrono::milliseconds locationPeriod{std::chrono::minutes(30)};

  /// Lets time pass. True when the activity has changed.
  bool update(std::chrono::milliseconds now);
  /// The phone has come to another area. It reports that as soon as it is idle.
  void areaChanged() { _isLocated = false; }

 private:
  Kind nextKind();
  void enter(Kind kind, std::chrono::milliseconds now);

  Random _random;
  Kind _kind = Kind::Idle;
  bool _isLocated = false;
  Kind _nextWish = Kind::PacketAccess;  // calls and packets alternate
  std::chrono::milliseconds _locatedAt{0};
  std::chrono::milliseconds _end;
};

}  // namespace varnel::simulation

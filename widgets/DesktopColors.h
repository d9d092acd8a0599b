#pragma once

#include "widgets/DesktopSettings.h"

namespace varnel {

/// Follows the desktop's light or dark scheme where the toolkit does not.
class DesktopColors final {
 public:
  /// The answer of the settings portal, with its numbers.
  enum class Scheme : unsigned { NoPreference = 0, Dark = 1, Light = 2 };

  /// Gives the application the colors of this scheme.
  static void apply(Scheme scheme);
  /// The setting that tells the scheme. Without it the toolkit's colors stay.
  static DesktopSettings::Setting setting();
};

}  // namespace varnel

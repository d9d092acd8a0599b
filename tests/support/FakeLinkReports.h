#pragma once

#include "platform/LinkReports.h"

namespace varnel {

/// A host that reports about the link what the test says.
class FakeLinkReports final : public LinkReports {
 public:
  LinkReport linkReport() const override { return report; }

  LinkReport report;
};

}  // namespace varnel

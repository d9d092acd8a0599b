#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The serving cell of the idle-mode reselection report.
class ReselectionCandidatesMisc final : public SectionDecoder<ReselectionCandidatesMisc> {
 public:
  static constexpr std::string_view sectionName = "Reselection Candidates";
  static constexpr std::string_view traceLine = "Reselection Candidates";
  static const PacketHandlers<ReselectionCandidatesMisc> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

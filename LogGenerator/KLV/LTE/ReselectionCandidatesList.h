#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The candidates of the idle-mode reselection report, of any radio access technology, a row each.
class ReselectionCandidatesList final : public SectionDecoder<ReselectionCandidatesList> {
 public:
  static constexpr std::string_view sectionName = "Reselection Candidates List";
  static constexpr std::string_view traceLine = "Reselection Candidates List";
  static const PacketHandlers<ReselectionCandidatesList> handlers;

 private:
  void update(const Packet& packet);
};

}  // namespace varnel

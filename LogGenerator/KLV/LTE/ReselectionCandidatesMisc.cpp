#include "LogGenerator/KLV/LTE/ReselectionCandidatesMisc.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidates.h"

namespace varnel {

namespace {

constexpr Field servingCell[] = {
    {u8(13), "Version"},
    {u16(15), "Serving EARFCN"},
    {u16(17), "Serving Cell ID"},
};
static_assert(within(servingCell, reselectionCandidates::minimumSize));

}  // namespace

std::span<const PacketHandler<ReselectionCandidatesMisc>> ReselectionCandidatesMisc::handlers() {
  static constexpr PacketHandler<ReselectionCandidatesMisc> table[] = {
      {reselectionCandidates::logCode, reselectionCandidates::minimumSize,
       &ReselectionCandidatesMisc::update},
  };
  return table;
}

void ReselectionCandidatesMisc::update(const Packet& packet) { setFields(rows(), packet, servingCell); }

}  // namespace varnel

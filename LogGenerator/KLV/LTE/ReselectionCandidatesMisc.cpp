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

constinit const PacketHandlers<ReselectionCandidatesMisc> ReselectionCandidatesMisc::handlers = {
    {reselectionCandidates::logCode, reselectionCandidates::minimumSize, &ReselectionCandidatesMisc::update},
};

void ReselectionCandidatesMisc::update(const Packet& packet) { setFields(rows(), packet, servingCell); }

}  // namespace varnel

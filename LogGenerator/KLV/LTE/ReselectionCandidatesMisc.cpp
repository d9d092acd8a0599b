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

constexpr PacketHandler packets[] = {
    {reselectionCandidates::logCode, reselectionCandidates::minimumSize, servingCell},
};

}  // namespace

ReselectionCandidatesMisc::ReselectionCandidatesMisc()
    : SectionDecoder("Reselection Candidates", "Reselection Candidates", packets) {}

}  // namespace varnel

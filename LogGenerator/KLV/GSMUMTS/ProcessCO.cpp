#include "LogGenerator/KLV/GSMUMTS/ProcessCO.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/MobilityManagement.h"

namespace varnel {

namespace {

constexpr Field state[] = {
    {mmState::state, "MM State", entry(mmState::states)},
};

constexpr PacketHandler packets[] = {
    {mmState::logCode, mmState::minimumSize, state},
    {registration::logCode, registration::minimumSize, registration::serviceState},
};

}  // namespace

// Kept: the trace line of `ProcessCS`.
ProcessCO::ProcessCO() : SectionDecoder("Process CO", "ProcessCS", packets) {}

}  // namespace varnel

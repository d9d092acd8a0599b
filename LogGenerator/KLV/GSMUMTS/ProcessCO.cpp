#include "LogGenerator/KLV/GSMUMTS/ProcessCO.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/MobilityManagement.h"

namespace varnel {

namespace {

constexpr Field state[] = {
    {mmState::state, "MM State", entry(mmState::states)},
};
static_assert(within(state, mmState::minimumSize));

}  // namespace

constinit const PacketHandlers<ProcessCO> ProcessCO::handlers = {
    {mmState::logCode, mmState::minimumSize, &ProcessCO::updateState},
    {registration::logCode, registration::minimumSize, &ProcessCO::updateRegistration},
};

void ProcessCO::updateState(const Packet& packet) { setFields(rows(), packet, state); }

void ProcessCO::updateRegistration(const Packet& packet) {
  setFields(rows(), packet, registration::serviceState);
}

}  // namespace varnel

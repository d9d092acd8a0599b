#include "programs/varnel-telephonyd/simulation/UMTSCarrier.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

// The strongest cell's share of the power, and the smallest share that is reported.
constexpr std::int64_t bestEcN0_cdb = -4'00, worstEcN0_cdb = -24'00;

// Energies of parts of -1 dB, -2 dB, and so on, as they are reported in whole decibels. Each is half a
// decibel higher, so that rounding cannot change it.
constexpr std::int64_t energies[] = {467'272, 371'167, 294'829, 234'191, 186'024, 147'764, 117'373, 93'233,
                                     74'058,  58'826,  46'727,  37'117,  29'483,  23'419,  18'602,  14'776,
                                     11'737,  9'323,   7'406,   5'883,   4'673,   3'712,   2'948,   2'342};

std::int64_t strongest_cdbm(const Walk& walk) { return walk.cells(Access::UMTS).front().level_cdbm; }

}  // namespace

std::int64_t umtsRSSI_cdbm(const Walk& walk) { return strongest_cdbm(walk) - bestEcN0_cdb; }

std::int64_t umtsEcN0_cdb(const Walk& walk, const Cell& cell) {
  return std::max(walk.level_cdbm(cell) - umtsRSSI_cdbm(walk), worstEcN0_cdb);
}

std::int64_t umtsEnergy(std::int64_t ecN0_cdb) {
  const std::int64_t whole_db = -ecN0_cdb / 100;
  return energies[std::clamp<std::int64_t>(whole_db - 1, 0, std::ssize(energies) - 1)];
}

}  // namespace varnel::simulation

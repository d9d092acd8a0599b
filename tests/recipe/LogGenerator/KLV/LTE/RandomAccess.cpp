#include "LogGenerator/KLV/LTE/RandomAccess.h"

namespace varnel {

namespace {

constexpr std::string_view results[] = {"Success", "No Answer", "Aborted"};

// A step of the timing advance is 16 samples of 1/30.72 µs, there and back: 78.125 m of distance.
constexpr Field fields[] = {
    {u8(13), "Version"},
    {u8(14), "Preamble"},
    {u8(15), "Result", entry(results)},
    {bits(16, 0, 11), "Timing Advance"},
    {bits(16, 0, 11), "Distance", real("%.0f m", 78.125)},
};

constexpr PacketHandler packets[] = {
    {0xB168, 18, fields},
};

}  // namespace

RandomAccess::RandomAccess() : SectionDecoder("Random Access", "Random Access", packets) {}

}  // namespace varnel

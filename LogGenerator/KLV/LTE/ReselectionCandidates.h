#pragma once

#include <cstddef>
#include <cstdint>

namespace varnel {

/// The idle-mode reselection report, log code 0xB186: the serving cell, then the candidates.
namespace reselectionCandidates {

inline constexpr std::uint32_t logCode = 0xB186;
inline constexpr std::size_t minimumSize = 21;

}  // namespace reselectionCandidates

}  // namespace varnel

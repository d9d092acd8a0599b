#pragma once

#include <cstdint>
#include <string_view>

namespace varnel {

/// The log code of the telephony server's SIM files: a packet header, then a property list. Its root is a
/// dictionary of the card's elementary files (3GPP TS 31.102), each as a text.
inline constexpr std::uint32_t simFilesLogCode = 0xFF0000;

/// A file of the SIM card.
struct SimFile {
  std::string_view payloadKey;
  std::string_view entry;    ///< the section's entry that shows it
  bool namesPerson = false;  ///< it holds a number that only this person has
};

/// In the order of the section's entries.
inline constexpr SimFile simFiles[] = {
    {"kSimFile_ICCID", "EF-ICCID", true},
    {"kSimFile_MSISDN", "EF-MSISDN", true},
    {"kSimFile_MBDN", "EF-3GPP MAIL BOX DIALING NUMBER"},
    {"kSimFile_HPPLMN", "EF-HPPLMN SEARCH PERIOD"},
    {"kSimFile_LOCI", "EF-LOCI", true},
    {"kSimFile_PSLOCI", "EF-GPRS/PS-LOCI", true},
    {"kSimFile_ACC", "EF-ACCESS CONTROL CLASS"},
    {"kSimFile_AD", "EF-ADMINISTRATIVE DATA"},
    {"kSimFile_FPLMN", "EF-FPLMN"},
    {"kSimFile_AHPLMN", "EF-ACTING HPLMN"},
    {"kSimFile_RATMODE", "EF-RAT MODE"},
    {"kSimFile_PNN", "EF-PLMN NETWORK NAME"},
    {"kSimFile_OPL", "EF-OPERATOR PLMN LIST"},
    {"kSimFile_OPLMNAcT", "EF-OPLMNAcT"},
};

}  // namespace varnel

#include "programs/varnel-decode/MessageDissectors.h"

#include <algorithm>
#include <span>

namespace varnel {

namespace {

using Radio = AirMessage::Radio;
using Protocol = AirMessage::Protocol;

namespace gsmtap {
constexpr std::uint8_t aBis = 0x02, umtsRRC = 0x0C, lteRRC = 0x0D, lteNAS = 0x12;
constexpr std::uint8_t plain = 0, withSecurityHeader = 1;  // subtypes of lteNAS
}  // namespace gsmtap

// RRC messages of a channel, or of a type that stands by itself.
struct Row {
  std::string_view channelOrName;
  MessageDissector dissector;
};

constexpr Row lteRows[] = {
    {"BCCH-BCH", {"lte-rrc.bcch.bch", gsmtap::lteRRC, 4}},
    {"BCCH-DL-SCH", {"lte-rrc.bcch.dl.sch", gsmtap::lteRRC, 5}},
    {"MCCH", {"lte-rrc.mcch", gsmtap::lteRRC, 7}},
    {"PCCH", {"lte-rrc.pcch", gsmtap::lteRRC, 6}},
    {"DL-CCCH", {"lte-rrc.dl.ccch", gsmtap::lteRRC, 0}},
    {"DL-DCCH", {"lte-rrc.dl.dcch", gsmtap::lteRRC, 1}},
    {"UL-CCCH", {"lte-rrc.ul.ccch", gsmtap::lteRRC, 2}},
    {"UL-DCCH", {"lte-rrc.ul.dcch", gsmtap::lteRRC, 3}},
    {"BCCH-BCH-NB", {"lte-rrc.bcch.bch.nb", gsmtap::lteRRC, 18}},
    {"BCCH-DL-SCH-NB", {"lte-rrc.bcch.dl.sch.nb", gsmtap::lteRRC, 20}},
    {"PCCH-NB", {"lte-rrc.pcch.nb", gsmtap::lteRRC, 21}},
    {"DL-CCCH-NB", {"lte-rrc.dl.ccch.nb", gsmtap::lteRRC, 14}},
    {"DL-DCCH-NB", {"lte-rrc.dl.dcch.nb", gsmtap::lteRRC, 15}},
    {"UL-CCCH-NB", {"lte-rrc.ul.ccch.nb", gsmtap::lteRRC, 16}},
    {"UL-DCCH-NB", {"lte-rrc.ul.dcch.nb", gsmtap::lteRRC, 17}},
};

constexpr Row nrRows[] = {
    {"BCCH-BCH", {"nr-rrc.bcch.bch"}},
    {"BCCH-DL-SCH", {"nr-rrc.bcch.dl.sch"}},
    {"DL-CCCH", {"nr-rrc.dl.ccch"}},
    {"DL-DCCH", {"nr-rrc.dl.dcch"}},
    {"MCCH", {"nr-rrc.mcch"}},
    {"PCCH", {"nr-rrc.pcch"}},
    {"UL-CCCH", {"nr-rrc.ul.ccch"}},
    {"UL-CCCH1", {"nr-rrc.ul.ccch1"}},
    {"UL-DCCH", {"nr-rrc.ul.dcch"}},
    {"RRCReconfiguration", {"nr-rrc.rrc_reconf"}},
    // It has no dissector of its own; it is written as a message of this channel.
    {"RRCReconfigurationComplete", {"nr-rrc.ul.dcch"}},
    {"RadioBearerConfig", {"nr-rrc.radiobearerconfig"}},
    {"UE-MRDC-Capability", {"nr-rrc.ue_mrdc_cap"}},
    {"UE-NR-Capability", {"nr-rrc.ue_nr_cap"}},
};

constexpr Row umtsRows[] = {
    {"DL-DCCH", {"rrc.dl.dcch", gsmtap::umtsRRC, 0}},
    {"UL-DCCH", {"rrc.ul.dcch", gsmtap::umtsRRC, 1}},
    {"DL-CCCH", {"rrc.dl.ccch", gsmtap::umtsRRC, 2}},
    {"UL-CCCH", {"rrc.ul.ccch", gsmtap::umtsRRC, 3}},
    {"PCCH", {"rrc.pcch", gsmtap::umtsRRC, 4}},
    {"BCCH-FACH", {"rrc.bcch.fach", gsmtap::umtsRRC, 7}},
    {"BCCH-BCH", {"rrc.bcch.bch", gsmtap::umtsRRC, 8}},
    {"MCCH", {"rrc.mcch", gsmtap::umtsRRC, 9}},
    {"MSCH", {"rrc.msch", gsmtap::umtsRRC, 10}},
    {"System-Information-Container", {"rrc.sysinfo.cont", gsmtap::umtsRRC, 14}},
    {"MasterInformationBlock", {"rrc.si.mib", gsmtap::umtsRRC, 16}},
    {"SysInfoType1", {"rrc.si.sib1", gsmtap::umtsRRC, 17}},
    {"SysInfoType2", {"rrc.si.sib2", gsmtap::umtsRRC, 18}},
    {"SysInfoType3", {"rrc.si.sib3", gsmtap::umtsRRC, 19}},
    {"SysInfoType4", {"rrc.si.sib4", gsmtap::umtsRRC, 20}},
    {"SysInfoType5", {"rrc.si.sib5", gsmtap::umtsRRC, 21}},
    {"SysInfoType5bis", {"rrc.si.sib5bis", gsmtap::umtsRRC, 22}},
    {"SysInfoType6", {"rrc.si.sib6", gsmtap::umtsRRC, 23}},
    {"SysInfoType7", {"rrc.si.sib7", gsmtap::umtsRRC, 24}},
    {"SysInfoType8", {"rrc.si.sib8", gsmtap::umtsRRC, 25}},
    {"SysInfoType9", {"rrc.si.sib9", gsmtap::umtsRRC, 26}},
    {"SysInfoType10", {"rrc.si.sib10", gsmtap::umtsRRC, 27}},
    {"SysInfoType11", {"rrc.si.sib11", gsmtap::umtsRRC, 28}},
    {"SysInfoType11bis", {"rrc.si.sib11bis", gsmtap::umtsRRC, 29}},
    {"SysInfoType12", {"rrc.si.sib12", gsmtap::umtsRRC, 30}},
    {"SysInfoType13", {"rrc.si.sib13", gsmtap::umtsRRC, 31}},
    {"SysInfoType13-1", {"rrc.si.sib13-1", gsmtap::umtsRRC, 32}},
    {"SysInfoType13-2", {"rrc.si.sib13-2", gsmtap::umtsRRC, 33}},
    {"SysInfoType13-3", {"rrc.si.sib13-3", gsmtap::umtsRRC, 34}},
    {"SysInfoType13-4", {"rrc.si.sib13-4", gsmtap::umtsRRC, 35}},
    {"SysInfoType14", {"rrc.si.sib14", gsmtap::umtsRRC, 36}},
    {"SysInfoType15", {"rrc.si.sib15", gsmtap::umtsRRC, 37}},
    {"SysInfoType15-1", {"rrc.si.sib15-1", gsmtap::umtsRRC, 39}},
    {"SysInfoType15-2", {"rrc.si.sib15-2", gsmtap::umtsRRC, 41}},
    {"SysInfoType15-3", {"rrc.si.sib15-3", gsmtap::umtsRRC, 44}},
    {"SysInfoType15-4", {"rrc.si.sib15-4", gsmtap::umtsRRC, 46}},
    {"SysInfoType15-5", {"rrc.si.sib15-5", gsmtap::umtsRRC, 47}},
    {"SysInfoType16", {"rrc.si.sib16", gsmtap::umtsRRC, 51}},
    {"SysInfoType17", {"rrc.si.sib17", gsmtap::umtsRRC, 52}},
    {"SysInfoType18", {"rrc.si.sib18", gsmtap::umtsRRC, 53}},
    {"SysInfoType19", {"rrc.si.sib19", gsmtap::umtsRRC, 54}},
    {"SysInfoTypeSB1", {"rrc.si.sb1", gsmtap::umtsRRC, 58}},
    {"SysInfoTypeSB2", {"rrc.si.sb2", gsmtap::umtsRRC, 59}},
};

std::span<const Row> rrcRows(Radio radio) {
  switch (radio) {
    case Radio::LTE:
      return lteRows;
    case Radio::NR:
      return nrRows;
    case Radio::UMTS:
      return umtsRows;
    case Radio::GSM:
      break;
  }
  return {};
}

std::optional<MessageDissector> rrcDissector(const AirMessage& message) {
  const std::span rows = rrcRows(message.radio);
  const auto row =
      std::ranges::find(rows, message.channel.empty() ? message.name : message.channel, &Row::channelOrName);
  if (row == rows.end()) return std::nullopt;
  return row->dissector;
}

// TS 24.301 9.2: the first octet has the security header type of mobility messages in its upper half, and
// the discriminator in its lower half.
bool hasSecurityHeader(ByteView message) {
  constexpr std::uint8_t mobility = 7;
  return !message.empty() && (message[0] & 0xF) == mobility && message[0] >> 4 != 0;
}

bool isSessionMessage(ByteView message) {
  constexpr std::uint8_t sessionManagement = 2;
  return !message.empty() && (message[0] & 0xF) == sessionManagement;
}

// TS 24.501 9.2: a message begins with the discriminator.
bool beginsLikeNasOfNR(ByteView message) {
  return !message.empty() && (message[0] == 0x7E || message[0] == 0x2E);
}

std::optional<MessageDissector> nasDissector(const AirMessage& message) {
  switch (message.radio) {
    case Radio::LTE:
      // "nas-eps" takes the bearer identity of a session message for a security header.
      return MessageDissector{isSessionMessage(message.bytes) ? "nas-eps_plain" : "nas-eps", gsmtap::lteNAS,
                              hasSecurityHeader(message.bytes) ? gsmtap::withSecurityHeader : gsmtap::plain};
    case Radio::NR:
      if (!beginsLikeNasOfNR(message.bytes)) return std::nullopt;
      return MessageDissector{"nas-5gs"};
    case Radio::UMTS:
    case Radio::GSM:
      break;
  }
  return MessageDissector{"gsm_a_dtap", gsmtap::aBis};
}

}  // namespace

std::optional<MessageDissector> dissectorOf(const AirMessage& message) {
  switch (message.protocol) {
    case Protocol::RRC:
      return rrcDissector(message);
    case Protocol::NAS:
      return nasDissector(message);
    case Protocol::RR:
      break;
  }
  // A message on the random access channel is an access burst of 8 or 11 bits (TS 44.018 9.1.8).
  if (message.channel == "RACH" || message.channel.empty()) return std::nullopt;
  return MessageDissector{message.layer2Octets > 0 ? "gsm_a_ccch" : "gsm_a_dtap", gsmtap::aBis};
}

}  // namespace varnel

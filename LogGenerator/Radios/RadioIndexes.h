#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/Identities.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidatesMisc.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/Radios/GSM/GPRSInformation.h"
#include "LogGenerator/Radios/GSM/GSMServingCell.h"
#include "LogGenerator/Radios/GSM/GSMSet.h"
#include "LogGenerator/Radios/LTE/Bearers.h"
#include "LogGenerator/Radios/LTE/Carriers.h"
#include "LogGenerator/Radios/LTE/Connection.h"
#include "LogGenerator/Radios/LTE/Measurements.h"
#include "LogGenerator/Radios/LTE/Neighbors.h"
#include "LogGenerator/Radios/LTE/RandomAccess.h"
#include "LogGenerator/Radios/LTE/Registration.h"
#include "LogGenerator/Radios/LTE/ServingCell.h"
#include "LogGenerator/Radios/LTE/TransmitPower.h"
#include "LogGenerator/Radios/LastMessages.h"
#include "LogGenerator/Radios/MessageCounts.h"
#include "LogGenerator/Radios/MessageFeed.h"
#include "LogGenerator/Radios/Modem/OtherCells.h"
#include "LogGenerator/Radios/Modem/PositionSection.h"
#include "LogGenerator/Radios/Modem/Registration.h"
#include "LogGenerator/Radios/Modem/ServingCell.h"
#include "LogGenerator/Radios/NR/Cells.h"
#include "LogGenerator/Radios/NR/MasterInformation.h"
#include "LogGenerator/Radios/NR/Registration.h"
#include "LogGenerator/Radios/NR/ServingCell.h"
#include "LogGenerator/Radios/SubscriberFiles.h"
#include "LogGenerator/Radios/UMTS/ActiveSet.h"
#include "LogGenerator/Radios/UMTS/EquivalentPLMNs.h"
#include "LogGenerator/Radios/UMTS/UMTSRRInfo.h"
#include "LogGenerator/Radios/UMTS/UMTSSet.h"

namespace varnel::radios {

/// What the indexes of one subscription share. It must outlive them.
struct Shared {
  std::ostream& standardOutput;  ///< for their base class
  Identities identities;
  MessageFeed& messages;
  CellMonitorReader& cellMonitor;
  modem::ReportReader& modemReports;
};

/// What a modem tells without a diagnostic port.
class ModemIndex final : public ClassIndex {
 public:
  explicit ModemIndex(Shared& shared) : ClassIndex(shared.standardOutput), _shared(shared) {
    for (const modem::Radio& radio : modem::radios())
      _servingCells.push_back(create<modem::ServingCell>(radio, _shared.modemReports));
  }

 private:
  Shared& _shared;
  std::unique_ptr<modem::Registration> _registration = create<modem::Registration>(_shared.modemReports);
  std::vector<std::unique_ptr<modem::ServingCell>> _servingCells;
  std::unique_ptr<modem::OtherCells> _otherCells = create<modem::OtherCells>(_shared.modemReports);
  std::unique_ptr<modem::PositionSection> _position =
      create<modem::PositionSection>(_shared.modemReports, _shared.identities);
};

/// The LTE sections of all radios. 0xB186 has the layout of the LTE technology.
class LTEIndex final : public ClassIndex {
 public:
  explicit LTEIndex(Shared& shared) : ClassIndex(shared.standardOutput), _shared(shared) {}

 private:
  Shared& _shared;
  std::unique_ptr<lte::ServingCell> _servingCell =
      create<lte::ServingCell>(_shared.cellMonitor, _shared.modemReports);
  std::unique_ptr<lte::Measurements> _measurements = create<lte::Measurements>();
  std::unique_ptr<lte::Carriers> _carriers = create<lte::Carriers>();
  std::unique_ptr<lte::Neighbors> _neighbors = create<lte::Neighbors>(_shared.cellMonitor);
  std::unique_ptr<lte::Registration> _registration = create<lte::Registration>(_shared.identities);
  std::unique_ptr<lte::Connection> _connection = create<lte::Connection>(_shared.messages);
  std::unique_ptr<lte::Bearers> _bearers = create<lte::Bearers>();
  std::unique_ptr<lte::RandomAccess> _randomAccess = create<lte::RandomAccess>();
  std::unique_ptr<lte::TransmitPower> _transmitPower = create<lte::TransmitPower>();
  std::unique_ptr<ReselectionCandidatesMisc> _reselectionCandidates = create<ReselectionCandidatesMisc>();
  std::unique_ptr<ReselectionCandidatesList> _reselectionCandidatesList = create<ReselectionCandidatesList>();
};

/// The NR sections.
class NRIndex final : public ClassIndex {
 public:
  explicit NRIndex(Shared& shared) : ClassIndex(shared.standardOutput), _shared(shared) {}

 private:
  Shared& _shared;
  std::unique_ptr<nr::MasterInformation> _masterInformation = create<nr::MasterInformation>();
  std::unique_ptr<nr::ServingCell> _servingCell = create<nr::ServingCell>();
  std::unique_ptr<nr::Cells> _cells = create<nr::Cells>();
  std::unique_ptr<nr::Registration> _registration = create<nr::Registration>(_shared.identities);
};

/// The sections of other technologies whose decoders must show wrong values. These show the right ones.
class CorrectedIndex final : public ClassIndex {
 public:
  explicit CorrectedIndex(Shared& shared) : ClassIndex(shared.standardOutput), _shared(shared) {}

 private:
  Shared& _shared;
  std::unique_ptr<ActiveSet> _activeSet = create<ActiveSet>();
  std::unique_ptr<UMTSSet> _umtsSet = create<UMTSSet>(_shared.cellMonitor);
  std::unique_ptr<UMTSRRInfo> _umtsRRInfo = create<UMTSRRInfo>(_shared.cellMonitor);
  std::unique_ptr<EquivalentPLMNs> _equivalentPLMNs = create<EquivalentPLMNs>();
  std::unique_ptr<GSMServingCell> _gsmServingCell = create<GSMServingCell>(_shared.cellMonitor);
  std::unique_ptr<GSMSet> _gsmSet = create<GSMSet>();
  std::unique_ptr<GPRSInformation> _gprsInformation = create<GPRSInformation>();
};

/// The sections about the subscriber, which all radios share.
class SubscriberIndex final : public ClassIndex {
 public:
  explicit SubscriberIndex(Shared& shared) : ClassIndex(shared.standardOutput), _shared(shared) {}

 private:
  Shared& _shared;
  std::unique_ptr<SubscriberFiles> _files = create<SubscriberFiles>(_shared.identities);
  std::unique_ptr<PDPContextList> _contexts = create<PDPContextList>();
};

/// The messages of the air interface.
class MessagesIndex final : public ClassIndex {
 public:
  explicit MessagesIndex(Shared& shared) : ClassIndex(shared.standardOutput), _shared(shared) {}

 private:
  Shared& _shared;
  std::unique_ptr<LastMessages> _lastMessages = create<LastMessages>(_shared.messages);
  std::unique_ptr<MessageCounts> _counts = create<MessageCounts>(_shared.messages);
};

}  // namespace varnel::radios

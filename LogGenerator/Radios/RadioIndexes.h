#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidatesMisc.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/Radios/LTE/ServingCell.h"

namespace varnel::radios {

/// The LTE sections of all radios.
class LTEIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

 private:
  std::unique_ptr<lte::ServingCell> servingCell = create<lte::ServingCell>();
  std::unique_ptr<ReselectionCandidatesMisc> reselectionCandidates = create<ReselectionCandidatesMisc>();
  std::unique_ptr<ReselectionCandidatesList> reselectionCandidatesList = create<ReselectionCandidatesList>();
};

/// The NR sections.
class NRIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;
};

/// The sections of other technologies whose decoders must show wrong values. These show the right ones.
class CorrectedIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;
};

/// The sections about the subscriber, which all radios share.
class SubscriberIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

 private:
  std::unique_ptr<PDPContextList> contexts = create<PDPContextList>();
};

/// The messages of the air interface.
class MessagesIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;
};

}  // namespace varnel::radios

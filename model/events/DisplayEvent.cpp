#include "model/events/DisplayEvent.h"

namespace varnel {

std::string_view nameOf(EventKind kind) {
  switch (kind) {
    case EventKind::CellChange:
      return "cell change";
    case EventKind::Handover:
      return "handover";
    case EventKind::Registration:
      return "registration";
    case EventKind::LossOfService:
      return "loss of service";
    case EventKind::ReturnOfService:
      return "return of service";
    case EventKind::Connection:
      return "RRC connection";
    case EventKind::UnknownVersion:
      return "unknown version";
  }
  return "";
}

}  // namespace varnel

#include "programs/varnel-telephonyd/MessageCounts.h"

namespace varnel {

MessageCounts& MessageCounts::operator+=(const MessageCounts& other) {
  received += other.received;
  delivered += other.delivered;
  waiting += other.waiting;
  dropped += other.dropped;
  tooLong += other.tooLong;
  notAskedFor += other.notAskedFor;
  return *this;
}

std::string inWords(const MessageCounts& counts) {
  const std::string waiting = counts.waiting > 0 ? std::to_string(counts.waiting) + " waiting, " : "";
  return "messages: " + std::to_string(counts.received) + " received, " + std::to_string(counts.delivered) +
         " delivered, " + waiting + std::to_string(counts.dropped) + " dropped, " +
         std::to_string(counts.refused()) + " refused (" + std::to_string(counts.tooLong) +
         " too long for the channel, " + std::to_string(counts.notAskedFor) + " not asked for)";
}

}  // namespace varnel

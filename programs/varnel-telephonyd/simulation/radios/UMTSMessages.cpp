#include "programs/varnel-telephonyd/simulation/radios/UMTSMessages.h"

#include "programs/varnel-telephonyd/simulation/radios/PerWriter.h"

namespace varnel::simulation::umtsMessages {

namespace {

constexpr unsigned temporaryIdentityForCircuits = 1;

void putDigits(PerWriter& message, unsigned number, unsigned digits) {
  unsigned unit = 1;
  for (unsigned digit = 1; digit < digits; ++digit) unit *= 10;
  for (; unit > 0; unit /= 10) message.bits(4, number / unit % 10);
}

}  // namespace

Bytes paging(std::uint32_t temporaryIdentity) {
  constexpr unsigned conversation = 0, circuits = 0;
  return PerWriter()
      .bits(1, 0)
      .bits(1, 1)
      .absent(2)
      .bits(3, 0)  // one phone
      .bits(1, 0)
      .bits(3, conversation)
      .bits(1, circuits)
      .bits(3, temporaryIdentityForCircuits)
      .bits(32, temporaryIdentity)
      .finish();
}

Bytes connectionRequest(std::uint32_t temporaryIdentity, int countryCode, int networkCode, int area) {
  constexpr unsigned request = 1, conversation = 0;
  PerWriter message = PerWriter().absent(1).bits(2, request).absent(2);
  message.bits(3, temporaryIdentityForCircuits).bits(32, temporaryIdentity);
  putDigits(message, static_cast<unsigned>(countryCode), 3);
  message.bits(1, 0);  // two digits follow
  putDigits(message, static_cast<unsigned>(networkCode), 2);
  return message.bits(16, static_cast<unsigned>(area)).bits(5, conversation).bits(1, 0).finish();
}

Bytes connectionReleaseComplete() {
  constexpr unsigned releaseComplete = 17, transaction = 1;
  return PerWriter().absent(1).bits(5, releaseComplete).absent(2).bits(2, transaction).finish();
}

}  // namespace varnel::simulation::umtsMessages

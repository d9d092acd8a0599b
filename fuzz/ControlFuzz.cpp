#include <cstddef>
#include <cstdint>
#include <variant>

#include "fuzz/Require.h"
#include "host/ControlProtocol.h"

using namespace varnel;

// The input is what comes over the control socket: a request to the server, or the server's reply. Written
// again, either arrives as it was.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const ByteView bytes(data, size);
  if (const auto request = controlProtocol::readRequest(bytes)) {
    require(size <= controlProtocol::longestRequest, "no request is too long");
    const bool isNumber = request->speed == request->speed;
    if (isNumber && controlProtocol::writeRequest(*request).size() <= controlProtocol::longestRequest)
      require(controlProtocol::readRequest(controlProtocol::writeRequest(*request)) == request,
              "the same request");
  }
  if (const auto reply = controlProtocol::readReply(bytes)) {
    const auto* const status = std::get_if<ServerStatus>(&*reply);
    const bool isNumber = !status || status->speed == status->speed;
    if (isNumber)
      require(controlProtocol::readReply(controlProtocol::writeReply(*reply)) == reply, "the same reply");
  }
  return 0;
}

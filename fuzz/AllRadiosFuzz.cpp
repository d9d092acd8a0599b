#include "fuzz/GeneratorRun.h"
#include "platform/TelephonyService.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  return varnel::fuzzGenerator(varnel::technology::allRadios, {data, size});
}

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include "DecodingLoop.h"

// Without arguments: writes the names of the cases. With a name and a number: decodes that message this many
// times, for a program that counts instructions.
int main(int argumentCount, char** arguments) {
  using namespace varnel;
  if (argumentCount < 3) {
    for (const PacketCase& packetCase : packetCases()) std::puts(packetCase.name.c_str());
    return 0;
  }
  const auto found = std::ranges::find(packetCases(), std::string_view(arguments[1]), &PacketCase::name);
  if (found == packetCases().end()) {
    std::fprintf(stderr, "There is no case \"%s\"\n", arguments[1]);
    return 2;
  }
  DecodingLoop loop(*found);
  for (int left = std::atoi(arguments[2]); left > 0; --left) loop.decode();
  return 0;
}

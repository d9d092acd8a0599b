#include <cstdint>

#include "LogGenerator/Packet.h"
#include "base/Dictionary.h"
#include "base/Value.h"

// A program for gdb to stop in: it calls `stop` when every value stands.

namespace varnel {
namespace {

// The empty instruction keeps the compiler from removing the calls.
[[gnu::noinline]] void stop() { asm volatile(""); }

void makeValues() {
  const Value absent;
  const Value text("a \"quoted\" \\ line\nof \xC2\xB5s\xFF");
  const Value integer = Value::ofInteger(-5);
  const Value real = Value::ofReal(0.25);
  const Value truth = Value::ofBoolean(true);
  const Value date = Value::ofDate({86400 + 3661, 0});
  const Value dateBetweenSeconds = Value::ofDate({-1, 500});
  const Value data = Value::ofData({0x0A, 0xB0});
  const Value noData = Value::ofData({});
  const Value array = Value::ofArray({Value("first"), Value::ofInteger(2)});

  Dictionary section;
  section.set("Serving Cell", Value::ofDictionary());
  section.get("Serving Cell").dictionary()->setText("PCI", "7");
  section.setText("Band", "3");
  section.setText("Antennas", "1");
  section.setText("Serving", "yes");
  section.setText("Antennas", "2");
  const Dictionary empty;

  const std::uint8_t bytes[] = {1, 14, 0, 0x79, 0xB1, 0, 0, 0, 0, 0, 0, 0, 0, 4, 0xFE};
  const Packet packet(bytes);
  [[maybe_unused]] const Packet record = packet.from(12);
  [[maybe_unused]] const Packet nothing = packet.from(15);
  const std::uint8_t extraBytes[] = {0xFF, 0, 1, 1, 2, 0, 0, 0, 0, 0, 0, 0, 0};
  const Packet extra(extraBytes);
  stop();
}

}  // namespace
}  // namespace varnel

int main() { varnel::makeValues(); }

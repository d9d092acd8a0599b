#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstdlib>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "fuzz/MessageRules.h"
#include "fuzz/Require.h"

using namespace varnel;

namespace {

bool isSame(const Value& left, const Value& right);

bool isSameEntry(const Dictionary::Entry& left, const Dictionary::Entry& right) {
  return left.key == right.key && isSame(left.value, right.value);
}

std::int64_t microsecondsOf(const Date& date) {
  return std::int64_t{date.seconds} * 1'000'000 + date.microseconds;
}

// Dates may change by a microsecond.
bool isSame(const Value& left, const Value& right) {
  if (left.kind() != right.kind()) return false;
  switch (left.kind()) {
    case Value::Kind::String:
      return *left.string() == *right.string();
    case Value::Kind::Integer:
      return left.integer() == right.integer();
    case Value::Kind::Real:
      // Bit for bit, since a NaN is not equal to itself.
      return std::bit_cast<std::uint64_t>(*left.real()) == std::bit_cast<std::uint64_t>(*right.real());
    case Value::Kind::Boolean:
      return left.boolean() == right.boolean();
    case Value::Kind::Date:
      return std::abs(microsecondsOf(*left.date()) - microsecondsOf(*right.date())) <= 1;
    case Value::Kind::Data:
      return *left.data() == *right.data();
    case Value::Kind::Array:
      return std::ranges::equal(*left.array(), *right.array(), isSame);
    case Value::Kind::Dictionary:
      return std::ranges::equal(*left.dictionary(), *right.dictionary(), isSameEntry);
    case Value::Kind::Absent:
      return true;
  }
  return false;
}

}  // namespace

// The input is one property list. A list that was read can be written in its own encoding, and in every other
// encoding that holds its texts. The result can be read again.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto list = readPropertyList({data, size});
  if (!list) return 0;
  const auto binary = writeBinaryPropertyList(*list);
  require(binary.has_value(), "what could be read has a binary form");
  const auto again = readPropertyList(*binary, fileLimits);
  require(again.has_value(), "the binary form can be read");
  require(isSame(*list, *again), "the binary form reads as the same list");
  const auto xml = writeXmlPropertyList(*list);
  require(xml || holdsTextStrangeToXml(*list), "XML refuses only texts that it cannot hold");
  require(!xml || readPropertyList(*xml, fileLimits), "the XML form can be read");
  return 0;
}

#pragma once

#include <cstddef>
#include <cstdint>
#include <exception>
#include <map>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/PacketHandler.h"
#include "LogGenerator/Section.h"
#include "base/Value.h"

namespace varnel {

class Base;
class CodeDictionary;
class SectionFormats;

/// Section name → the decoder that owns that section.
using ClassDictionary = std::map<std::string_view, Base*>;

/// Declared for a record index at or past the record count. Nothing raises it.
class ArrayOutOfBoundsException : public std::exception {
 public:
  const char* what() const noexcept override { return "ArrayOutOfBoundsException"; }
};

/// The root of all section decoders: one decoder fills one named section of the display.
class Base {
 public:
  Base() = default;
  Base(const Base&) = delete;
  Base& operator=(const Base&) = delete;
  virtual ~Base() = default;

  /// Registers the decoder under its section name and under its log codes.
  void initWithDict_codeDict(ClassDictionary& classDict, CodeDictionary& codeDict);

  /// The section's key in the display template.
  virtual std::string_view getSectionName() const = 0;
  /// The log codes that the decoder wants, in order.
  virtual std::vector<std::uint32_t> getLogCodeArray() const = 0;
  /// Decodes one whole packet, header included, into the section.
  virtual void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) = 0;

  /// A handler for each log code of the array, for the index to call; empty when the decoder has its own
  /// `updateWithData_logCode`, which is then called instead.
  virtual std::span<const PacketHandler> handlers() const { return {}; }
  /// Decodes one whole packet by one of the handlers.
  virtual void decode(const Packet& /*packet*/, const PacketHandler& /*handler*/) {}
  /// Tells how the section's entries write numbers that have a unit or other texts around them.
  virtual void listNumberFormats(SectionFormats& /*formats*/) const {}

  /// Takes the section that the decoder fills from now on: a dictionary, or an array for a list section.
  void updateSectionRef(const Value& section);
  Section& section() { return sectionRef; }
  const Section& section() const { return sectionRef; }

  /// Linear energy → whole decibels, 0 down to −31.
  static std::int16_t lookUpECNO(std::uint32_t energy);

  /// How the elements of a list change: under the array lock.
  static void clearElementsInArray(Array& array);
  static void replaceArray_With(Array& array, Array elements);

 protected:
  /// The section, which has no container until a display is built around this decoder.
  Section sectionRef;

  void updateLogCodeDict(CodeDictionary& codeDict);
};

}  // namespace varnel

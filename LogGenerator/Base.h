#pragma once

#include <cstddef>
#include <cstdint>
#include <exception>
#include <map>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/MessageFate.h"
#include "LogGenerator/PacketHandler.h"
#include "LogGenerator/Section.h"
#include "base/Value.h"

namespace varnel {

class Base;
class CodeDictionary;
class SectionFormats;

/// Section name → the decoder that owns that section.
using ClassDictionary = std::map<std::string_view, Base*>;

/// Declared only, for a record index at or past the record count. Nothing raises it.
class ArrayOutOfBoundsException : public std::exception {
 public:
  const char* what() const noexcept override { return "ArrayOutOfBoundsException"; }
};

/// The base of all section decoders. A decoder fills one named section of the display.
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
  /// The log codes of the decoder, in order.
  virtual std::vector<std::uint32_t> getLogCodeArray() const = 0;
  /// Decodes one whole packet, header included, into the section. It is the last of three steps: the model's
  /// `updateWithData` passes a message on, the generator's frames it, and this one decodes the packet.
  virtual void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) = 0;

  /// The handlers, one per log code of the array. Empty for a decoder without a table: it gets its packets in
  /// `updateWithData_logCode`.
  virtual std::span<const PacketHandler> handlers() const { return {}; }
  /// Decodes one whole packet with one of the handlers.
  virtual void decode(const Packet& /*packet*/, const PacketHandler& /*handler*/) {}
  /// What becomes of a packet that has one of the decoder's log codes but no handler: it is decoded. A
  /// decoder of packets with versions may not know the version, or may find the packet too short. Decodes
  /// nothing.
  virtual MessageFate fateOf(const Packet& /*packet*/, std::uint32_t logCode) const {
    return {MessageFate::Outcome::Decoded, logCode};
  }
  /// A display is about to be made. A decoder whose entries age removes those that are too old.
  virtual void prepareDisplay(const Time& /*now*/) {}
  /// Adds the formats of the section's entries that write numbers with a unit or with other texts around
  /// them.
  virtual void listNumberFormats(SectionFormats& /*formats*/) const {}

  /// Sets the section that the decoder fills from now on: a dictionary, or an array for a list section.
  void updateSectionRef(const Value& section);
  Section& section() { return sectionRef; }
  const Section& section() const { return sectionRef; }

  /// Turns a linear energy into whole decibels, from 0 down to −31.
  static std::int16_t lookUpECNO(std::uint32_t energy);

  /// Change the elements of a list under the array lock.
  static void clearElementsInArray(Array& array);
  static void replaceArray_With(Array& array, Array elements);

 protected:
  /// The section. It has no container until a display is built with this decoder.
  Section sectionRef;

  void updateLogCodeDict(CodeDictionary& codeDict);
};

}  // namespace varnel

#pragma once

#include <cstddef>
#include <cstdint>
#include <exception>
#include <map>
#include <string_view>
#include <vector>

#include "LogGenerator/Packet.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel {

class Base;
class CodeDictionary;
class SectionFormats;

/// Section name → the decoder that owns that section.
using ClassDictionary = std::map<std::string_view, Base*>;

/// Declared for a record index at or past the record count; nothing raises it. It would end the program.
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
  /// The shortest packet of that log code, header included, that the decoder does not drop unread.
  virtual std::size_t minimumLength(std::uint32_t /*logCode*/) const { return 0; }
  /// Tells how the section's entries write numbers that have a unit or other texts around them.
  virtual void listNumberFormats(SectionFormats& /*formats*/) const {}
  /// Decodes one whole packet, header included, into the section.
  virtual void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) = 0;

  /// Takes the section that the decoder fills from now on: a dictionary, or an array for a list section.
  void updateSectionRef(const Value& section);

  /// Linear energy → whole decibels, 0 down to −31.
  static std::int16_t lookUpECNO(std::uint32_t energy);

 protected:
  /// The section; the absent value until a display is built around this decoder.
  Value sectionRef;

  /// The section as what the decoder takes it for. Without a section of that kind everything is decoded and
  /// logged as ever, into a container that nobody sees.
  Dictionary& rows() { return sectionRef.dictionary() ? *sectionRef.dictionary() : _unseenRows; }
  Array& list() { return sectionRef.array() ? *sectionRef.array() : _unseenList; }

  void updateLogCodeDict(CodeDictionary& codeDict);

  /// How a list section changes, under the array lock. The second one empties the array as well; who
  /// empties it before making the new rows lets these take the memory of the old ones.
  static void clearElementsInArray(Array& array);
  static void replaceArray_With(Array& array, Array elements);

 private:
  Dictionary _unseenRows;
  Array _unseenList;
};

}  // namespace varnel

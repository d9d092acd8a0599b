#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "base/Value.h"
#include "platform/Resources.h"

namespace varnel {

/// How good the level of a signal is, by a rule of thumb. No standard defines it.
enum class SignalLevel { Poor, Fair, Good, Excellent };

/// "poor", "fair", "good", or "excellent".
std::string_view nameOf(SignalLevel level);

/// What a row or a section of the display means. Texts are empty where there is nothing to say.
struct Explanation {
  /// Each level begins at its limit. A number above the highest reading is no reading of this kind.
  struct Limits {
    double fair, good, excellent, highest;
  };

  /// How good this number is. Nothing above the highest reading.
  static std::optional<SignalLevel> levelBy(const Limits& limits, double number);

  std::string meaning;           ///< whole sentences
  std::string unit;              ///< such as "dBm"
  std::string usual;             ///< which values are usual or possible
  std::string standard;          ///< where it is defined
  std::optional<Limits> limits;  ///< of rows that show a level

  /// All of this for a reader: a line each, which ends in a newline.
  std::string text() const;
};

/// The sentences and limits of the resource "Explanations".
///
/// An entry of the resource has the end of a path as its key: "RSRP", or "Beams/RSRP Rx0" where the row means
/// something else. The longest end that fits counts. "*" stands for a record of a list, or for a pilot, and
/// "**" for a name that only the messages of a modem tell.
class Explanations {
 public:
  explicit Explanations(const Resources& resources);

  /// What is under a path of the display. Numbers and selections of records do not matter, so
  /// "/Cells/0/RSRP",
  /// "/Cells[EARFCN 1300, PCI 16]/RSRP", and "Cells/RSRP" all mean the same. Nothing for a path that no entry
  /// fits, and without the resource.
  std::optional<Explanation> of(std::string_view path) const;
  /// The key of this entry; empty when there is none.
  std::string keyFor(std::string_view path) const;
  /// All keys.
  std::vector<std::string> keys() const;

  /// The limits of the level that a row shows. Nothing for a row that shows none.
  std::optional<Explanation::Limits> limitsOf(std::string_view path) const;
  /// How good the level is that a row shows. Nothing for a row that shows no level, or a number without its
  /// unit.
  std::optional<SignalLevel> levelOf(std::string_view path, std::string_view value,
                                     const EntryFormats& formats) const;
  /// The same for a number that was read already.
  std::optional<SignalLevel> levelOf(std::string_view path, double number, std::string_view unit) const;

 private:
  const Value* find(std::string_view path, std::string* key) const;
  std::optional<Explanation::Limits> limitsNamed(std::string_view name) const;

  Value _resource;
};

}  // namespace varnel

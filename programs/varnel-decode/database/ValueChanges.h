#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <functional>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "base/Time.h"
#include "base/Value.h"
#include "programs/varnel-decode/GenerationWriters.h"

namespace varnel {

/// A cell that a display showed. Channel and identity are the texts of the display.
struct ShownCell {
  std::string radio;     ///< "LTE", "NR", "UMTS", "GSM", "CDMA2000", or "CDMA2000 base station"
  std::string channel;   ///< the number of its channel
  std::string identity;  ///< physical cell identity, scrambling code, BSIC, pilot PN, or base station

  // NOLINTNEXTLINE(modernize-use-nullptr): the 0 that it sees is the compiler's own
  friend auto operator<=>(const ShownCell&, const ShownCell&) = default;
};

/// Gathers what changes from one display of a capture to the next. Takes a bounded amount of memory: what has
/// no room there is in a temporary file. Values beyond the bounds are left out, and `finish` tells it.
class ValueChanges final : public GenerationSink {
 public:
  static constexpr std::size_t mostPaths = 100'000, mostCells = 100'000, mostDisplays = 2'000'000;

  /// One display. Only displays in which a value changed are kept.
  struct Display {
    std::optional<Time> time;          ///< absent where the date is not known
    std::chrono::nanoseconds elapsed;  ///< since the first record
  };
  /// A value from a display on.
  struct Change {
    static constexpr std::uint32_t noText = UINT32_MAX;

    std::uint32_t display;  ///< counts from 0
    std::uint32_t offset;   ///< of the text in its chunk
    std::uint32_t size;     ///< of the text; `noText` when there is no value any more
  };
  /// Some of the changes, which came one after the other.
  struct Chunk {
    std::vector<std::vector<Change>> changes{};  ///< by path, in the order of the displays
    std::string texts{};

    std::string_view text(const Change& change) const {
      return std::string_view(texts).substr(change.offset, change.size);
    }
  };
  struct Path {
    std::string name;  ///< as users write it, "Section/Label"
    std::string unit;  ///< empty for none
    EntryFormats formats;
  };

  explicit ValueChanges(std::size_t largestChunk = std::size_t{32} << 20);
  ~ValueChanges() override;

  /// Call this before the first generation.
  void setFormats(NumberFormats formats) { _formats = std::move(formats); }
  void take(const Generation& generation) override;
  void finish(const std::string& inputName) override;

  const std::vector<Display>& displays() const { return _displays; }
  const std::vector<Path>& paths() const { return _paths; }
  const std::set<ShownCell>& cells() const { return _cells; }
  /// Calls the function with each chunk, in their order. Throws std::system_error when a temporary file
  /// cannot be read.
  void visit(const std::function<void(const Chunk& chunk)>& visitor);

 private:
  struct Node;

  void walk(Node& node, const Value& object);
  Node& child(Node& node, std::size_t position, std::string_view name);
  void see(Node& leaf, std::string_view text);
  void addChange(Node& leaf, std::optional<std::string_view> text);
  void seeCell(const Node& identity);
  static const Node* channelOf(const Node& identity, std::size_t radio);
  bool isSeenNow(const Node& identity, const Node& channel, std::size_t radio) const;
  std::optional<std::size_t> pathOf(Node& leaf);
  void spill();

  const std::size_t _largestChunk;
  NumberFormats _formats;
  std::unique_ptr<Node> _root;
  std::vector<Node*> _shown;        // leaves that have a value
  std::vector<Node*> _identities;   // leaves that tell which cell of a channel it is
  std::vector<std::string> _names;  // from the display down to the current node
  std::vector<Display> _displays;
  std::vector<Path> _paths;
  std::set<ShownCell> _cells;
  Chunk _chunk;
  std::size_t _chunkSize = 0;
  std::FILE* _earlier = nullptr;  // earlier chunks; null while there are none
  std::size_t _nodes = 0;
  std::uint32_t _now = 0;  // counts the displays that were taken
  bool _hasChanged = false;
  bool _isTooMuch = false;
};

}  // namespace varnel

#pragma once

#include <array>
#include <cstdint>
#include <istream>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace varnel {

/// Adds up the lines of `--stats --format json`.
class StatisticsSum {
 public:
  /// Adds each line of a report, which may itself be a sum. The name is for errors. Throws std::runtime_error
  /// at a line that is no such line; the sum is of no use then.
  void add(std::istream& report, const std::string& name);

  /// One line of JSON like those that were added, with the number of captures in "Captures".
  std::string asJson() const;

 private:
  // Received, decoded, too short, too long, unknown, of an unknown version.
  using Counts = std::array<std::uint64_t, 6>;
  // The log code; for messages without one the greatest number. Then the name.
  using Kind = std::pair<std::uint64_t, std::string>;
  // The numbers in it, so that 9 comes before 10; empty for the other versions. Then the text.
  using Version = std::pair<std::vector<std::uint64_t>, std::string>;
  struct Messages {
    Counts counts{};
    std::map<Version, std::uint64_t> versions{};
    std::uint64_t otherVersions = 0;
  };

  void addLine(const std::string& line);

  std::uint64_t _captures = 0;
  std::map<Kind, Messages> _messages;
  std::vector<std::pair<std::string, std::uint64_t>> _frames;  // in the order of the lines
  std::uint64_t _noiseBytes = 0;
  std::map<std::optional<std::uint64_t>, std::uint64_t> _cards;
  Counts _total{};
};

}  // namespace varnel

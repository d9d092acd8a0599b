#pragma once

#include <optional>
#include <string>
#include <vector>

namespace varnel {

/// Adds up what several runs have written about different captures. Parts that are databases are copied into
/// the database of this name, which is made when it is missing. The sum of all other parts, which are reports
/// of `--stats --format json`, goes to standard output. Returns the exit status: 0, 1 after a failure, or 2
/// after a mistake of the user. Standard error then has a line about it.
int mergeParts(const std::vector<std::string>& parts, const std::optional<std::string>& databasePath);

}  // namespace varnel

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <map>
#include <string>
#include <string_view>
#include <vector>

// docs/compatibility.md says what "Kept:" means.
namespace varnel {
namespace {

namespace fs = std::filesystem;

using Lines = std::vector<std::string>;

constexpr const char* folders[] = {"app",   "base",     "host",     "LogGenerator",
                                   "model", "platform", "programs", "widgets"};

constexpr std::string_view mark = "Kept:";
constexpr std::size_t linesAbove = 3;  // above an oddity, in which its mark may be

enum class Place { Text, Declaration };

struct Oddity {
  std::string_view wording;
  Place place;  // inside a string literal, or in the code around it
};

const std::vector<Oddity> oddities = {
    {"messsage", Place::Text},
    {"log generated", Place::Text},
    {"Deallocing", Place::Text},
    {"Neighbhor", Place::Text},
    {"class GSMNeighbhor", Place::Declaration},
    {"class UTRANNeighbhor", Place::Declaration},
    {"objCellChangeCounter =", Place::Declaration},
    {"is length is", Place::Text},
    {"ATTEMPING", Place::Text},
    {"MHzband", Place::Text},
    {"_ CONNECTION", Place::Text},
    {"_ REESTABLISHMENT", Place::Text},
    {"_ PROGRESS", Place::Text},
    // Successes that are logged as errors.
    {"Starting the display update timer", Place::Text},
    {"Created ports", Place::Text},
    {"Creating KLVLogGenerator2", Place::Text},
    {"Creating KLV_GSMLogGenerator", Place::Text},
    {"Creating LTELogGenerator", Place::Text},
    {"Created UTRANLogGenerator", Place::Text},
    {"Class Index: ", Place::Text},
};

struct LineParts {
  std::string code;
  std::string texts;  // the line's string literals, with their quotes
  std::string comment;
};

LineParts partsOf(const std::string& line) {
  LineParts parts;
  bool isInText = false;
  for (std::size_t i = 0; i < line.size(); ++i) {
    if (!isInText && line.compare(i, 2, "//") == 0) {
      parts.comment = line.substr(i);
      break;
    }
    const bool isQuote = line[i] == '"';
    (isInText || isQuote ? parts.texts : parts.code).push_back(line[i]);
    if (isInText && line[i] == '\\' && i + 1 < line.size()) {
      parts.texts.push_back(line[++i]);
    } else if (isQuote) {
      isInText = !isInText;
    }
  }
  return parts;
}

std::size_t indentation(const std::string& line) { return line.find_first_not_of(' '); }
bool isBlank(const std::string& line) { return indentation(line) == std::string::npos; }
bool isMarked(const std::string& line) { return partsOf(line).comment.find(mark) != std::string::npos; }
bool isComment(const std::string& line) {
  return !isBlank(line) && line.compare(indentation(line), 2, "//") == 0;
}

// Whether the mark is in the line, or in one of the few lines above it. A blank line ends the search.
bool isMarkedNearby(const Lines& lines, std::size_t at) {
  for (std::size_t i = 0; i <= linesAbove && i <= at && !isBlank(lines[at - i]); ++i)
    if (isMarked(lines[at - i])) return true;
  return false;
}

// Whether the mark is in the comment directly above the declaration whose braces enclose the line.
bool isInMarkedDeclaration(const Lines& lines, std::size_t at) {
  std::size_t opener = at;
  if (indentation(lines[at]) > 0)
    while (opener > 0 && (isBlank(lines[opener]) || indentation(lines[opener]) >= indentation(lines[at])))
      --opener;
  if (isMarked(lines[opener])) return true;
  while (opener > 0 && isComment(lines[opener - 1]))
    if (isMarked(lines[--opener])) return true;
  return false;
}

bool holds(const std::string& line, const Oddity& oddity) {
  if (line.starts_with("#include")) return false;
  const LineParts parts = partsOf(line);
  const std::string& part = oddity.place == Place::Text ? parts.texts : parts.code;
  return part.find(oddity.wording) != std::string::npos;
}

// The oddities without a mark, as "line number: wording".
std::vector<std::string> unmarkedOddities(const Lines& lines) {
  std::vector<std::string> found;
  for (std::size_t i = 0; i < lines.size(); ++i)
    for (const Oddity& oddity : oddities)
      if (holds(lines[i], oddity) && !isMarkedNearby(lines, i) && !isInMarkedDeclaration(lines, i))
        found.push_back(std::to_string(i + 1) + ": " + std::string(oddity.wording));
  return found;
}

// The number of rows for each file in the document's tables.
std::map<std::string, int> listedOddities(const Lines& document) {
  std::map<std::string, int> listed;
  for (const std::string& line : document) {
    constexpr std::string_view beginning = "| `";
    if (!line.starts_with(beginning)) continue;
    ++listed[line.substr(beginning.size(), line.find('`', beginning.size()) - beginning.size())];
  }
  return listed;
}

int markCount(const Lines& lines) {
  return static_cast<int>(std::count_if(lines.begin(), lines.end(), isMarked));
}

Lines readLines(const fs::path& path) {
  Lines lines;
  std::ifstream file(path);
  EXPECT_TRUE(file) << path;
  for (std::string line; std::getline(file, line);) lines.push_back(line);
  return lines;
}

std::map<std::string, Lines> sources() {
  const fs::path root = VARNEL_SOURCE_DIR;
  std::map<std::string, Lines> files;
  for (const char* folder : folders) {
    for (const auto& entry : fs::recursive_directory_iterator(root / folder)) {
      const std::string extension = entry.path().extension();
      if (extension == ".h" || extension == ".cpp")
        files[fs::relative(entry.path(), root)] = readLines(entry.path());
    }
  }
  return files;
}

TEST(Kept, EachKnownOddityHasItsMark) {
  const auto files = sources();
  EXPECT_GT(files.size(), 50u);
  for (const auto& [path, lines] : files)
    for (const std::string& found : unmarkedOddities(lines))
      ADD_FAILURE() << path << ":" << found << " has no \"Kept:\" comment";
}

TEST(Kept, TheDocumentListsEachMark) {
  const fs::path root = VARNEL_SOURCE_DIR;
  auto listed = listedOddities(readLines(root / "docs/compatibility.md"));
  for (const auto& [path, lines] : sources())
    EXPECT_EQ(listed[path], markCount(lines))
        << path << ": docs/compatibility.md and the \"Kept:\" comments differ";
  for (const auto& [path, count] : listed)
    EXPECT_TRUE(fs::exists(root / path)) << "docs/compatibility.md names " << path << ", which is not there";
}

TEST(Kept, AnOddityWithoutAMarkIsFound) {
  EXPECT_EQ(unmarkedOddities({"int a;", R"(  logError("no messsage");)"}),
            std::vector<std::string>{"2: messsage"});
  EXPECT_EQ(unmarkedOddities({"class GSMNeighbhorMeasurements {"}),
            std::vector<std::string>{"1: class GSMNeighbhor"});
}

TEST(Kept, AMarkOnTheLineOrRightAboveCounts) {
  EXPECT_TRUE(unmarkedOddities({R"(    "900 MHzband [9]",  // Kept: the blank is missing.)"}).empty());
  EXPECT_TRUE(unmarkedOddities({"// Kept: three s.", "if (a)", R"(  logError("no messsage");)"}).empty());
}

TEST(Kept, AMarkFartherAboveOrAboveABlankLineDoesNotCount) {
  EXPECT_EQ(
      unmarkedOddities({"// Kept: three s.", "a();", "b();", "c();", R"(logError("messsage");)"}).size(), 1u);
  EXPECT_EQ(unmarkedOddities({"// Kept: three s.", "", R"(logError("messsage");)"}).size(), 1u);
}

TEST(Kept, AMarkAboveTheDeclarationAroundTheLineCounts) {
  const Lines table = {"constexpr const char* names[] = {",
                       R"(    "A",)",
                       R"(    "B",)",
                       R"(    "C",)",
                       R"(    "D_ PROGRESS",)",
                       "};"};
  Lines marked = table;
  marked.insert(marked.begin(), {"// Kept: the blank", "// in one of the names."});
  EXPECT_TRUE(unmarkedOddities(marked).empty());

  Lines markOfAnother = table;
  markOfAnother.insert(markOfAnother.begin(), {"// Kept: another.", "constexpr int a = 1;"});
  EXPECT_EQ(unmarkedOddities(markOfAnother), std::vector<std::string>{"7: _ PROGRESS"});
}

TEST(Kept, CommentsIncludesAndUsesOfANameNeedNoMark) {
  EXPECT_TRUE(unmarkedOddities({R"(/// Writes "Deallocing ClassIndex".)",
                                R"(#include "LogGenerator/KLV/UTRAN/GSMNeighbhorMeasurements.h")",
                                "create<GSMNeighbhorMeasurements>();"})
                  .empty());
}

TEST(Kept, ATextInQuotesIsNoComment) {
  EXPECT_EQ(unmarkedOddities({R"x(log("\"// Kept: messsage");)x"}).size(), 1u);
  EXPECT_EQ(unmarkedOddities({R"(log("https://a", "messsage");)"}).size(), 1u);
}

TEST(Kept, RowsAndMarksAreCountedPerFile) {
  const auto listed =
      listedOddities({"| file | what |", "| --- | --- |", "| `a/B.h` | one |", "| `a/B.h` | two |"});
  EXPECT_EQ(listed, (std::map<std::string, int>{{"a/B.h", 2}}));
  EXPECT_EQ(markCount({"// Kept: one.", "int a;  // Kept: two.", R"(const char* b = "Kept:";)",
                       "// Kept as it is."}),
            2);
}

}  // namespace
}  // namespace varnel

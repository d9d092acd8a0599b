#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <sstream>
#include <string>
#include <vector>

#include "LogGenerator/KLV/LTE/RandomAccess.h"
#include "base/PropertyList.h"
#include "tests/support/PacketBuilder.h"

// The last chapter of docs/architecture.md shows the code that this program is built from.

namespace varnel {
namespace {

using testing::ElementsAre;

std::string contentsOf(const std::string& path) {
  std::ifstream file(VARNEL_SOURCE_DIR "/" + path, std::ios::binary);
  EXPECT_TRUE(file.is_open()) << path;
  return std::string(std::istreambuf_iterator<char>(file), {});
}

// The blocks of code of that language, in their order.
std::vector<std::string> blocks(const std::string& language) {
  std::istringstream document(contentsOf("docs/architecture.md"));
  std::vector<std::string> found;
  bool isInRecipe = false, isInBlock = false;
  for (std::string line; std::getline(document, line);) {
    if (line.starts_with("## ")) isInRecipe = line == "## Add a decoder in ten minutes";
    if (line == "```") isInBlock = false;
    if (isInBlock) found.back() += line + '\n';
    if (isInRecipe && line == "```" + language) {
      isInBlock = true;
      found.emplace_back();
    }
  }
  return found;
}

TEST(Recipe, ShowsTheDecoderAndTheTestThatAreCompiledHere) {
  EXPECT_THAT(blocks("cpp"),
              ElementsAre(contentsOf("tests/recipe/LogGenerator/KLV/LTE/RandomAccess.cpp"),
                          contentsOf("tests/recipe/tests/LogGenerator/KLV/LTE/RandomAccessTest.cpp")));
}

std::vector<std::string> keysOf(const Value& dictionary) {
  std::vector<std::string> keys;
  if (!dictionary.dictionary()) return keys;
  for (const auto& [key, value] : *dictionary.dictionary()) keys.push_back(key);
  return keys;
}

TEST(Recipe, ShowsATemplateWithTheSectionAndTheEntriesOfTheDecoder) {
  RandomAccess decoder;
  const Value section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  const Bytes packet = PacketBuilder(0xB168, 18).bytes();
  decoder.updateWithData_logCode(Packet(packet), 0xB168);

  const std::vector<std::string> templates = blocks("xml");
  ASSERT_EQ(templates.size(), 1u);
  const std::string text = "<plist version=\"1.0\"><dict>" + templates.front() + "</dict></plist>";
  const auto list = readPropertyList(Bytes(text.begin(), text.end()));
  ASSERT_TRUE(list) << text;
  EXPECT_THAT(keysOf(*list), ElementsAre("Random Access"));
  EXPECT_EQ(keysOf(list->dictionary()->get("Random Access")), keysOf(section));
}

}  // namespace
}  // namespace varnel

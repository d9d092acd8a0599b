#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>
#include <set>
#include <string>

namespace varnel {
namespace {

namespace fs = std::filesystem;

const fs::path root = VARNEL_SOURCE_DIR;

std::string contentsOf(const fs::path& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

// The parts of the text that the first group matches.
std::set<std::string> found(const std::string& text, const std::string& pattern) {
  std::set<std::string> parts;
  const std::regex expression(pattern);
  for (std::sregex_iterator match(text.begin(), text.end(), expression), end; match != end; ++match)
    parts.insert((*match)[1]);
  return parts;
}

// Width and height of a PNG picture, such as "360 640".
std::string sizeOf(const fs::path& picture) {
  const std::string bytes = contentsOf(picture);
  if (bytes.size() < 24) return "no picture";
  const auto number = [&](std::size_t at) {
    unsigned value = 0;
    for (std::size_t i = at; i < at + 4; ++i) value = value << 8 | static_cast<unsigned char>(bytes[i]);
    return std::to_string(value);
  };
  return number(16) + ' ' + number(20);
}

TEST(Pictures, ThoseOfTheReadmeAreThereAndNoOthers) {
  std::set<std::string> there;
  for (const auto& entry : fs::directory_iterator(root / "docs/pictures")) {
    const std::string extension = entry.path().extension();
    if (extension == ".png" || extension == ".svg") there.insert(entry.path().filename());
  }
  auto shown = found(contentsOf(root / "README.md"), "docs/pictures/([a-z-]+\\.(?:png|svg))");
  shown.merge(
      found(contentsOf(root / "packaging/org.varnel.Varnel.metainfo.xml"), "/pictures/([a-z-]+\\.png)"));
  EXPECT_EQ(there, shown);
}

TEST(Pictures, ThoseOfTheMetadataHaveTheSizesThatItTells) {
  const std::string metadata = contentsOf(root / "packaging/org.varnel.Varnel.metainfo.xml");
  const std::regex image("width=\"([0-9]+)\" height=\"([0-9]+)\">[^<]*/([a-z-]+\\.png)<");
  int images = 0;
  for (std::sregex_iterator match(metadata.begin(), metadata.end(), image), end; match != end;
       ++match, ++images) {
    const std::string told = (*match)[1].str() + ' ' + (*match)[2].str();
    EXPECT_EQ(sizeOf(root / "docs/pictures" / (*match)[3].str()), told) << (*match)[3];
  }
  EXPECT_GE(images, 3);
}

}  // namespace
}  // namespace varnel

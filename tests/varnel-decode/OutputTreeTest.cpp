#include "programs/varnel-decode/OutputTree.h"

#include <gmock/gmock.h>

#include <fstream>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using ::testing::HasSubstr;

TEST(OutputTree, KeepsTheTreeOfTheNames) {
  const OutputTree tree("out", ".json");
  EXPECT_EQ(tree.outputOf("monday/a.bin"), "out/monday/a.bin.json");
  EXPECT_EQ(tree.outputOf("./monday/../a.bin"), "out/a.bin.json");
  EXPECT_EQ(tree.outputOf("/data/a.bin"), "out/data/a.bin.json");
  EXPECT_EQ(tree.outputOf("-"), "out/-.json");
}

TEST(OutputTree, ANameThatLeadsOutOfTheFolderStaysInTheTree) {
  const std::string outside = (std::filesystem::current_path().parent_path() / "a.bin").string();
  EXPECT_EQ(OutputTree("out", ".json").outputOf("../a.bin"), "out" + outside + ".json");
  EXPECT_EQ(OutputTree("out", ".json").outputOf("/../../a.bin"), "out/a.bin.json");
}

TEST(OutputTree, TwoCapturesWithOneOutputClash) {
  const OutputTree tree("out", ".json");
  EXPECT_FALSE(tree.clash({"a", "b"}));
  EXPECT_EQ(tree.clash({"a", "b", "./a"}),
            "a and ./a would have the same output, out/a.json; decode one of them alone");
}

TEST(OutputTree, AnOutputThatIsACaptureClashes) {
  const TemporaryFolder folder;
  const std::string a = folder.file("a"), other = folder.file("out") + a + ".json";
  std::filesystem::create_directories(std::filesystem::path(other).parent_path());
  std::ofstream(a) << 'x';
  std::ofstream(other) << 'x';
  const OutputTree tree(folder.file("out"), ".json");
  EXPECT_FALSE(tree.clash({a}));
  EXPECT_EQ(tree.clash({a, other}),
            "the output of " + a + " would overwrite the capture " + other + "; name another folder");
}

TEST(OutputTree, OnlyAnOutputThatIsNewerCounts) {
  const TemporaryFolder folder;
  const std::string a = folder.file("a");
  const OutputTree tree(folder.file("out"), "");
  std::ofstream(a) << 'x';
  EXPECT_FALSE(tree.hasNewer(a)) << "there is none";
  const auto output = tree.outputOf(a);
  std::filesystem::create_directories(output.parent_path());
  std::ofstream(output) << 'x';
  const auto time = std::filesystem::last_write_time(a);
  std::filesystem::last_write_time(output, time);
  EXPECT_FALSE(tree.hasNewer(a)) << "of the same time";
  std::filesystem::last_write_time(output, time + std::chrono::microseconds(1));
  EXPECT_TRUE(tree.hasNewer(a));
}

TEST(OutputTree, TheFormatTellsTheEnding) {
  Options options;
  EXPECT_EQ(outputEnding(options), ".txt");
  options.writeDisplay = displayAsJson;
  EXPECT_EQ(outputEnding(options), ".json");
  options.output = Output::EveryDisplay;
  EXPECT_EQ(outputEnding(options), ".jsonl");
  options.output = Output::Events;
  options.eventFormat = EventFormat::Csv;
  EXPECT_EQ(outputEnding(options), ".csv");
}

}  // namespace
}  // namespace varnel

#include "host/RootedFiles.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

#include "tests/support/DictionaryOf.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::HasSubstr;

namespace fs = std::filesystem;

class RootedFilesTest : public testing::Test {
 protected:
  TemporaryFolder root;
  RootedFiles files{root.path()};
  const Value list = dictionaryOf({{"Description", "in the lift"}});
};

TEST_F(RootedFilesTest, FilesAndFoldersAreLookedUpUnderTheRoot) {
  EXPECT_FALSE(files.exists("/marker/a file"));
  fs::create_directories(root.path() / "marker");
  std::ofstream(root.file("marker/a file")) << "";
  EXPECT_TRUE(files.exists("/marker"));
  EXPECT_TRUE(files.exists("/marker/a file"));
}

TEST_F(RootedFilesTest, WhatStandsOnThisMachineDoesNotCount) { EXPECT_FALSE(files.exists("/tmp")); }

TEST_F(RootedFilesTest, APropertyListIsWrittenAsXmlUnderTheRootForItsOwnerAlone) {
  fs::create_directories(root.path() / "logs");
  ASSERT_TRUE(files.writePropertyList(list, "/logs/a.varnel").isDone());
  EXPECT_THAT(contentsOf(root.file("logs/a.varnel")),
              HasSubstr("<key>Description</key>\n\t<string>in the lift</string>"));
  EXPECT_EQ(fs::status(root.file("logs/a.varnel")).permissions(), fs::perms(0600));
}

TEST_F(RootedFilesTest, ALaterListTakesThePlaceOfTheWholeFile) {
  std::ofstream(root.file("a.varnel")) << std::string(10000, 'x');
  ASSERT_TRUE(files.writePropertyList(list, "/a.varnel").isDone());
  EXPECT_EQ(contentsOf(root.file("a.varnel")).find('x', 200), std::string::npos);
}

TEST_F(RootedFilesTest, WhereTheFileIsOnThisMachineIsToldAndWhetherItTookTheNameOfAnother) {
  const FileWriting first = files.writePropertyList(list, "/a.varnel");
  EXPECT_EQ(first.place, root.file("a.varnel"));
  EXPECT_FALSE(first.hasReplaced);
  EXPECT_TRUE(files.writePropertyList(list, "/a.varnel").hasReplaced);
}

TEST_F(RootedFilesTest, WhatXmlCannotHoldOfATextIsReplacedInTheFileOnly) {
  const Value odd = dictionaryOf({{"Description", "a\x01z"}});
  ASSERT_TRUE(files.writePropertyList(odd, "/a.varnel").isDone());
  EXPECT_THAT(contentsOf(root.file("a.varnel")), HasSubstr("<string>a\uFFFDz</string>"));
  EXPECT_EQ(*odd.dictionary()->get("Description").string(), "a\x01z");
}

TEST_F(RootedFilesTest, AListThatDoesNotFitLeavesTheEarlierOneAndAReason) {
  std::ofstream(root.file("a.varnel")) << "earlier";
  const FileSizeLimit limit(100);
  EXPECT_EQ(files.writePropertyList(list, "/a.varnel").failure, "File too large");
  EXPECT_EQ(contentsOf(root.file("a.varnel")), "earlier");
}

TEST_F(RootedFilesTest, NoFolderIsMade) {
  EXPECT_EQ(files.writePropertyList(list, "/missing/a.varnel").failure, "No such file or directory");
  EXPECT_FALSE(fs::exists(root.path() / "missing"));
}

TEST(RootedFilesOfTheWholeMachine, AFolderThatTakesNoFilesIsAnError) {
  // Nobody, not even root, can make a file there.
  EXPECT_FALSE(RootedFiles("/proc").writePropertyList(Value::ofDictionary(), "/a.varnel").isDone());
}

TEST_F(RootedFilesTest, WhatHasNoPropertyListFormIsNotWritten) {
  EXPECT_FALSE(files.writePropertyList(Value(), "/a.varnel").isDone());
  EXPECT_FALSE(fs::exists(root.path() / "a.varnel"));
}

}  // namespace
}  // namespace varnel

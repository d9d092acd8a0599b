#include "host/FileResources.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>

#include "base/Dictionary.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

std::string list(const std::string& text) {
  return "<plist version=\"1.0\"><string>" + text + "</string></plist>";
}

class FileResourcesTest : public testing::Test {
 protected:
  void write(const std::string& path, const std::string& text) const {
    std::filesystem::create_directories(std::filesystem::path(_folder.file(path)).parent_path());
    std::ofstream(_folder.file(path)) << text;
  }

  TemporaryFolder _folder;
  FileResources _resources{_folder.path()};
};

TEST_F(FileResourcesTest, ReadsAPropertyListByName) {
  write("LTE.plist", "<plist version=\"1.0\"><dict><key>a</key><string>b</string></dict></plist>");
  const Value list = _resources.propertyList("LTE");
  ASSERT_TRUE(list.dictionary());
  EXPECT_EQ(*list.dictionary()->get("a").string(), "b");
}

TEST_F(FileResourcesTest, WhatCannotBeReadIsAbsent) {
  write("Broken.plist", "<plist><dict>");
  write("Empty.plist", "");
  std::filesystem::create_directory(_folder.file("Folder.plist"));
  EXPECT_TRUE(_resources.propertyList("Broken").isAbsent());
  EXPECT_TRUE(_resources.propertyList("Empty").isAbsent());
  EXPECT_TRUE(_resources.propertyList("Folder").isAbsent());
  EXPECT_TRUE(_resources.propertyList("Missing").isAbsent());
}

TEST_F(FileResourcesTest, FindsAPropertyListByNameInAFolderBelow) {
  write("z/LTE.plist", list("z"));
  write("a/b/LTE.plist", list("a/b"));
  EXPECT_EQ(*_resources.propertyList("LTE").string(), "a/b");
  write("LTE.plist", list("top"));
  EXPECT_EQ(*_resources.propertyList("LTE").string(), "top");
}

TEST_F(FileResourcesTest, LinksInACircleAreNoPropertyLists) {
  std::filesystem::create_symlink("Circle.plist", _folder.file("Circle.plist"));
  write("b.plist", list("b"));
  EXPECT_THAT(_resources.propertyListPaths(), ElementsAre("b.plist"));
  EXPECT_TRUE(_resources.propertyList("Circle").isAbsent());
}

TEST_F(FileResourcesTest, ListsPropertyListsInNameOrder) {
  write("b.plist", "");
  write("a.plist", "");
  write("B.plist", "");
  write("sub/UTRAN.plist", "");
  write("readme.txt", "");
  std::filesystem::create_directory(_folder.file("Folder.plist"));
  EXPECT_THAT(_resources.propertyListPaths(),
              ElementsAre("B.plist", "a.plist", "b.plist", "sub/UTRAN.plist"));
}

TEST_F(FileResourcesTest, AMissingFolderHoldsNothing) {
  EXPECT_THAT(FileResources(_folder.file("missing")).propertyListPaths(), IsEmpty());
}

TEST(ResourceFolder, IsTheSourceTreesForAProgramOfTheBuildTree) {
  ::unsetenv("VARNEL_RESOURCES");
  EXPECT_THAT(FileResources(resourceFolder()).propertyListPaths(), Contains("LTE.plist"));
}

TEST(ResourceFolder, IsWhatTheEnvironmentNames) {
  ::setenv("VARNEL_RESOURCES", "/some/where", 1);
  EXPECT_EQ(resourceFolder(), "/some/where");
  ::unsetenv("VARNEL_RESOURCES");
}

TEST(ResourceFolder, AnEmptyNameIsNone) {
  ::setenv("VARNEL_RESOURCES", "", 1);
  EXPECT_THAT(FileResources(resourceFolder()).propertyListPaths(), Contains("LTE.plist"));
  ::unsetenv("VARNEL_RESOURCES");
}

TEST(ResourceFolder, AMissingOneIsAnErrorThatNamesItAndTheWayOut) {
  ::setenv("VARNEL_RESOURCES", "/some/where", 1);
  try {
    readableResourceFolder();
    ADD_FAILURE() << "no error";
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ(error.what(),
                 "cannot read the resource folder /some/where: No such file or directory; let "
                 "VARNEL_RESOURCES name the one that has LTE.plist in it");
  }
  ::unsetenv("VARNEL_RESOURCES");
}

TEST(ResourceFolder, OneThatIsThereIsPassedOn) {
  const TemporaryFolder folder;
  ::setenv("VARNEL_RESOURCES", folder.path().c_str(), 1);
  EXPECT_EQ(readableResourceFolder(), folder.path());
  ::unsetenv("VARNEL_RESOURCES");
}

}  // namespace
}  // namespace varnel

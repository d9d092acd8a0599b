#include "host/RecordingFile.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <fstream>
#include <memory>
#include <optional>
#include <string>

#include "tests/support/FileSizeLimit.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using enum ExistingRecording;

Bytes bytesOf(const std::string& text) { return {text.begin(), text.end()}; }

template <class Action>
std::string errorOf(Action action) {
  try {
    action();
  } catch (const std::runtime_error& error) {
    return error.what();
  }
  return "";
}

class Recording : public testing::Test {
 protected:
  std::string path(const std::string& name = "walk") const { return folder.file(name); }
  void put(const std::string& text) const { std::ofstream(path(), std::ios::binary) << text; }
  std::string whyNot(const std::string& name, ExistingRecording existing) const {
    return errorOf([&] { RecordingFile(path(name), existing); });
  }
  std::size_t files() const {
    return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder.path()), {}));
  }

  TemporaryFolder folder;
};

TEST_F(Recording, TheFileIsMadeWithTheFirstRecordForItsOwnerAlone) {
  RecordingFile recording(path(), Refused);
  EXPECT_FALSE(fs::exists(path()));
  recording.append(bytesOf("one"));
  EXPECT_EQ(contentsOf(path()), "one");
  EXPECT_EQ(fs::status(path()).permissions(), fs::perms(0600));
  recording.append(bytesOf("two"));
  EXPECT_EQ(contentsOf(path()), "onetwo");
}

TEST_F(Recording, AFileThatIsThereAndNotEmptyIsRefused) {
  put("last night's");
  EXPECT_EQ(whyNot("walk", Refused),
            path() + " is there already, and not empty; name another file, or replace it with --overwrite");
  EXPECT_EQ(contentsOf(path()), "last night's");
}

TEST_F(Recording, AnEmptyFileMayBeTaken) {
  put("");
  RecordingFile recording(path(), Refused);
  recording.append(bytesOf("one"));
  EXPECT_EQ(contentsOf(path()), "one");
}

TEST_F(Recording, AFileThatIsFilledMeanwhileStays) {
  put("");
  RecordingFile recording(path(), Refused);
  put("somebody else's");
  EXPECT_EQ(errorOf([&] { recording.append(bytesOf("one")); }),
            "cannot record to " + path() + ": File exists");
  EXPECT_EQ(contentsOf(path()), "somebody else's");
}

TEST_F(Recording, AFileThatIsMadeMeanwhileStays) {
  RecordingFile recording(path(), Replaced);
  put("somebody else's");
  EXPECT_EQ(errorOf([&] { recording.append(bytesOf("one")); }),
            "cannot record to " + path() + ": File exists");
  EXPECT_EQ(contentsOf(path()), "somebody else's");
}

TEST_F(Recording, AFileIsReplacedWithTheFirstRecordAndNotBefore) {
  put("last night's");
  ::chmod(path().c_str(), 0644);
  RecordingFile recording(path(), Replaced);
  EXPECT_EQ(contentsOf(path()), "last night's");
  recording.append(bytesOf("one"));
  EXPECT_EQ(contentsOf(path()), "one");
  EXPECT_EQ(fs::status(path()).permissions(), fs::perms(0600));
  EXPECT_EQ(files(), 1u);
}

TEST_F(Recording, AFirstRecordThatDoesNotFitLeavesTheFileThatWasThere) {
  put("last night's");
  RecordingFile recording(path(), Replaced);
  const FileSizeLimit limit(100);
  EXPECT_EQ(errorOf([&] { recording.append(Bytes(101, 'x')); }),
            "cannot record to " + path() + ": File too large");
  EXPECT_EQ(contentsOf(path()), "last night's");
  EXPECT_EQ(files(), 1u);
}

TEST_F(Recording, AFirstRecordThatDoesNotFitLeavesNoFile) {
  RecordingFile recording(path(), Refused);
  const FileSizeLimit limit(100);
  EXPECT_NE(errorOf([&] { recording.append(Bytes(101, 'x')); }), "");
  EXPECT_EQ(files(), 0u);
}

TEST_F(Recording, ARecordThatDoesNotFitLeavesTheWholeOnesBefore) {
  RecordingFile recording(path(), Refused);
  const FileSizeLimit limit(100);
  recording.append(Bytes(90, 'x'));
  EXPECT_EQ(errorOf([&] { recording.append(Bytes(20, 'y')); }),
            "cannot record to " + path() + ": File too large");
  EXPECT_EQ(contentsOf(path()), std::string(90, 'x'));
}

TEST_F(Recording, OneProcessAtATimeRecordsToAFile) {
  auto first = std::make_unique<RecordingFile>(path(), Refused);
  first->append(bytesOf("one"));
  const std::string refusal = "another process records to " + path() + "; name another file";
  EXPECT_EQ(whyNot("walk", Refused), refusal);
  EXPECT_EQ(whyNot("walk", Replaced), refusal);
  first.reset();
  EXPECT_EQ(whyNot("walk", Replaced), "");
}

TEST_F(Recording, WhoeverIsAboutToReplaceAFileIsAloneToo) {
  put("last night's");
  const RecordingFile first(path(), Replaced);
  EXPECT_EQ(whyNot("walk", Replaced), "another process records to " + path() + "; name another file");
}

TEST_F(Recording, NothingIsRecordedThroughALink) {
  put("last night's");
  fs::create_symlink("walk", path("link"));
  EXPECT_EQ(whyNot("link", Replaced),
            "cannot record to " + path("link") + ": it is a symbolic link; name the file that it leads to");
}

TEST_F(Recording, AFolderThatIsNotThereIsToldAtOnce) {
  EXPECT_EQ(whyNot("missing/walk", Refused),
            "cannot record to " + path("missing/walk") + ": No such file or directory");
}

TEST_F(Recording, APipeGetsTheRecordsAsTheyCome) {
  ASSERT_EQ(::mkfifo(path().c_str(), 0600), 0);
  const int reader = ::open(path().c_str(), O_RDONLY | O_NONBLOCK);
  RecordingFile recording(path(), Refused);
  recording.append(bytesOf("one"));
  recording.append(bytesOf("two"));
  char read[8] = "";
  EXPECT_EQ(::read(reader, read, sizeof read), 6);
  EXPECT_STREQ(read, "onetwo");
  ::close(reader);
}

}  // namespace
}  // namespace varnel

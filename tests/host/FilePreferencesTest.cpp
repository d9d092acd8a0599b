#include "host/FilePreferences.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <fstream>

#include "base/PropertyList.h"
#include "tests/support/Describe.h"
#include "tests/support/PrivateBus.h"
#include "tests/support/Process.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

namespace fs = std::filesystem;

const std::string domain = "com.orvane.dockhall";
const std::string key = "DHShowGSMRSSI";

class FilePreferencesTest : public testing::Test {
 protected:
  fs::path folder() const { return root.path() / "var/mobile/Library/Preferences"; }
  std::string file() const { return (folder() / "com.orvane.dockhall.plist").string(); }
  void writeFile(const std::string& text) const {
    fs::create_directories(folder());
    std::ofstream(file()) << text;
  }
  void setFalse() {
    preferences.set(domain, key, Value::ofBoolean(false));
    preferences.synchronise(domain);
  }
  std::string listOnDisk() const {
    const std::string text = contentsOf(file());
    const auto list = readPropertyList(Bytes(text.begin(), text.end()));
    return list ? described(*list) : "no property list";
  }

  RecordingLog log;
  TemporaryFolder root;
  FilePreferences preferences{root.path()};
};

TEST_F(FilePreferencesTest, MakesTheFolderAndAFileOfMode0600) {
  setFalse();
  EXPECT_EQ(listOnDisk(), "{DHShowGSMRSSI: false}");
  EXPECT_EQ(fs::status(file()).permissions(), fs::perms(0600));
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(FilePreferencesTest, WritesAnXmlPropertyList) {
  setFalse();
  EXPECT_THAT(contentsOf(file()), HasSubstr("<key>DHShowGSMRSSI</key>\n\t<false/>"));
}

TEST_F(FilePreferencesTest, NothingIsOnDiskBeforeItIsSynchronised) {
  preferences.set(domain, key, Value::ofBoolean(false));
  EXPECT_FALSE(fs::exists(folder()));
}

TEST_F(FilePreferencesTest, SynchronisingWhatNobodySetWritesNothing) {
  preferences.synchronise(domain);
  EXPECT_FALSE(fs::exists(folder()));
  setFalse();
  preferences.set("com.orvane.other", key, Value::ofBoolean(true));
  fs::remove(file());
  preferences.synchronise(domain);
  EXPECT_TRUE(fs::is_empty(folder()));
}

TEST_F(FilePreferencesTest, TheOtherKeysOfTheDomainStay) {
  writeFile(
      "<plist version=\"1.0\"><dict><key>DHOther</key><string>x</string><key>DHShowGSMRSSI</key><true/>"
      "<key>DHLast</key><integer>7</integer></dict></plist>");
  setFalse();
  EXPECT_EQ(listOnDisk(), "{DHOther: \"x\", DHShowGSMRSSI: false, DHLast: 7}");
}

TEST_F(FilePreferencesTest, ABinaryListIsReadToo) {
  Value list = Value::ofDictionary();
  list.dictionary()->set("DHOther", "x");
  const Bytes bytes = writeBinaryPropertyList(list).value();
  writeFile(std::string(bytes.begin(), bytes.end()));
  setFalse();
  EXPECT_EQ(listOnDisk(), "{DHOther: \"x\", DHShowGSMRSSI: false}");
}

TEST_F(FilePreferencesTest, AFileThatIsThereKeepsItsMode) {
  writeFile("<plist version=\"1.0\"><dict/></plist>");
  ::chmod(file().c_str(), 0644);
  setFalse();
  EXPECT_EQ(listOnDisk(), "{DHShowGSMRSSI: false}");
  EXPECT_EQ(fs::status(file()).permissions(), fs::perms(0644));
}

TEST_F(FilePreferencesTest, NothingIsWrittenThroughALink) {
  const std::string text = "<plist version=\"1.0\"><dict/></plist>";
  writeFile(text);
  fs::rename(file(), root.file("elsewhere.plist"));
  fs::create_symlink(root.file("elsewhere.plist"), file());
  setFalse();
  EXPECT_EQ(contentsOf(root.file("elsewhere.plist")), text);
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Unable to write preferences to " + file() +
                                           ": it is a symbolic link; name the file that it leads to"));
}

TEST_F(FilePreferencesTest, NoOtherFileIsLeftBehind) {
  setFalse();
  setFalse();
  EXPECT_EQ(std::distance(fs::directory_iterator(folder()), fs::directory_iterator()), 1);
}

TEST_F(FilePreferencesTest, AFileThatIsNoPropertyListIsOneErrorLineAndStays) {
  for (const char* text : {"no list", "", "<plist version=\"1.0\"><array/></plist>"}) {
    writeFile(text);
    setFalse();
    EXPECT_EQ(contentsOf(file()), text);
    EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Unable to write preferences to " + file() +
                                             ": what is there is no property list"));
  }
}

TEST_F(FilePreferencesTest, AFolderThatCannotBeMadeIsOneErrorLine) {
  std::ofstream(root.file("var")) << "a file in the way";
  setFalse();
  const auto lines = log.takeTexts();
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_THAT(lines[0], StartsWith("<3>Unable to write preferences to " + file() + ": "));
}

TEST_F(FilePreferencesTest, APipeInPlaceOfTheFileHoldsNothingUp) {
  fs::create_directories(folder());
  ASSERT_EQ(::mkfifo(file().c_str(), 0600), 0);
  setFalse();
  EXPECT_EQ(log.takeTexts().size(), 1u);
}

// A private bus, and a listener on it.
class PreferencesBus : public FilePreferencesTest {
 protected:
  void SetUp() override {
    ::unsetenv("XDG_RUNTIME_DIR");
    ::unsetenv("DBUS_SESSION_BUS_ADDRESS");
  }
  void TearDown() override { SetUp(); }

  std::string address() const { return bus.address(); }

  // Starts a listener that hears everything on the bus.
  bool startListening() {
    if (!bus.start()) return false;
    listener = std::make_unique<Process>(
        "/usr/bin/env", std::vector<std::string>{"dbus-monitor", "--address", address(),
                                                 "type='signal',interface='com.orvane.Preferences'"});
    // The listener first hears its own name.
    return eventually([&] { return listener->output().find("NameAcquired") != std::string::npos; });
  }
  std::size_t heard() const {
    std::size_t count = 0;
    const std::string text = listener->output();
    for (auto at = text.find("member=Changed"); at != std::string::npos;
         at = text.find("member=Changed", at + 1))
      ++count;
    return count;
  }

  PrivateBus bus;
  std::unique_ptr<Process> listener;
};

TEST_F(PreferencesBus, AChangeIsAnnouncedWithItsDomainAndKey) {
  ASSERT_TRUE(startListening()) << "dbus-daemon and dbus-monitor are needed";
  ::setenv("DBUS_SESSION_BUS_ADDRESS", address().c_str(), 1);
  preferences.notifyChanged(domain, key);
  ASSERT_TRUE(eventually([&] { return heard() == 1; })) << listener->output();
  EXPECT_THAT(listener->output(),
              HasSubstr("path=/com/orvane/Preferences; interface=com.orvane.Preferences; member=Changed\n"
                        "   string \"com.orvane.dockhall\"\n"
                        "   string \"DHShowGSMRSSI\"\n"));
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(PreferencesBus, EachChangeIsAnnounced) {
  ASSERT_TRUE(startListening()) << "dbus-daemon and dbus-monitor are needed";
  ::setenv("DBUS_SESSION_BUS_ADDRESS", address().c_str(), 1);
  preferences.notifyChanged(domain, key);
  preferences.notifyChanged(domain, key);
  EXPECT_TRUE(eventually([&] { return heard() == 2; })) << listener->output();
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(PreferencesBus, TheSocketOfTheRuntimeFolderIsTheBusToo) {
  ASSERT_TRUE(startListening()) << "dbus-daemon and dbus-monitor are needed";
  ::setenv("XDG_RUNTIME_DIR", bus.folder().c_str(), 1);
  preferences.notifyChanged(domain, key);
  EXPECT_TRUE(eventually([&] { return heard() == 1; })) << listener->output();
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(PreferencesBus, WithoutABusNothingHappens) {
  preferences.notifyChanged(domain, key);
  ::setenv("XDG_RUNTIME_DIR", root.path().c_str(), 1);
  preferences.notifyChanged(domain, key);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(PreferencesBus, ABusThatIsGoneIsOneErrorLine) {
  ::setenv("DBUS_SESSION_BUS_ADDRESS", address().c_str(), 1);
  preferences.notifyChanged(domain, key);
  const auto lines = log.takeTexts();
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_THAT(lines[0],
              StartsWith("<3>Unable to announce the change of com.orvane.dockhall on the session bus: "));
}

TEST_F(PreferencesBus, AnAddressThatIsNoneIsOneErrorLine) {
  ::setenv("DBUS_SESSION_BUS_ADDRESS", "somewhere", 1);
  preferences.notifyChanged(domain, key);
  EXPECT_EQ(log.takeTexts().size(), 1u);
}

TEST_F(PreferencesBus, ABusThatDoesNotAnswerHoldsNothingUp) {
  const int listening = ::socket(AF_UNIX, SOCK_STREAM, 0);
  sockaddr_un name{};
  name.sun_family = AF_UNIX;
  const std::string path = bus.folder() + "/bus";
  ASSERT_LT(path.size(), sizeof name.sun_path);
  path.copy(name.sun_path, path.size());
  ASSERT_EQ(::bind(listening, reinterpret_cast<const sockaddr*>(&name), sizeof name), 0);
  ASSERT_EQ(::listen(listening, 4), 0);
  ::setenv("DBUS_SESSION_BUS_ADDRESS", address().c_str(), 1);

  const auto begin = std::chrono::steady_clock::now();
  preferences.notifyChanged(domain, key);
  // Without its own time-out, a call would wait for 25 s.
  EXPECT_LT(std::chrono::steady_clock::now() - begin, 20s);
  EXPECT_EQ(log.takeTexts().size(), 1u);
  ::close(listening);
}

}  // namespace
}  // namespace varnel

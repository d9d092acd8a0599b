#include "host/ServiceManager.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "base/Log.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

class LastWarning final : public LogSink {
 public:
  LastWarning() { setLogSink(this, logWarningPriority); }
  LastWarning(const LastWarning&) = delete;
  LastWarning& operator=(const LastWarning&) = delete;
  ~LastWarning() override { setLogSink(nullptr, -1); }
  void write(int /*priority*/, std::string_view line) override { text = line; }

  std::string text;
};

class ServiceManager : public testing::Test {
 protected:
  void TearDown() override { ::unsetenv("NOTIFY_SOCKET"); }

  // What the service manager at the path is told; empty when it is told nothing.
  static std::string toldAt(const std::string& path, const std::string& name) {
    const RawSocket manager = RawSocket::receivingAt(path);
    ::setenv("NOTIFY_SOCKET", name.c_str(), 1);
    tellServiceManager("READY=1");
    const Bytes told = manager.receive(0ms);
    return {told.begin(), told.end()};
  }

  TemporaryFolder _folder;
  LastWarning _log;
};

TEST_F(ServiceManager, IsToldTheStateByADatagram) {
  EXPECT_EQ(toldAt(_folder.file("notify"), _folder.file("notify")), "READY=1");
  EXPECT_EQ(_log.text, "");
}

TEST_F(ServiceManager, CanHaveAnAbstractSocket) {
  const std::string name = "varnel-test-" + std::to_string(::getpid());
  EXPECT_EQ(toldAt('\0' + name, '@' + name), "READY=1");
}

TEST_F(ServiceManager, IsNotToldAnythingWhenThereIsNone) {
  tellServiceManager("READY=1");
  ::setenv("NOTIFY_SOCKET", "", 1);
  tellServiceManager("READY=1");
  EXPECT_EQ(_log.text, "");
}

TEST_F(ServiceManager, ThatCannotBeToldIsALogLine) {
  ::setenv("NOTIFY_SOCKET", _folder.file("missing").c_str(), 1);
  tellServiceManager("READY=1");
  EXPECT_EQ(_log.text, "The service manager cannot be told \"READY=1\": No such file or directory");
  for (const std::string& name : {std::string("relative"), std::string("/"), "/" + std::string(200, 'x')}) {
    ::setenv("NOTIFY_SOCKET", name.c_str(), 1);
    tellServiceManager("STOPPING=1");
    EXPECT_EQ(_log.text,
              "NOTIFY_SOCKET names no local socket: the service manager is not told \"STOPPING=1\"");
  }
}

}  // namespace
}  // namespace varnel

#include "host/TerminateHandler.h"

#include <gtest/gtest.h>

#include <csignal>
#include <functional>
#include <iostream>
#include <stdexcept>

#include "host/HostLog.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

// Calls a function that must not throw.
void call(const std::function<void()>& function) noexcept { function(); }

template <class Exception>
void endBy(const Exception& exception) {
  call([&] { throw exception; });
}

class TerminateHandlerDeathTest : public testing::Test {
 protected:
  void SetUp() override { testing::FLAGS_gtest_death_test_style = "threadsafe"; }
};

TEST_F(TerminateHandlerDeathTest, SaysWhatEndedTheProgramAndAborts) {
  EXPECT_EXIT(
      {
        installTerminateHandler("tester");
        endBy(std::runtime_error("a bad packet"));
      },
      testing::KilledBySignal(SIGABRT), "^tester: ended by a bad packet\n$");
}

TEST_F(TerminateHandlerDeathTest, SaysSoOfAnExceptionThatItDoesNotKnow) {
  EXPECT_EXIT(
      {
        installTerminateHandler("tester");
        endBy(42);
      },
      testing::KilledBySignal(SIGABRT), "^tester: ended by an unknown exception\n$");
}

TEST_F(TerminateHandlerDeathTest, LetsPendingLogLinesOut) {
  const auto die = [] {
    const TemporaryFolder folder;
    const RawSocket listener = RawSocket::receivingAt(folder.file("log"));
    const HostLog log(
        {.systemLogSocket = folder.file("log"), .writeSystemLog = [](int, const std::string& text) {
           std::this_thread::sleep_for(std::chrono::milliseconds(50));
           std::cerr << "written: " << text << std::endl;
         }});
    installTerminateHandler("tester");
    logError("one");
    logError("two");
    endBy(std::runtime_error("a bad packet"));
  };
  EXPECT_EXIT(die(), testing::KilledBySignal(SIGABRT), "written: one\nwritten: two\n");
}

}  // namespace
}  // namespace varnel

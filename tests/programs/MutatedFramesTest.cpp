#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "host/PortFrame.h"
#include "tests/support/FrameMutator.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

// Real programs on sockets whose other ends send frames as they should not be. VARNEL_SOAK_SECONDS in the
// environment makes the tests run that long; VARNEL_SOAK_PROGRAMS names the folder of another build's
// programs.

namespace varnel {
namespace {

using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;

const std::string serviceName = "com.orvane.TelephonyServer";
const std::string viewerPortName = "com.orvane.BasebandStateReport.LogChannel";
const std::string technologyRequest =
    plistOf("<dict><key>GetTechnology</key><string>GetTechnology</string></dict>");
const std::string startCommand = plistOf(
    "<dict><key>SetState</key><string>Streaming</string><key>SetKalviLogCodes</key><array><integer>45249"
    "</integer><integer>45439</integer></array><key>SetTkExtraCodes</key><array><integer>0</integer></array>"
    "</dict>");

const std::string statusRequest = plistOf("<dict><key>Command</key><string>Status</string></dict>");
const std::string seekRequest =
    plistOf("<dict><key>Command</key><string>Seek</string><key>Position</key><integer>1000</integer></dict>");

std::string channelRequest(const std::string& port) {
  return plistOf("<dict><key>Command</key><string>CreateLogChannel</string><key>PortName</key><string>" +
                 port + "</string></dict>");
}

std::string program(const std::string& name, const std::string& ofThisBuild) {
  const char* const folder = std::getenv("VARNEL_SOAK_PROGRAMS");
  return folder ? std::string(folder) + "/" + name + "/" + name : ofThisBuild;
}

class MutatedFrames : public testing::Test {
 protected:
  MutatedFrames() {
    const char* const seconds = std::getenv("VARNEL_SOAK_SECONDS");
    if (seconds) _end = Clock::now() + std::chrono::seconds(std::atol(seconds));
  }

  // True while another round is to be run.
  bool goesOn(std::size_t shortRun) const {
    return !HasFailure() && (_end ? Clock::now() < *_end : _rounds < shortRun);
  }
  std::string path(const std::string& name) const { return _folder.file(name); }

  // Sends the bytes in pieces of any size, as far as the peer takes them.
  bool sendInPieces(const RawSocket& socket, ByteView bytes) {
    while (!bytes.empty()) {
      const std::size_t size = std::min(bytes.size(), 1 + _mutator.below(200));
      if (!socket.sendNow(bytes.first(size))) return false;
      bytes = bytes.subspan(size);
    }
    return true;
  }

  // The reply's payload; nothing when there is none within the time.
  static std::optional<std::string> reply(const RawSocket& socket, std::chrono::milliseconds within) {
    const auto deadline = Clock::now() + within;
    FrameReader reader;
    while (Clock::now() < deadline) {
      const Bytes bytes = socket.receive(100ms);
      if (bytes.empty() && socket.waits(0ms)) return std::nullopt;  // the end
      reader.feed(bytes);
      while (const auto frame = reader.next()) {
        if (frame->mark == FrameMark::Reply) return std::string(frame->payload.begin(), frame->payload.end());
      }
    }
    return std::nullopt;
  }
  static std::optional<std::string> answer(const RawSocket& socket, const std::string& request) {
    Bytes bytes;
    appendFrame(bytes, {0, FrameMark::Request, viewOf(request)});
    if (!socket.sendNow(bytes)) return std::nullopt;
    return reply(socket, 60s);
  }

  static std::size_t residentKibibytes(pid_t process) {
    const std::string status = contentsOf("/proc/" + std::to_string(process) + "/status");
    const auto at = status.find("VmRSS:");
    return at == std::string::npos ? 0 : std::strtoul(status.c_str() + at + 6, nullptr, 10);
  }
  static std::ptrdiff_t openFiles(pid_t process) {
    const std::filesystem::directory_iterator files("/proc/" + std::to_string(process) + "/fd"), end;
    return std::distance(files, end);
  }
  static void expectNoSanitizersReport(const Process& process) {
    const std::string lines = process.error();
    EXPECT_EQ(lines.find("Sanitizer"), std::string::npos) << lines;
    EXPECT_EQ(lines.find("runtime error"), std::string::npos) << lines;
  }

  // A sanitizer keeps what was freed, which looks as if memory grew.
  const std::vector<std::string> _environment{"ASAN_OPTIONS=quarantine_size_mb=4:malloc_context_size=5"};
  static constexpr std::size_t mostGrowthKibibytes = 64 * 1024;

  TemporaryFolder _folder;
  FrameMutator _mutator{20260101};
  std::size_t _rounds = 0;
  std::optional<Clock::time_point> _end;
};

class MutatedFramesToTheServer : public MutatedFrames {
 protected:
  // One client of the service, who may stay.
  void attackService() {
    RawSocket client = RawSocket::connectedTo(path(serviceName));
    for (std::size_t frames = 1 + _mutator.below(8); frames > 0; --frames) {
      const auto mark = static_cast<FrameMark>(_mutator.below(5));
      const std::string request = channelRequest(_mutator.below(2) ? "nobody" : serviceName);
      if (!sendInPieces(
              client, _mutator.mutated({0, _mutator.below(3) ? FrameMark::Request : mark, viewOf(request)})))
        break;
    }
    if (_mutator.below(4) == 0) _staying.push_back(std::move(client));
    if (_staying.size() > 60) _staying.erase(_staying.begin());
  }

  // A log channel of its own, on whose ports everything is wrong.
  void attackChannel() {
    const std::string name = "port." + std::to_string(_rounds);
    const RawSocket port = RawSocket::listeningAt(path(name));
    if (const auto commands = openChannel(name)) {
      ++_channels;
      for (std::size_t frames = 1 + _mutator.below(8); frames > 0; --frames) {
        const std::string& command = _mutator.below(2) ? technologyRequest : startCommand;
        const auto mark = static_cast<FrameMark>(_mutator.below(3));
        if (!sendInPieces(*commands, _mutator.mutated({0, mark, viewOf(command)}))) break;
      }
      if (_mutator.below(2) == 0) commands->receive(10ms);
    }
    std::filesystem::remove(path(name));
  }

  // One program that controls the server, and may stay. It never asks the server to end.
  void attackControl() {
    RawSocket client = RawSocket::connectedTo(path(serviceName + ".Control"));
    for (std::size_t frames = 1 + _mutator.below(8); frames > 0; --frames)
      if (!sendInPieces(client, controlBytes())) break;
    if (_mutator.below(2) == 0) client.receive(10ms);
    if (_mutator.below(4) == 0) _controlling.push_back(std::move(client));
    if (_controlling.size() > 12) _controlling.erase(_controlling.begin());
  }

  // A request, one that is not whole, one with changes, or bytes of any value.
  Bytes controlBytes() {
    const std::string& request = _mutator.below(2) ? statusRequest : seekRequest;
    const Frame frame{0, FrameMark::Request, viewOf(request)};
    Bytes bytes;
    switch (_mutator.below(5)) {
      case 0:
        appendFrame(bytes, frame);
        break;
      case 1:
        appendFrame(bytes, frame);
        bytes.resize(1 + _mutator.below(bytes.size() - 1));
        break;
      case 2:
        bytes.resize(1 + _mutator.below(500));
        for (std::uint8_t& byte : bytes) byte = static_cast<std::uint8_t>(_mutator.below(256));
        break;
      default:
        return _mutator.mutated(frame);
    }
    return bytes;
  }

  // Who asks for the status as one should gets it.
  void expectControl() {
    const auto status = [this] {
      const RawSocket client = RawSocket::connectedTo(path(serviceName + ".Control"));
      return answer(client, statusRequest).value_or("");
    };
    // Connections that have ended can take a moment to close.
    EXPECT_TRUE(eventually([&] { return status().find("<key>Channels</key>") != std::string::npos; }));
  }

  // The server's port for commands; nothing when it made no channel, for many are still open.
  std::optional<RawSocket> openChannel(const std::string& port) {
    const RawSocket client = RawSocket::connectedTo(path(serviceName));
    const auto made = answer(client, channelRequest(port));
    if (!made) return std::nullopt;
    const std::string prefix = serviceName + ".LogChannel.";
    const auto at = made->find(prefix);
    if (at == std::string::npos) return std::nullopt;
    return RawSocket::connectedTo(path(made->substr(at, made->find('<', at) - at)));
  }

  // A viewer that does everything right gets its channel, its technology, and its messages.
  void expectService() {
    const RawSocket port = RawSocket::listeningAt(path(viewerPortName));
    std::optional<RawSocket> commands;
    // Channels of clients that have gone can take a second to close.
    ASSERT_TRUE(eventually([&] { return (commands = openChannel(viewerPortName)).has_value(); }));
    const RawSocket messages = port.accept();
    const auto technology = answer(*commands, technologyRequest);
    ASSERT_TRUE(technology);
    EXPECT_NE(technology->find("all-radios"), std::string::npos);
    Bytes start;
    appendFrame(start, {0, FrameMark::Message, viewOf(startCommand)});
    EXPECT_TRUE(commands->sendNow(start));
    EXPECT_FALSE(messages.receive().empty());
    std::filesystem::remove(path(viewerPortName));
  }

  std::vector<RawSocket> _staying, _controlling;
  std::size_t _channels = 0;  // that were attacked
};

TEST_F(MutatedFramesToTheServer, HarmNobody) {
  Process server(program("varnel-telephonyd", VARNEL_TELEPHONYD_PROGRAM),
                 {"--simulate", "all-radios", "--runtime-dir", _folder.path(), "--log-level", "-1"},
                 _environment);
  ASSERT_TRUE(eventually([&] { return server.error().find("serving") != std::string::npos; }))
      << server.error();
  const auto files = openFiles(server.id());
  std::size_t early = 0;
  for (; goesOn(400); ++_rounds) {
    switch (_mutator.below(6)) {
      case 0:
      case 1:
        attackChannel();
        break;
      case 2:
        attackControl();
        break;
      default:
        attackService();
    }
    if (_rounds % 100 == 99) {
      expectService();
      expectControl();
    }
    if (_rounds == 199) early = residentKibibytes(server.id());
  }
  _staying.clear();
  _controlling.clear();
  expectService();
  expectControl();
  EXPECT_GT(_channels, 0u);
  EXPECT_LT(residentKibibytes(server.id()), early + mostGrowthKibibytes) << "from " << early << " KiB";
  EXPECT_TRUE(eventually([&] { return openFiles(server.id()) <= files; })) << openFiles(server.id());
  RecordProperty("rounds", static_cast<int>(_rounds));
  std::printf("%zu rounds, %zu channels, from %zu to %zu KiB resident\n", _rounds, _channels, early,
              residentKibibytes(server.id()));
  server.signal(SIGTERM);
  ASSERT_TRUE(server.waitForEnd());
  EXPECT_EQ(server.exitStatus(), 0) << server.error();
  expectNoSanitizersReport(server);
}

class MutatedFramesToTheViewer : public MutatedFrames {
 protected:
  // What the viewer asks for may be answered as it should, and may not.
  Bytes answerTo(const std::string& payload) {
    const Frame frame{0, FrameMark::Reply, viewOf(payload)};
    if (_mutator.below(3) == 0) return _mutator.mutated(frame);
    Bytes bytes;
    appendFrame(bytes, frame);
    return bytes;
  }

  // A server's whole life with one viewer. Messages have log codes that no decoder knows; those that decoders
  // know are the matter of other tests.
  void serveOnce() {
    const RawSocket service = RawSocket::listeningAt(path(serviceName));
    const RawSocket commands = RawSocket::listeningAt(path("commands"));
    if (service.waits(60s)) {
      const RawSocket viewer = service.accept();
      viewer.receive(1s);
      sendInPieces(viewer, answerTo(plistOf("<dict><key>Error</key><integer>0</integer><key>PortName</key>"
                                            "<string>commands</string></dict>")));
      if (commands.waits(1s)) flood(commands.accept());
    }
    for (const std::string& name : {serviceName, std::string("commands")})
      std::filesystem::remove(path(name));
  }

  void flood(const RawSocket& commands) {
    commands.receive(1s);
    sendInPieces(commands,
                 answerTo(plistOf("<dict><key>GetTechnology</key><string>all-radios</string></dict>")));
    commands.receive(100ms);
    if (!std::filesystem::exists(path(viewerPortName))) return;
    const RawSocket messages = RawSocket::connectedTo(path(viewerPortName));
    ++_floods;
    for (std::size_t frames = _mutator.below(200); frames > 0; --frames) {
      const Bytes payload(_mutator.below(300), 0xEE);
      Bytes bytes = _mutator.mutatedHeader({0, FrameMark::Message, payload});
      if (_mutator.below(20) != 0) {
        bytes.clear();
        appendFrame(bytes, {static_cast<std::int32_t>(_mutator.below(3)), FrameMark::Message, payload});
      }
      if (!sendInPieces(messages, bytes)) return;
    }
  }

  std::size_t _floods = 0;  // of the viewer's port for messages
};

TEST_F(MutatedFramesToTheViewer, HarmNobody) {
  Process viewer(program("varnel", VARNEL_PROGRAM),
                 {"--ui", "text", "--runtime-dir", _folder.path(), "--device-root", _folder.path()},
                 _environment);
  std::size_t early = 0;
  for (; goesOn(4); ++_rounds) {
    serveOnce();
    if (_rounds == 3) early = residentKibibytes(viewer.id());
  }
  EXPECT_GT(_floods, 0u);
  EXPECT_LT(residentKibibytes(viewer.id()), early + mostGrowthKibibytes) << "from " << early << " KiB";
  std::printf("%zu rounds, %zu floods, from %zu to %zu KiB resident\n", _rounds, _floods, early,
              residentKibibytes(viewer.id()));
  viewer.signal(SIGTERM);
  ASSERT_TRUE(viewer.waitForEnd());
  EXPECT_EQ(viewer.exitStatus(), 0) << viewer.error();
  expectNoSanitizersReport(viewer);
}

}  // namespace
}  // namespace varnel

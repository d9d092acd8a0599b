#include <zlib.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "app/Snapshot.h"
#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "fuzz/FuzzHost.h"
#include "fuzz/InputSteps.h"
#include "host/PortFrame.h"
#include "host/captures/FrameEncoding.h"
#include "host/captures/PcapEncoders.h"
#include "host/captures/StreamEncoders.h"
#include "platform/ModemReport.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "programs/varnel-telephonyd/simulation/pty/SimulatedPort.h"
#include "tests/support/FakeQueue.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;

// The same limits as in `longest_input` of ./dev.
constexpr std::size_t largestPlay = 768, largestFile = 4096;
constexpr std::uint64_t walks = 6;
constexpr int messagesOfAWalk = 1500;
constexpr std::size_t examplesOfACode = 2;

struct Technology {
  std::string_view identifier;
  const char* target;
};
constexpr Technology technologies[] = {
    {technology::ifxGSM, "GSMFuzz"},        {technology::kalviGSMUMTS, "GSMUMTSFuzz"},
    {technology::kalviCDMA, "C2KFuzz"},     {technology::kalviLTE, "LTEFuzz"},
    {technology::kalviUTRAN2, "UTRANFuzz"}, {technology::allRadios, "AllRadiosFuzz"},
};

// The seeds of one target, numbered per kind.
class SeedFolder {
 public:
  SeedFolder(const fs::path& root, const char* target, std::size_t largest = largestFile)
      : _folder(root / target), _largest(largest) {
    fs::create_directories(_folder);
  }

  std::size_t largest() const { return _largest; }

  void add(const std::string& kind, ByteView seed) {
    if (seed.empty() || seed.size() > _largest) return;
    const fs::path path = _folder / (kind + "-" + std::to_string(++_counts[kind]));
    std::ofstream file(path, std::ios::binary);
    file.write(reinterpret_cast<const char*>(seed.data()), static_cast<std::streamsize>(seed.size()));
    if (!file.flush()) throw std::runtime_error("cannot write " + path.string());
  }

 private:
  fs::path _folder;
  std::size_t _largest;
  std::map<std::string, int> _counts;
};

std::vector<SimulatedMessage> walk(std::string_view technology, std::uint64_t seed) {
  const auto modem = simulatedModem(technology, seed);
  std::vector<SimulatedMessage> messages;
  while (messages.size() < messagesOfAWalk) messages.push_back(modem->next());
  return messages;
}

// The kind of a message: its log type and code, and whether it has a prefix.
unsigned kindOf(ByteView message) {
  const bool hasPrefix = message[0] == 0x81;
  if (hasPrefix) message = message.subspan(2);
  return unsigned{hasPrefix} << 24U | unsigned{message[0]} << 16U | message[3] | unsigned{message[4]} << 8U;
}

// A property list, alone or after the header of a packet, in its shorter encoding. Any other message
// unchanged.
Bytes compact(const Bytes& message) {
  constexpr std::size_t headerSize = 13;
  const std::size_t start = message[0] == 0xFF ? headerSize : 0;
  const auto list = readPropertyList(ByteView(message).subspan(start));
  const auto binary = list ? writeBinaryPropertyList(*list) : std::nullopt;
  if (!binary || binary->size() > message.size() - start) return message;
  Bytes shorter(message.begin(), message.begin() + static_cast<std::ptrdiff_t>(start));
  shorter.insert(shorter.end(), binary->begin(), binary->end());
  return shorter;
}

// As many of the messages as fit into an input, with displays and saves now and then.
Bytes inputOf(const std::vector<SimulatedMessage>& messages, std::size_t first, std::size_t largest) {
  Bytes input;
  int steps = 0;
  for (std::size_t i = first; i < messages.size(); ++i) {
    const Bytes message = compact(messages[i].bytes);
    if (input.size() + stepHeaderSize + message.size() > largest) break;
    ++steps;
    std::uint8_t after = steps % 4 == 0 ? Generate : 0;
    if (steps % 8 == 0) after |= Save;
    if (steps % 16 == 0) after |= Reconnect;
    appendStep(input, {after, message});
  }
  return input;
}

void makeGeneratorSeeds(SeedFolder& folder, std::string_view technology) {
  std::map<unsigned, std::size_t> examples;
  for (std::uint64_t seed = 1; seed <= walks; ++seed) {
    const auto messages = walk(technology, seed);
    for (const SimulatedMessage& message : messages) {
      const std::size_t example = examples[kindOf(message.bytes)]++;
      if (example >= examplesOfACode) continue;
      Bytes input;
      appendStep(input, {Generate | Save, example == 0 ? compact(message.bytes) : message.bytes});
      folder.add("message", input);
    }
    for (std::size_t first = 0; first < messages.size(); first += messages.size() / 3)
      folder.add("walk", inputOf(messages, first, folder.largest()));
  }
}

// Records of the server that no simulated modem sends: a report with cells of all radios, one with a
// position, and one of another version.
void makeReportSeeds(SeedFolder& folder) {
  const auto number = [](const Value& entries, std::string_view key, double amount) {
    const auto whole = static_cast<std::int64_t>(amount);
    entries.dictionary()->set(
        key, static_cast<double>(whole) == amount ? Value::ofInteger(whole) : Value::ofReal(amount));
  };
  const auto cell = [&](std::string_view radio, std::string_view type,
                        std::initializer_list<std::pair<std::string_view, double>> numbers) {
    Value made = Value::ofDictionary();
    made.dictionary()->set(modemReport::radioAccessTechnology, radio);
    made.dictionary()->set(modemReport::cellType, type);
    for (const auto& [key, amount] : numbers) number(made, key, amount);
    return made;
  };
  const auto add = [&](double version, Dictionary::Entry entry) {
    const Value report = Value::ofDictionary();
    number(report, modemReport::versionKey, version);
    report.dictionary()->set(entry.key, entry.value);
    Bytes message{0xFF, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0, 0, 0};
    const Bytes payload = writeBinaryPropertyList(report).value();
    message.insert(message.end(), payload.begin(), payload.end());
    Bytes input;
    appendStep(input, {Generate, message});
    folder.add("report", input);
  };
  using namespace modemReport;
  add(1,
      {cells, Value::ofArray({cell(lte, serving, {{earfcn, 5230}, {physicalCellIdentity, 17}, {rsrp, -97.5}}),
                              cell(nr, neighbor, {{nrArfcn, 632628}, {bandwidth, 100000}, {sinr, 3}})})});
  add(1, {cells, Value::ofArray({cell(umts, serving, {{uarfcn, 10588}, {scramblingCode, 5}, {ecIo, -7.5}}),
                                 cell(gsm, neighbor, {{arfcn, 20}, {baseStationIdentityCode, 9}})})});
  Value place = Value::ofDictionary();
  number(place, latitude, 52.5);
  number(place, longitude, -13.25);
  place.dictionary()->set(modemReport::time, Value::ofDate({817063200, 0}));
  add(1, {position, place});
  add(1, {accessTechnologies, Value::ofArray({"LTE", "5GNR"})});
  add(2, {registrationState, Value::ofInteger(1)});
}

Bytes bytesOf(CaptureEncoder& encoder, const std::vector<SimulatedMessage>& messages) {
  constexpr std::size_t most = 12, longest = 400;
  const ByteView beginning = encoder.beginning();
  Bytes bytes(beginning.begin(), beginning.end());
  std::uint8_t second = 0;
  for (const SimulatedMessage& message : messages) {
    if (message.bytes.size() > longest) continue;
    const auto subscription = static_cast<std::uint8_t>(1 + second % 2);
    const ByteView more =
        encoder.encode({{1'709'301'909 + ++second, 500}, Dating::Known, message.bytes, subscription});
    bytes.insert(bytes.end(), more.begin(), more.end());
    if (second == most) break;
  }
  return bytes;
}

Bytes joined(std::initializer_list<ByteView> parts) {
  Bytes whole;
  for (const ByteView part : parts) whole.insert(whole.end(), part.begin(), part.end());
  return whole;
}

// Each record in a frame with a length instead of a checksum.
Bytes lengthFramed(ByteView records) {
  Bytes frames;
  while (records.size() >= 2) {
    const ByteView record = records.first(records[0] | std::size_t{records[1]} << 8);
    const std::size_t size = record.size() + 4;
    const Bytes header{0x7E,
                       0x01,
                       static_cast<std::uint8_t>(size),
                       static_cast<std::uint8_t>(size >> 8),
                       0x10,
                       0x00,
                       record[0],
                       record[1]};
    frames = joined({frames, header, record, Bytes{0x7E}});
    records = records.subspan(record.size());
  }
  return frames;
}

// The bytes before the frames of a phone's own log file. The flag says whether the frames have checksums.
Bytes logFileHeader(std::uint8_t flag) { return {10, 0, 0, 0, 1, flag, 0, 0, 0, 0}; }

// The version report, then an interval that has lost its first byte.
Bytes binaryLog(ByteView records) {
  constexpr std::string_view name = "EXECUTABLE_NAME";
  constexpr std::ptrdiff_t nameOffset = 23;
  Bytes bytes(161);
  std::copy(name.begin(), name.end(), bytes.begin() + nameOffset);
  bytes[0] = 161;
  bytes[2] = 0xFD;
  bytes[3] = 0x1F;
  bytes[12] = bytes[14] = 1;
  bool isFirst = true;
  while (records.size() >= 2) {
    const ByteView record = records.first(records[0] | std::size_t{records[1]} << 8);
    if (!isFirst) bytes.push_back(1);
    bytes = joined({bytes, record});
    isFirst = false;
    records = records.subspan(record.size());
  }
  return bytes;
}

Bytes packed(const Bytes& bytes) {
  constexpr int gzipFormat = 16 + MAX_WBITS, memoryLevel = 8;
  z_stream stream{};
  if (::deflateInit2(&stream, Z_BEST_COMPRESSION, Z_DEFLATED, gzipFormat, memoryLevel, Z_DEFAULT_STRATEGY) !=
      Z_OK)
    throw std::runtime_error("cannot pack");
  Bytes input = bytes, result(::deflateBound(&stream, bytes.size()));
  stream.next_in = input.data();
  stream.avail_in = static_cast<uInt>(input.size());
  stream.next_out = result.data();
  stream.avail_out = static_cast<uInt>(result.size());
  const int status = ::deflate(&stream, Z_FINISH);
  result.resize(stream.total_out);
  ::deflateEnd(&stream);
  if (status != Z_STREAM_END) throw std::runtime_error("cannot pack");
  return result;
}

// A capture of every kind.
void makeCaptureSeeds(SeedFolder& folder) {
  for (const Technology& technology : technologies) {
    const auto messages = walk(technology.identifier, 1);
    PcapWriter pcap;
    PcapngWriter pcapng{std::string(technology.identifier)};
    folder.add("pcap", bytesOf(pcap, messages));
    folder.add("pcapng", bytesOf(pcapng, messages));
    if (technology.identifier == technology::ifxGSM) continue;  // its messages are no log records
    FramedWriter framed;
    RecordStreamWriter records;
    const Bytes frames = bytesOf(framed, messages), stream = bytesOf(records, messages);
    const Bytes lengthFrames = lengthFramed(stream);
    folder.add("framed", frames);
    folder.add("records", stream);
    folder.add("length-framed", lengthFrames);
    folder.add("log-file", joined({logFileHeader(1), frames}));
    folder.add("log-file", joined({logFileHeader(0), lengthFrames}));
    folder.add("binary-log", binaryLog(stream));
    folder.add("gzip", packed(frames));
  }
  // pcapng: section header, interface of link type 147 with nanoseconds, one packet of four bytes.
  constexpr std::uint8_t pcapng[] = {
      0x0A, 0x0D, 0x0D, 0x0A, 28, 0, 0, 0, 0x4D, 0x3C, 0x2B, 0x1A, 1,  0, 0, 0, 0xFF, 0xFF, 0xFF, 0xFF,
      0xFF, 0xFF, 0xFF, 0xFF, 28, 0, 0, 0, 1,    0,    0,    0,    32, 0, 0, 0, 147,  0,    0,    0,
      0,    0,    0,    0,    9,  0, 1, 0, 9,    0,    0,    0,    0,  0, 0, 0, 32,   0,    0,    0,
      6,    0,    0,    0,    36, 0, 0, 0, 0,    0,    0,    0,    1,  0, 0, 0, 2,    0,    0,    0,
      4,    0,    0,    0,    4,  0, 0, 0, 1,    2,    3,    4,    36, 0, 0, 0};
  folder.add("pcapng", ByteView(pcapng));
}

void makeFrameSeeds(SeedFolder& folder) {
  for (const Technology& technology : technologies) {
    Bytes stream{16};
    std::int32_t identifier = 0;
    for (const SimulatedMessage& message : walk(technology.identifier, 1)) {
      if (message.bytes.size() > 300) continue;
      appendFrame(stream, {identifier, static_cast<FrameMark>(identifier % 5), message.bytes});
      if (++identifier == 6) break;
    }
    folder.add("frames", stream);
  }
}

// Talks of a server with a simulated modem, first bytes as `PortSessionFuzz` reads them. The answers come as
// contents of frames, as frames, or as messages of a device that is no serial line.
class PortTalk {
 public:
  enum class Form { Contents, Frames, Messages };

  PortTalk(std::string_view technology, Form form)
      : _form(form),
        _port({.modem = simulatedModem(technology, 1),
               .queue = _queue,
               .uptime = [this] { return _queue.now(); },
               .now =
                   [this] {
                     return Time{1'709'301'909 + _queue.now() / 1s, 0};
                   },
               .send = [this](ByteView frame) { return answer(frame); },
               .build = "simulated"}) {
    _input.push_back(form == Form::Messages ? 1 : 0);
    for (const Bytes& request :
         {portRequest::version(), portRequest::build(), portRequest::eventsOff(), portRequest::debugTextOff(),
          portRequest::allCodesOff(), portRequest::codeNumbers()})
      ask(request, 0);
    const Bytes wanted{0xC0, 0xB0, 0x2F, 0x51};
    appendStep(_input, {wantOthers, wanted});
    CodeMask mask{.count = codesOfEquipment, .bits = Bytes(codesOfEquipment / 8, 0xFF)};
    for (const std::size_t equipment : {5, 11}) {
      // The server's mask is shorter; the answer tells only its status.
      _longestAnswer = logConfiguration::setEquipmentOffset + 4;
      ask(portRequest::setCodes(equipment, mask), 0);
      _longestAnswer = longest;
    }
    _queue.advance(20s);
    for (const Bytes& request :
         {portRequest::eventsOff(), portRequest::allCodesOff(), portRequest::debugTextOff()})
      ask(request, end);
  }

  const Bytes& input() const { return _input; }

 private:
  static constexpr std::uint8_t wantOthers = 2, end = 4, areContents = 8;
  static constexpr std::size_t longest = 300, mostBytes = 3000;

  void ask(const Bytes& request, std::uint8_t after) {
    _after = after;
    Bytes frame;
    appendFramed(frame, request);
    _port.take(frame);
    _after = 0;
  }
  bool answer(ByteView frame) {
    LeftOut ignored;
    FrameStream stream(ignored);
    stream.take(frame, [&](std::span<std::uint8_t> whole) {
      const ByteView contents = ByteView(whole).first(std::min(whole.size(), _longestAnswer));
      if (whole.size() > longest && _longestAnswer == longest) return;
      if (_input.size() > mostBytes) return;
      if (_form == Form::Contents)
        return appendStep(_input, {static_cast<std::uint8_t>(areContents | _after), contents});
      Bytes bytes;
      appendFramed(bytes, contents);
      if (_form == Form::Messages)
        bytes = joined({Bytes{32, 0, 0, 0, 1, 0, 0, 0, static_cast<std::uint8_t>(bytes.size()),
                              static_cast<std::uint8_t>(bytes.size() >> 8), 0, 0},
                        bytes});
      appendStep(_input, {_after, bytes});
    });
    return true;
  }

  const Form _form;
  FakeQueue _queue;
  SimulatedPort _port;
  std::uint8_t _after = 0;
  std::size_t _longestAnswer = longest;
  Bytes _input;
};

void makePortSeeds(SeedFolder& folder) {
  using Form = PortTalk::Form;
  for (const Technology& technology : technologies) {
    if (technology.identifier == technology::ifxGSM) continue;  // its messages are no log records
    for (const Form form : {Form::Contents, Form::Frames, Form::Messages})
      folder.add("talk", PortTalk(technology.identifier, form).input());
  }
  // A port for AT commands, and one that answers nothing.
  const std::string text = "\r\nERROR\r\n";
  Bytes spoken{0}, silent{0};
  for (int second = 0; second < 5; ++second) {
    appendStep(spoken, {1, Bytes(text.begin(), text.end())});
    appendStep(silent, {1, {}});
  }
  folder.add("text", spoken);
  folder.add("silence", silent);
}

void addInBothEncodings(SeedFolder& folder, const std::string& kind, const Value& list) {
  folder.add(kind, writeXmlPropertyList(list).value());
  folder.add(kind, writeBinaryPropertyList(list).value());
}

void makeCommandSeeds(SeedFolder& folder, FuzzHost& host) {
  const Value request = Value::ofDictionary();
  request.dictionary()->set("GetTechnology", "GetTechnology");
  addInBothEncodings(folder, "technology", request);
  for (const Technology& technology : technologies) {
    const auto services = host.services(host.shipped);
    const auto generator = LogGenerator::generatorFromTechnology(technology.identifier, services);
    addInBothEncodings(folder, "start", generator->getStartCommand());
  }
}

// One value of each kind, and values that are hard to write.
Value oneOfEachKind() {
  Value list = Value::ofDictionary();
  Dictionary& entries = *list.dictionary();
  entries.set("text", "a <b> & \"c\" \xC3\xA9 \xE2\x82\xAC \xF0\x9F\x93\xB6\r\n\t");
  entries.set("whole", Value::ofInteger(-9000000000));
  entries.set("real", Value::ofReal(-103.25));
  entries.set("truth", Value::ofBoolean(true));
  entries.set("date", Value::ofDate({-86400, 250000}));
  entries.set("data", Value::ofData({0, 1, 254, 255}));
  entries.set("list", Value::ofArray({"one", Value::ofArray(), Value::ofDictionary(), ""}));
  return list;
}

void makePropertyListSeeds(SeedFolder& folder) {
  addInBothEncodings(folder, "kinds", oneOfEachKind());
  for (const Technology& technology : technologies) {
    int payloads = 0;
    for (const SimulatedMessage& message : walk(technology.identifier, 1)) {
      if (technology.identifier == technology::ifxGSM) {
        folder.add("object", compact(message.bytes));
        break;
      }
      if (message.bytes[0] != 0xFF) continue;
      folder.add("payload", ByteView(message.bytes).subspan(13));
      if (++payloads == 6) break;
    }
  }
}

void makeResourceSeeds(SeedFolder& folder, const ShippedResources& shipped) {
  for (const std::string& path : shipped.propertyListPaths()) {
    const Value list = shipped.propertyList(path.substr(0, path.rfind('.')));
    addInBothEncodings(folder, "shipped", list);
    // Lists that are larger than an input: their sections one by one.
    for (const auto& [key, value] : *list.dictionary()) {
      Value part = Value::ofDictionary();
      part.dictionary()->set(key, value);
      folder.add("section", writeBinaryPropertyList(part).value());
    }
  }
}

// What a viewer saves after some messages.
Value snapshotOf(std::string_view technology, const Services& services) {
  const auto generator = LogGenerator::generatorFromTechnology(technology, services);
  Dictionary state;
  int count = 0;
  for (const SimulatedMessage& message : walk(technology, 1)) {
    generator->updateState_withData(state, message.bytes);
    if (++count == 8) break;
  }
  generator->generateLogUsingState(state);
  return snapshotContents(services.clock.now(), generator->getSaveContentsFromState(state), "by the lake");
}

// Two displays with contents that are hard to show, one of them without a date, and a binary log.
Value smallSnapshot() {
  Value list = oneOfEachKind();
  Dictionary& entries = *list.dictionary();
  const Value first = Value::ofDictionary();
  first.dictionary()->set("Display", list.deepCopy());
  first.dictionary()->set("Date", "2024-03-01 14:05:11 +0000");
  const Value cell = Value::ofDictionary();
  cell.dictionary()->set("_sorted", "");
  cell.dictionary()->set("2;Level", "-85.5 dBm");
  cell.dictionary()->set("1;Code, \"long\"", "0x1F");
  const Value second = Value::ofDictionary();
  second.dictionary()->set("Display", Value::ofArray({cell}));
  const Value log = Value::ofDictionary();
  log.dictionary()->set("DLF", Value::ofData({0, 1, 2}));
  entries.set("Timestamp", "2024-03-01 14:05:14 +0000");
  entries.set("Data", Value::ofArray({second, first, log, "text"}));
  return list;
}

void makeSnapshotSeeds(SeedFolder& folder, FuzzHost& host) {
  addInBothEncodings(folder, "small", smallSnapshot());
  for (const Technology& technology : technologies)
    addInBothEncodings(folder, "saved", snapshotOf(technology.identifier, host.services(host.shipped)));
}

void makePreferencesSeeds(SeedFolder& folder) {
  Value list = oneOfEachKind();
  addInBothEncodings(folder, "preferences", list);
  list.dictionary()->set("DHShowGSMRSSI", Value::ofBoolean(true));
  addInBothEncodings(folder, "preferences", list);
}

void makeSeeds(const fs::path& root) {
  FuzzHost host;
  for (const Technology& technology : technologies) {
    const bool sendsPictures = technology.identifier == technology::ifxGSM;
    SeedFolder folder(root, technology.target, sendsPictures ? largestFile : largestPlay);
    makeGeneratorSeeds(folder, technology.identifier);
    if (technology.identifier == technology::allRadios) makeReportSeeds(folder);
  }
  SeedFolder captures(root, "CaptureFuzz"), frames(root, "PortFrameFuzz");
  SeedFolder commands(root, "ChannelCommandFuzz"), lists(root, "PropertyListFuzz");
  SeedFolder resources(root, "ResourceFuzz"), preferences(root, "PreferencesFuzz");
  SeedFolder snapshots(root, "SnapshotFuzz"), ports(root, "PortSessionFuzz");
  makeCaptureSeeds(captures);
  makeFrameSeeds(frames);
  makePortSeeds(ports);
  makeCommandSeeds(commands, host);
  makePropertyListSeeds(lists);
  makeResourceSeeds(resources, host.shipped);
  makePreferencesSeeds(preferences);
  makeSnapshotSeeds(snapshots, host);
}

}  // namespace

}  // namespace varnel

// Fills a folder with seeds, one folder per target below it. The seeds come from the simulated modems, and
// are the same each time.
int main(int argumentCount, char** arguments) {
  if (argumentCount != 2) {
    std::fprintf(stderr, "usage: %s FOLDER\n", arguments[0]);
    return 2;
  }
  try {
    varnel::makeSeeds(arguments[1]);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 1;
  }
  return 0;
}

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <map>
#include <ostream>
#include <set>
#include <sstream>

#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"
#include "LogGenerator/KLV/LTE/LTEClassIndex.h"
#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"
#include "base/PropertyList.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/SimulatedMessages.h"

// What ties the templates that ship with the application to the decoders that fill them.

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AnyOf;
using testing::IsSupersetOf;

using Names = std::set<std::string>;

struct Technology {
  std::string name;
  std::string resource;
  std::unique_ptr<ClassIndex> (*makeIndex)(std::ostream& standardOutput);
  Names unfilled;  // the sections whose decoders have no log codes
};

void PrintTo(const Technology& technology, std::ostream* out) { *out << technology.name; }

template <class Index>
std::unique_ptr<ClassIndex> make(std::ostream& standardOutput) {
  return std::make_unique<Index>(standardOutput);
}

Value shippedTemplate(const std::string& resource) {
  std::ifstream file(VARNEL_SOURCE_DIR "/resources/" + resource + ".plist", std::ios::binary);
  const Bytes bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  return readPropertyList(bytes, fileLimits).value_or(Value());
}

// All values under the key, at any depth.
void collect(const Value& value, std::string_view key, std::vector<Value>& found) {
  if (const Array* array = value.array()) {
    for (const Value& element : *array) collect(element, key, found);
  }
  if (const Dictionary* dictionary = value.dictionary()) {
    for (const auto& [name, content] : *dictionary) {
      if (name == key) found.push_back(content);
      collect(content, key, found);
    }
  }
}

// The labels of a section's entries, those of lists marked as such.
Names rowsOf(const Dictionary& section) {
  Names labels;
  for (const auto& [label, value] : section) labels.insert(label + (value.array() ? " (a list)" : ""));
  return labels;
}

bool showsTablesOnly(const Base& decoder) {
  return std::ranges::none_of(
      decoder.handlers(), [](const PacketHandler& handler) { return handler.function || handler.method; });
}

class DisplayTemplate : public testing::TestWithParam<Technology> {
 protected:
  DisplayTemplate() {
    RecordingLog log;
    index = GetParam().makeIndex(standardOutput);
    const std::vector<std::string> lines = log.takeTexts();
    createdDecoders = std::ranges::count_if(
        lines, [](const std::string& line) { return line.starts_with("<4>Array Count: "); });
    for (const std::string& code : index->getAllLogCodes()) {
      for (const Base* decoder : index->getSubscribers(static_cast<std::uint32_t>(std::stoul(code))))
        filled.emplace(decoder->getSectionName());
    }
  }

  // What the template has under that name.
  std::vector<Value> sections(const std::string& name) const {
    std::vector<Value> found;
    collect(display, name, found);
    return found;
  }

  // Gives each decoder a section by `make` and then every packet of the simulated modem that it wants. A
  // decoder for which the modem sends nothing gets a packet of zeros per code. `look` gets the name and the
  // content of a section whenever its decoder has had a packet.
  template <class Make, class Look>
  void decode(Make make, Look look) {
    std::map<std::string, Value> contents;
    for (const std::string& name : filled) index->getClass(name)->updateSectionRef(contents[name] = make());
    const auto give = [&](Base* decoder, const Bytes& packet, std::uint32_t code) {
      decoder->updateWithData_logCode(Packet(packet), code);
      const std::string name(decoder->getSectionName());
      look(name, contents[name]);
    };
    for (std::uint64_t seed = 1; seed <= 4; ++seed) {
      for (const SimulatedPacket& message : simulatedMessages(GetParam().name, seed, 2min)) {
        for (Base* decoder : index->getSubscribers(message.code())) {
          simulated.emplace(decoder->getSectionName());
          give(decoder, message.packet, message.code());
        }
      }
    }
    for (const std::string& name : filled) {
      if (simulated.contains(name)) continue;
      Base* decoder = index->getClass(name);
      for (const PacketHandler& handler : decoder->handlers()) {
        const std::size_t size = std::max(handler.minimumLength, Packet::headerSize);
        give(decoder, PacketBuilder(handler.logCode, size).bytes(), handler.logCode);
      }
    }
  }

  // The sections that change when the decoders get them with that content.
  template <class Make>
  Names changed(Make make) {
    const std::string before = described(make());
    Names names;
    decode(make, [&](const std::string& name, const Value& content) {
      if (!names.contains(name) && described(content) != before) names.insert(name);
    });
    return names;
  }

  std::ostringstream standardOutput;
  std::unique_ptr<ClassIndex> index;
  std::ptrdiff_t createdDecoders = 0;
  Names filled;     // the sections whose decoders have log codes
  Names simulated;  // those of them that the simulated modem fills, once it was asked
  const Value display = shippedTemplate(GetParam().resource);
};

// The template gives a section to the one decoder that has its name.
TEST_P(DisplayTemplate, EachDecoderHasASectionOfItsOwn) {
  for (const std::string& name : GetParam().unfilled) {
    ASSERT_NE(index->getClass(name), nullptr) << name;
    EXPECT_TRUE(index->getClass(name)->getLogCodeArray().empty()) << name;
  }
  EXPECT_EQ(createdDecoders, std::ssize(filled) + std::ssize(GetParam().unfilled))
      << "two decoders have one section, or this test does not list one without log codes";
}

TEST_P(DisplayTemplate, HasEachSectionOnce) {
  for (const std::string& name : filled) EXPECT_EQ(sections(name).size(), 1u) << name;
  for (const std::string& name : GetParam().unfilled) EXPECT_EQ(sections(name).size(), 1u) << name;
}

TEST_P(DisplayTemplate, HasAnEmptyArrayForASectionOfAListAndADictionaryForOneOfEntries) {
  const Names ofLists = changed([] { return Value::ofArray({"old"}); });
  const Names ofRows = changed([] { return Value::ofDictionary(); });
  for (const std::string& name : filled) {
    const bool isList = ofLists.contains(name), hasRows = ofRows.contains(name);
    EXPECT_TRUE(isList || hasRows)
        << name << ": neither a packet of zeros nor the simulated modem fills it; let the modem send it";
    EXPECT_FALSE(isList && hasRows) << name << ": its decoder takes it for both";
    for (const Value& section : sections(name)) {
      EXPECT_TRUE(!isList || described(section) == "[]") << name << " is a list";
      EXPECT_TRUE(!hasRows || section.dictionary()) << name << " has rows";
    }
  }
}

// Without a modem that sends its packets, a decoder may write more entries than those that a packet of zeros
// has.
TEST_P(DisplayTemplate, HasTheEntriesThatDecodersWriteAndNoOthers) {
  std::map<std::string, Names> written;
  const auto collectRows = [&](const std::string& name, const Value& content) {
    written[name].merge(rowsOf(*content.dictionary()));
  };
  decode([] { return Value::ofDictionary(); }, collectRows);
  for (const auto& [name, labels] : written) {
    for (const Value& section : sections(name)) {
      const Names rows = section.dictionary() ? rowsOf(*section.dictionary()) : Names();
      EXPECT_THAT(rows, IsSupersetOf(labels)) << name;
      if (simulated.contains(name) || showsTablesOnly(*index->getClass(name))) {
        EXPECT_THAT(labels, IsSupersetOf(rows)) << name;
      }
    }
  }
}

TEST_P(DisplayTemplate, HasNothingInSectionsThatNoPacketFills) {
  for (const std::string& name : GetParam().unfilled) {
    for (const Value& section : sections(name)) EXPECT_THAT(described(section), AnyOf("[]", "{}")) << name;
  }
}

INSTANTIATE_TEST_SUITE_P(, DisplayTemplate,
                         testing::Values(Technology{"kalvi-gsm-umts",
                                                    "KLV_GSM",
                                                    make<KLV_GSMClassIndex>,
                                                    {"Coding Scheme", "UMTS RR Measurement",
                                                     "Cell Change Counters", "Non-Ranked GSM Set",
                                                     "Non-Ranked UMTS Set"}},
                                         Technology{"kalvi-lte", "LTE", make<LTEClassIndex>, {}},
                                         Technology{"kalvi-utran-2", "UTRAN", make<UTRANClassIndex>, {}}),
                         [](const testing::TestParamInfo<Technology>& technology) {
                           std::string name = technology.param.name;
                           std::erase(name, '-');
                           return name;
                         });

}  // namespace
}  // namespace varnel

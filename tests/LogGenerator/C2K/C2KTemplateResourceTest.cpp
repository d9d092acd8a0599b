#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <set>

#include "base/PropertyList.h"
#include "tests/support/C2KHarness.h"

// The template that ships with the application.

namespace varnel {
namespace {

using testing::AllOf;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

Value shippedTemplate() {
  std::ifstream file(VARNEL_SOURCE_DIR "/resources/C2KTemplate.plist", std::ios::binary);
  const Bytes bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  return readPropertyList(bytes, fileLimits).value_or(Value());
}

// Calls a function with each leaf, a text or something else, and its label.
template <class Function>
void forEachLeaf(const Dictionary& section, const Function& function) {
  for (const auto& [label, value] : section) {
    if (const Dictionary* inner = value.dictionary()) {
      forEachLeaf(*inner, function);
    } else {
      function(label, value);
    }
  }
}

class C2KTemplateResourceTest : public testing::Test {
 protected:
  void SetUp() override {
    ASSERT_TRUE(shipped.dictionary()) << "resources/C2KTemplate.plist is no dictionary";
  }

  Value shipped = shippedTemplate();
};

TEST_F(C2KTemplateResourceTest, ItPlacesEachOfThe30VariablesAndNoOther) {
  std::set<std::string> placed;
  forEachLeaf(*shipped.dictionary(), [&](const std::string& label, const Value& leaf) {
    ASSERT_TRUE(leaf.string()) << label;
    if (*leaf.string() != "_sorted") placed.insert(*leaf.string());
  });
  EXPECT_EQ(placed, std::set<std::string>(std::begin(c2kVariables), std::end(c2kVariables)));
  EXPECT_EQ(placed.size(), 30u);
}

TEST_F(C2KTemplateResourceTest, ItHasSectionsAndNoLooseRows) {
  std::size_t sections = 0;
  for (const auto& [label, section] : *shipped.dictionary()) {
    if (label == "_sorted") continue;
    EXPECT_TRUE(section.dictionary()) << label;
    ++sections;
  }
  EXPECT_GE(sections, 3u) << "1x, EV-DO and network";
}

TEST_F(C2KTemplateResourceTest, ItsLabelsAreReadable) {
  forEachLeaf(*shipped.dictionary(), [](const std::string& label, const Value& leaf) {
    if (*leaf.string() == "_sorted") {
      EXPECT_EQ(label, "_sorted");
    } else {
      EXPECT_THAT(label, AllOf(Not(IsEmpty()), Not(StartsWith("_")), Not(leaf.string()->c_str())));
    }
  });
}

TEST_F(C2KTemplateResourceTest, EveryVariableThatPacketsPublishReachesTheDisplay) {
  TestServices host;
  host.resources.add("C2KTemplate", shipped);
  C2KLogGenerator generator(host.services);
  Dictionary state;
  const auto status = SubpacketBuilder(0x119C).add(1, 8).u8(4, 8).add(2, 16).add(3, 12).add(4, 4).bytes();
  const Bytes messages[] = {
      PacketBuilder(0x1183, 50).bytes(),
      PacketBuilder(0x12B6, 25).bytes(),
      PacketBuilder(0x108A, 23).bytes(),
      status,
      SubpacketBuilder(0x119D).add(11, 25).bytes(),
      PacketBuilder(0x134F, 186).u8(13, 2).bytes(),
      PacketBuilder(0x1192, 241).u32(13, 1).bytes(),
      PacketBuilder(0x1192, 241).u32(13, 2).bytes(),
      PacketBuilder(0x127E, 1750).u32(14, 1).bytes(),
      PacketBuilder(0x127E, 1750).u32(14, 2).bytes(),
  };
  for (const Bytes& message : messages) generator.updateState_withData(state, message);
  std::size_t rows = 0;
  forEachLeaf(*state.get("Display").dictionary(), [&](const std::string& label, const Value& leaf) {
    ASSERT_TRUE(leaf.string()) << label;
    EXPECT_NE(*leaf.string(), "") << label;
    ++rows;
  });
  EXPECT_GE(rows, 30u);
}

}  // namespace
}  // namespace varnel

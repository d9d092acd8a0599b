#include <gtest/gtest.h>

#include <cinttypes>
#include <cstdio>
#include <regex>

#include "LogGenerator/KLV/GSMUMTS/KLV_GSMLogGenerator.h"
#include "LogGenerator/KLV/LTE/LTELogGenerator.h"
#include "LogGenerator/KLV/UTRAN/UTRANLogGenerator.h"
#include "base/Log.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

// Writes each log line as "<priority>text" to the standard output of a test, so that the lines of both stand
// in their order.
class Transcript final : public LogSink {
 public:
  explicit Transcript(std::ostream& output) : _output(output) { setLogSink(this, 16); }
  Transcript(const Transcript&) = delete;
  Transcript& operator=(const Transcript&) = delete;
  ~Transcript() override { setLogSink(nullptr, -1); }

  void write(int priority, std::string_view text) override {
    _output << '<' << priority << '>' << text << '\n';
  }

 private:
  std::ostream& _output;
};

// The lines of a generator's life; a test adds its resources and calls each of `created`, `displayed` and
// `destroyed` once, in this order.
class LifeLinesTest : public testing::Test {
 protected:
  std::string created(const char* technology) {
    generator = LogGenerator::generatorFromTechnology(technology, host.services);
    char text[32];
    std::snprintf(text, sizeof text, "0x%" PRIxPTR, reinterpret_cast<std::uintptr_t>(generator.get()));
    self = text;
    return take();
  }
  std::string displayed() {
    Dictionary state;
    generator->generateLogUsingState(state);
    return take();
  }
  std::string destroyed() {
    generator.reset();
    return take();
  }

  TestServices host;

 private:
  // The transcript since the last call, with SELF for the generator's address and INDEX for the one other
  // address that occurs in it. The lines of the decoders, one each, become one: the class index's own test
  // knows them.
  std::string take() {
    std::string text = host.standardOutput.str();
    host.standardOutput.str("");
    text = std::regex_replace(text, std::regex(self + "\\b"), "SELF");
    text = std::regex_replace(text, std::regex("(<4>Array Count: [0-9]+\n)+"), "<4>Array Count: COUNT\n");
    std::smatch found;
    if (index.empty() && std::regex_search(text, found, std::regex("0x[1-9a-f][0-9a-f]*")))
      index = found.str();
    return index.empty() ? text : std::regex_replace(text, std::regex(index + "\\b"), "INDEX");
  }

  Transcript transcript{host.standardOutput};
  std::unique_ptr<LogGenerator> generator;
  std::string self, index;
};

// A template with the sections that all technologies share.
Value sharedSections() {
  return dictionaryOf({{"SIM Info", Value::ofDictionary()}, {"PDP Context Info", Value::ofArray()}});
}

TEST_F(LifeLinesTest, OfTheLTEGenerator) {
  const Value sections = sharedSections();
  sections.dictionary()->set("Serving Cell Info", Value::ofDictionary());
  host.resources.add("LTE", sections);
  EXPECT_EQ(created("kalvi-lte"),
            "<3>Creating LTELogGenerator object\n"
            "<4>Array Count: COUNT\n"
            "<3>Creating KLVLogGenerator2 object with INDEX\n"
            "<4>Creating Log object: SELF\n"
            "<3>Class Index: 1\n");
  EXPECT_EQ(displayed(),
            "<4>Initialized class index: INDEX, Self: SELF\n"
            "<4>Dictionary = 1\n"
            "<4>String = 0\n"
            "<4>SIM Info\n"
            "<4>PDP Context Info\n"
            "<4>Serving Cell Info\n");
  EXPECT_EQ(destroyed(),
            "<4>LTELogGenerator is destructed SELF\n"
            "<4>KLV_GSMLogGenerator is destructed SELF\n"
            "Deallocing LTEClassIndex\n"
            "Deallocing ClassIndex\n");
}

TEST_F(LifeLinesTest, OfTheGSMUMTSGenerator) {
  host.resources.add("KLV_GSM", sharedSections());
  EXPECT_EQ(created("kalvi-gsm-umts"),
            "<3>Creating KLV_GSMLogGenerator object\n"
            "<4>Array Count: COUNT\n"
            "<3>Creating KLVLogGenerator2 object with INDEX\n"
            "<4>Creating Log object: SELF\n"
            "<3>Class Index: 1\n");
  EXPECT_EQ(displayed(),
            "<4>Initialized class index: INDEX, Self: SELF\n"
            "<4>Dictionary = 1\n"
            "<4>String = 0\n"
            "<4>SIM Info\n"
            "<4>PDP Context Info\n");
  EXPECT_EQ(destroyed(),
            "<4>KLV_GSMLogGenerator is destructed SELF\n"
            "<4>KLV_GSMLogGenerator is destructed SELF\n"
            "Deallocing KLV_GSMClassIndex\n"
            "Deallocing ClassIndex\n");
}

TEST_F(LifeLinesTest, OfTheUTRANGenerator) {
  host.resources.add("UTRAN", sharedSections());
  EXPECT_EQ(created("kalvi-utran-2"),
            "<4>Array Count: COUNT\n"
            "<3>Creating KLVLogGenerator2 object with INDEX\n"
            "<4>Creating Log object: SELF\n"
            "<3>Class Index: 1\n"
            "<3>Created UTRANLogGenerator object\n");
  EXPECT_EQ(displayed(),
            "<4>Initialized class index: INDEX, Self: SELF\n"
            "<4>Dictionary = 1\n"
            "<4>String = 0\n"
            "<4>SIM Info\n"
            "<4>PDP Context Info\n");
  EXPECT_EQ(destroyed(),
            "<4>KLV_GSMLogGenerator is destructed SELF\n"
            "Deallocing ClassIndex\n");
}

TEST_F(LifeLinesTest, OfTheUTRANGeneratorWithoutAResource) {
  EXPECT_EQ(created("kalvi-utran-2"),
            "<3>Creating KLVLogGenerator2 object with 0x0\n"
            "<4>Creating Log object: SELF\n"
            "<3>Class Index: 0\n"
            "<3>Created UTRANLogGenerator object\n");
  EXPECT_EQ(displayed(), "<3>Cannot load template for display\n");
  EXPECT_EQ(destroyed(), "<4>KLV_GSMLogGenerator is destructed SELF\n");
}

}  // namespace
}  // namespace varnel

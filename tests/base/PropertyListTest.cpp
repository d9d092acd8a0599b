#include "base/PropertyList.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <ctime>
#include <limits>
#include <random>
#include <string>
#include <string_view>
#include <vector>

#include "base/Dictionary.h"

using namespace varnel;
using namespace std::string_literals;

namespace {

// Far more than any test needs. A test lowers the limit that it is about.
constexpr PropertyListLimits wide = fileLimits;

ByteView view(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

std::optional<Value> read(std::string_view bytes, const PropertyListLimits& limits = messageLimits) {
  return readPropertyList(view(bytes), limits);
}

std::string xml(std::string_view element) {
  return R"(<?xml version="1.0" encoding="UTF-8"?>)"
         R"(<!DOCTYPE plist PUBLIC "-//Example//DTD PLIST 1.0//EN" "http://example.com/list.dtd">)"
         R"(<plist version="1.0">)" +
         std::string(element) + "</plist>\n";
}

std::string repeated(std::string_view text, std::size_t times) {
  std::string result;
  for (std::size_t i = 0; i < times; ++i) result += text;
  return result;
}

std::string bigEndian(std::uint64_t number, std::size_t width) {
  std::string result;
  while (width-- > 0) result += static_cast<char>(number >> (8 * width));
  return result;
}

// The numbers at the end of a binary list. They are right unless a test changes them.
struct Trailer {
  std::uint8_t offsetSize = 3, referenceSize = 1;
  std::uint64_t objectCount = 0, root = 0, table = 0;
};

std::string trailerBytes(const Trailer& trailer) {
  return std::string(6, '\0') + bigEndian(trailer.offsetSize, 1) + bigEndian(trailer.referenceSize, 1) +
         bigEndian(trailer.objectCount, 8) + bigEndian(trailer.root, 8) + bigEndian(trailer.table, 8);
}

struct BinaryList {
  std::string objectsAndTable;
  Trailer trailer;

  std::string bytes() const { return objectsAndTable + trailerBytes(trailer); }
};

// A binary list of the given objects. The first one is the root.
BinaryList binaryList(const std::vector<std::string>& objects) {
  BinaryList list{"bplist00", {}};
  std::string table;
  for (const std::string& object : objects) {
    table += bigEndian(list.objectsAndTable.size(), 3);
    list.objectsAndTable += object;
  }
  list.trailer.objectCount = objects.size();
  list.trailer.table = list.objectsAndTable.size();
  list.objectsAndTable += table;
  return list;
}

std::string binary(const std::vector<std::string>& objects) { return binaryList(objects).bytes(); }

// A marker with a size of any length.
std::string sized(unsigned kind, std::uint64_t size) {
  return bigEndian(kind << 4U | 15U, 1) + "\x12" + bigEndian(size, 4);
}

// The value in short: {key:value,...} [element,...] "text" 5 5.0 true date(s,us) <bytes>.
std::string outline(const Value& value) {
  char text[64];
  std::string result;
  switch (value.kind()) {
    case Value::Kind::Absent:
      return "absent";
    case Value::Kind::String:
      return '"' + *value.string() + '"';
    case Value::Kind::Integer:
      return std::to_string(*value.integer());
    case Value::Kind::Boolean:
      return *value.boolean() ? "true" : "false";
    case Value::Kind::Real:
      std::snprintf(text, sizeof text, "%#.17g", *value.real());
      return text;
    case Value::Kind::Date:
      return "date(" + std::to_string(value.date()->seconds) + ',' +
             std::to_string(value.date()->microseconds) + ')';
    case Value::Kind::Data:
      for (const unsigned byte : *value.data()) {
        std::snprintf(text, sizeof text, "%02x", byte);
        result += text;
      }
      return '<' + result + '>';
    case Value::Kind::Array:
      for (const Value& element : *value.array()) result += (result.empty() ? "" : ",") + outline(element);
      return '[' + result + ']';
    case Value::Kind::Dictionary:
      for (const auto& [key, entry] : *value.dictionary()) {
        result += (result.empty() ? "" : ",") + key + ':' + outline(entry);
      }
      return '{' + result + '}';
  }
  return "unknown";
}

std::string outline(const std::optional<Value>& value) { return value ? outline(*value) : "nothing"; }

std::string outlineOf(std::string_view bytes, const PropertyListLimits& limits = messageLimits) {
  return outline(read(bytes, limits));
}

std::string asText(const std::optional<Bytes>& bytes) {
  return bytes ? std::string(bytes->begin(), bytes->end()) : "nothing";
}

std::string throughXml(const Value& value) { return outlineOf(asText(writeXmlPropertyList(value)), wide); }
std::string throughBinary(const Value& value) {
  return outlineOf(asText(writeBinaryPropertyList(value)), wide);
}

Value dictionary(std::initializer_list<Dictionary::Entry> entries) {
  Value result = Value::ofDictionary();
  for (const auto& [key, value] : entries) result.dictionary()->set(key, value);
  return result;
}

// This many arrays, each of which holds the next one.
Value nestedArrays(std::size_t levels) {
  Value value = Value::ofArray();
  for (std::size_t level = 1; level < levels; ++level) value = Value::ofArray({value});
  return value;
}

std::string nestedXmlArrays(std::size_t levels) {
  return xml(repeated("<array>", levels) + repeated("</array>", levels));
}

std::string nestedBinaryArrays(std::size_t levels) {
  std::vector<std::string> objects;
  for (std::size_t level = 1; level < levels; ++level) objects.push_back("\xA1" + bigEndian(level, 2));
  objects.emplace_back("\xA0");
  BinaryList list = binaryList(objects);
  list.trailer.referenceSize = 2;
  return list.bytes();
}

// Uses the processor's time, so that other work on the machine does not count.
std::clock_t timeToRead(std::string_view bytes) {
  const std::clock_t start = std::clock();
  read(bytes);
  return std::clock() - start;
}

// Whether reading takes no longer than reading a few ordinary messages of the largest size on this machine
// now. One of twenty readings must do so.
bool isReadQuickly(std::string_view bytes) {
  constexpr int fewMessages = 8;
  static const std::string ordinary =
      xml("<array>" + repeated("<string>a text</string>", 43000) + "</array>");
  static std::clock_t ordinaryTime = timeToRead(ordinary);
  for (int attempt = 0; attempt < 20; ++attempt) {
    if (timeToRead(bytes) <= fewMessages * ordinaryTime) return true;
    ordinaryTime = timeToRead(ordinary);
  }
  return false;
}

// Every kind of value, in both encodings.
Value everyKind() {
  return dictionary({{"zebra", "text"},
                     {"integer", Value::ofInteger(-5)},
                     {"real", Value::ofReal(0.1)},
                     {"yes", Value::ofBoolean(true)},
                     {"no", Value::ofBoolean(false)},
                     {"date", Value::ofDate({730994709, 0})},
                     {"data", Value::ofData({0, 1, 0xFF})},
                     {"array", Value::ofArray({"a", Value::ofArray(), Value::ofInteger(7)})},
                     {"ant", dictionary({{"b", "2"}, {"a", "1"}})},
                     {"empty", Value::ofDictionary()}});
}

constexpr const char* everyKindOutline =
    R"({zebra:"text",integer:-5,real:0.10000000000000001,yes:true,no:false,date:date(730994709,0),data:<0001ff>,)"
    R"(array:["a",[],7],ant:{b:"2",a:"1"},empty:{}})";

}  // namespace

TEST(PropertyListReading, XmlKeepsEveryKindInOrder) {
  EXPECT_EQ(
      outlineOf(
          xml("<dict><key>z</key><string>text</string><key>i</key><integer>-42</integer>"
              "<key>r</key><real>1.5</real><key>t</key><true/><key>f</key><false/>"
              "<key>d</key><date>2024-03-01T14:05:09Z</date><key>b</key><data>AAH/</data>"
              "<key>a</key><array><integer>1</integer><string></string></array><key>e</key><dict/></dict>")),
      R"({z:"text",i:-42,r:1.5000000000000000,t:true,f:false,d:date(730994709,0),b:<0001ff>,a:[1,""],e:{}})");
}

TEST(PropertyListReading, BinaryKeepsEveryKindInOrder) {
  EXPECT_EQ(
      outlineOf(binary({"\xAB\x01\x02\x03\x04\x05\x06\x07\x08\x09\x0A\x0B"s, "\x53xyz",
                        "\x62\x00\xE9\x20\xAC"s, "\x10\x05", "\x13" + bigEndian(0xFFFFFFFFFFFFFFFB, 8),
                        "\x22\x3F\xC0\x00\x00"s, "\x23" + bigEndian(0x3FB999999999999A, 8), "\x09", "\x08",
                        "\x33" + bigEndian(0x41C5C8FA2A800000, 8), "\x43\x00\x01\xFF"s,
                        "\xD2\x0C\x0D\x07\x08", "\x51z", "\x51y"})),
      "[\"xyz\",\"\u00e9\u20ac\",5,-5,1.5000000000000000,0.10000000000000001,true,false,date(730985557,0),"
      "<0001ff>,{z:true,y:false}]");
}

TEST(PropertyListReading, BareScalarsAreLists) {
  EXPECT_EQ(outlineOf(xml("<string>alone</string>")), R"("alone")");
  EXPECT_EQ(outlineOf(binary({sized(5, 5) + "alone"})), R"("alone")");
}

TEST(PropertyListReading, KeyThatOccursTwiceKeepsFirstPlaceAndLastValue) {
  EXPECT_EQ(outlineOf(xml("<dict><key>a</key><integer>1</integer><key>b</key><integer>2</integer>"
                          "<key>a</key><integer>3</integer></dict>")),
            "{a:3,b:2}");
  EXPECT_EQ(outlineOf(binary({"\xD3\x01\x02\x01\x03\x04\x05", sized(5, 1) + "a", sized(5, 1) + "b",
                              "\x10\x01", "\x10\x02", "\x10\x03"})),
            "{a:3,b:2}");
}

TEST(PropertyListReading, LongDictionaryKeepsItsOrder) {
  std::string entries, expected;
  for (int i = 999; i >= 0; --i) {
    entries += "<key>" + std::to_string(i) + "</key><true/>";
    expected += (i == 999 ? "" : ",") + std::to_string(i) + ":true";
  }
  const auto list = read(xml("<dict>" + entries + "</dict>"));
  ASSERT_TRUE(list);
  EXPECT_EQ(outline(*list), "{" + expected + "}");
  EXPECT_EQ(throughBinary(*list), "{" + expected + "}");
  EXPECT_EQ(throughXml(*list), "{" + expected + "}");
}

TEST(PropertyListReading, IntegersOf64BitsAndMoreKeepTheirLowerBits) {
  EXPECT_EQ(
      outlineOf(xml("<array><integer>9223372036854775807</integer><integer>-9223372036854775808</integer>"
                    "<integer>9223372036854775808</integer><integer>18446744073709551615</integer></array>")),
      "[9223372036854775807,-9223372036854775808,-9223372036854775808,-1]");
  EXPECT_EQ(outlineOf(binary({"\x14" + bigEndian(0, 8) + bigEndian(0x8000000000000000, 8)})),
            "-9223372036854775808");
  EXPECT_EQ(outlineOf(binary({"\x11\xFF\xFE"})), "65534");
}

TEST(PropertyListReading, RealsThatAreNotFiniteAreKept) {
  const auto list = read(xml("<array><real>nan</real><real>+infinity</real><real>-infinity</real></array>"));
  ASSERT_TRUE(list);
  EXPECT_TRUE(std::isnan((*list->array())[0].real().value()));
  EXPECT_EQ((*list->array())[1].real(), std::numeric_limits<double>::infinity());
  EXPECT_EQ((*list->array())[2].real(), -std::numeric_limits<double>::infinity());
}

TEST(PropertyListReading, DatesCountFrom2001) {
  EXPECT_EQ(
      outlineOf(xml("<array><date>2001-01-01T00:00:00Z</date><date>2000-12-31T23:59:55Z</date></array>")),
      "[date(0,0),date(-5,0)]");
  EXPECT_EQ(outlineOf(binary({"\x33" + bigEndian(0x3FF8000000000000, 8)})), "date(1,500000)");   // 1.5
  EXPECT_EQ(outlineOf(binary({"\x33" + bigEndian(0xC015000000000000, 8)})), "date(-6,750000)");  // -5.25
  EXPECT_EQ(outlineOf(binary({"\x33" + bigEndian(0xBFD0000000000000, 8)})), "date(-1,750000)");  // -0.25
}

TEST(PropertyListReading, DatesOutOfRangeComeOutAsTheEarliest) {
  EXPECT_EQ(outlineOf(xml("<date>0001-01-01T00:00:00Z</date>")), "date(-2147483648,0)");
  EXPECT_EQ(outlineOf(binary({"\x33" + bigEndian(0xC415AF1D78B58C40, 8)})), "date(-2147483648,0)");  // -1e20
}

TEST(PropertyListReading, TextsKeepSpacesEntitiesAndSections) {
  EXPECT_EQ(outlineOf(xml("<string>  a\tb\n c </string>")), "\"  a\tb\n c \"");
  EXPECT_EQ(outlineOf(xml("<string>&lt;&gt;&amp;&quot;&apos;&#65;&#x20AC;</string>")), "\"<>&\"'A\u20ac\"");
  EXPECT_EQ(outlineOf(xml("<string>a<![CDATA[<b>&amp;]]>c<!-- </string> -->d</string>")), "\"a<b>&amp;cd\"");
  EXPECT_EQ(outlineOf(xml("<dict><key>a&amp;b</key><string>c</string></dict>")), R"({a&b:"c"})");
}

TEST(PropertyListReading, WhatIsNoPropertyListIsRefused) {
  for (const std::string& bytes :
       {""s, "\0"s, "x"s, "plain text that is no list"s, R"({"GetTechnology": "GetTechnology"})"s,
        "{ GetTechnology = GetTechnology; }"s, "[1, 2, 3]"s, "( a, b )"s, "<html><body/></html>"s, xml(""),
        xml("<null/>"), xml("<string>"), "<plist><array><string>a</string>"s,
        "<plist><array></dict></plist>"s, xml("<dict><true/></dict>"), xml("<array>text</array>"),
        "bplist00"s, "bplist00" + std::string(32, '\0'), "bplist15" + binary({"\x09"}).substr(8)}) {
    EXPECT_EQ(outlineOf(bytes), "nothing") << bytes;
  }
}

TEST(PropertyListReading, KindsWithoutAValueAreRefused) {
  EXPECT_EQ(outlineOf(binary({"\x80\x01"})), "nothing");                               // UID
  EXPECT_EQ(outlineOf(binary({"\xA1\x01", "\x80\x01"})), "nothing");                   // UID in an array
  EXPECT_EQ(outlineOf(binary({"\xD1\x01\x02", "\x51k", "\x81\x01\x01"})), "nothing");  // UID in a dictionary
  EXPECT_EQ(outlineOf(binary({"\x00"s})), "nothing");                                  // null
  EXPECT_EQ(outlineOf(binary({"\x0F"})), "nothing");                                   // filler
  EXPECT_EQ(outlineOf(binary({"\xB0"})), "nothing");                                   // ordered set
  EXPECT_EQ(outlineOf(binary({"\xC0"})), "nothing");                                   // set
  EXPECT_EQ(outlineOf(binary({"\x15" + std::string(32, '\1')})), "nothing");           // integer of 32 bytes
  EXPECT_EQ(outlineOf(binary({"\x21\x01\x01"})), "nothing");                           // real of 2 bytes
  EXPECT_EQ(outlineOf(binary({"\x32\x01\x01\x01\x01"})), "nothing");                   // date of 4 bytes
}

TEST(PropertyListReading, KeysThatAreNoTextsAreRefused) {
  EXPECT_EQ(outlineOf(binary({"\xD1\x01\x01", "\x10\x01"})), "nothing");
  EXPECT_EQ(outlineOf(binary({"\xD1\x01\x02", "\xA0", "\x09"})), "nothing");
  EXPECT_EQ(outlineOf(binary({"\xD1\x01\x02", "\x41k", "\x09"})), "nothing");
}

TEST(PropertyListReading, TextsWithANullCharacterAreRefused) {
  EXPECT_EQ(outlineOf(binary({sized(5, 3) + "a\0b"s})), "nothing");
  EXPECT_EQ(outlineOf(binary({"\x62\x00\x61\x00\x00"s})), "nothing");
  EXPECT_EQ(outlineOf(binary({"\xD1\x01\x02", "\x51\x00"s, "\x09"})), "nothing");
  EXPECT_EQ(outlineOf(binary({"\xD1\x01\x02", "\x61\x00\x00"s, "\x09"})), "nothing");
  EXPECT_EQ(outlineOf(xml("<string>a\0b</string>"s)), "nothing");
  EXPECT_EQ(outlineOf(xml("<string>a&#0;b</string>")), "nothing");
}

TEST(PropertyListReading, BadUnicodeIsRefused) {
  for (const char* text : {"\x80", "\xC3", "\xC0\x80", "\xC3\x28", "\xE2\x82", "\xE0\x80\x80", "\xED\xA0\x80",
                           "\xF0\x80\x80\x80", "\xF4\x90\x80\x80", "\xF5\x80\x80\x80", "\xFF", "ok\xE9"}) {
    EXPECT_EQ(outlineOf(xml("<string>"s + text + "</string>")), "nothing") << text;
    EXPECT_EQ(outlineOf(xml("<dict><key>"s + text + "</key><true/></dict>")), "nothing") << text;
    EXPECT_EQ(outlineOf(binary({sized(5, std::string_view(text).size()) + text})), "nothing") << text;
  }
  EXPECT_EQ(outlineOf(xml("<string>&#xD800;</string>")), "nothing");
  EXPECT_EQ(outlineOf(binary({"\x61\xD8\x3D"})), "nothing");           // no trail
  EXPECT_EQ(outlineOf(binary({"\x61\xDE\x00"s})), "nothing");          // no lead
  EXPECT_EQ(outlineOf(binary({"\x62\xD8\x3D\x00\x61"s})), "nothing");  // lead before a letter
  EXPECT_EQ(outlineOf(binary({"\x62\xD8\x3D\xDE\x00"s})), "\"\U0001F600\"");
}

TEST(PropertyListReading, ControlCharactersAreRefusedInXmlOnly) {
  for (const char* text : {"\x01", "\x08", "\x0B", "\x0C", "\x0E", "\x1F", "&#1;", "\uFFFE", "\uFFFF"}) {
    EXPECT_EQ(outlineOf(xml("<string>"s + text + "</string>")), "nothing") << text;
  }
  EXPECT_EQ(outlineOf(xml("<string>\t\n\r\x7F</string>")), "\"\t\n\r\x7F\"");
  EXPECT_EQ(outlineOf(binary({"\x52\x01\x1B"})), "\"\x01\x1B\"");
}

TEST(PropertyListReading, DeclarationsOfEntitiesAreRefused) {
  EXPECT_EQ(outlineOf("<!DOCTYPE plist [<!ENTITY a \"b\">]><plist><string>a</string></plist>"), "nothing");
  EXPECT_EQ(outlineOf("<!DOCTYPE plist [ ]><plist><string>a</string></plist>"), "nothing");
  EXPECT_EQ(outlineOf("<!ENTITY a \"b\"><plist><string>a</string></plist>"), "nothing");
  EXPECT_EQ(outlineOf(xml("<string>&unknown;</string>")), "nothing");
  EXPECT_EQ(outlineOf("<!DOCTYPE plist><plist><string>a</string></plist>"), R"("a")");
}

TEST(PropertyListReading, EveryTruncationIsRefused) {
  const std::string inXml = asText(writeXmlPropertyList(everyKind()));
  const std::size_t end = inXml.find("</plist>");
  for (std::size_t length = 0; length < end - 8; ++length)
    EXPECT_EQ(outlineOf(inXml.substr(0, length)), "nothing");
  const std::string inBinary = asText(writeBinaryPropertyList(everyKind()));
  for (std::size_t length = 0; length < inBinary.size(); ++length) {
    EXPECT_EQ(outlineOf(inBinary.substr(0, length)), "nothing") << length;
  }
}

TEST(PropertyListReading, TrailersThatDoNotFitAreRefused) {
  constexpr std::uint64_t most = std::numeric_limits<std::uint64_t>::max();
  const BinaryList good = binaryList({"\xA1\x01", "\x09"});
  ASSERT_EQ(outlineOf(good.bytes()), "[true]");
  const auto refuses = [&](auto spoil) {
    BinaryList list = good;
    spoil(list.trailer);
    return outlineOf(list.bytes()) == "nothing";
  };
  for (const std::uint8_t width : {0, 9, 255}) {
    EXPECT_TRUE(refuses([&](Trailer& trailer) { trailer.offsetSize = width; }));
    EXPECT_TRUE(refuses([&](Trailer& trailer) { trailer.referenceSize = width; }));
  }
  for (const std::uint64_t count :
       {most, most / 3, most / 3 + 2, std::uint64_t{3}, std::uint64_t{1}, std::uint64_t{0}}) {
    EXPECT_TRUE(refuses([&](Trailer& trailer) { trailer.objectCount = count; }));
  }
  for (const std::uint64_t root : {most, std::uint64_t{2}}) {
    EXPECT_TRUE(refuses([&](Trailer& trailer) { trailer.root = root; }));
  }
  for (const std::uint64_t table :
       {most, std::uint64_t{17}, std::uint64_t{7}, std::uint64_t{0}, std::uint64_t{1} << 63U}) {
    EXPECT_TRUE(refuses([&](Trailer& trailer) { trailer.table = table; }));
  }
}

TEST(PropertyListReading, ObjectsThatLeaveTheirRoomAreRefused) {
  for (const std::string& object : {"\x13\x01"s,
                                    "\x23\x01"s,
                                    "\x33\x01"s,
                                    "\x4F\x13" + std::string(8, '\xFF'),
                                    "\x5F\x13" + std::string(8, '\xFF'),
                                    "\x6F\x13" + std::string(8, '\xFF'),
                                    "\x6F\x13\x80" + std::string(7, '\0'),
                                    "\xAF\x13" + std::string(8, '\xFF'),
                                    "\xAF\x13\x80" + std::string(7, '\0'),
                                    "\xDF\x13" + std::string(8, '\xFF'),
                                    "\xDF\x13\x40" + std::string(7, '\0'),
                                    "\x42\x01"s,
                                    "\x52x"s,
                                    "\x61\x01"s,
                                    "\xA1"s,
                                    "\xD1\x01"s,
                                    "\x4F"s,
                                    "\x4F\x10"s,
                                    "\x4F\x14" + std::string(16, '\0'),
                                    "\x4F\x23" + std::string(8, '\0'),
                                    "\xA1\x09"s}) {
    EXPECT_EQ(outlineOf(binary({object})), "nothing");
  }
}

TEST(PropertyListLimit, SizeOfMessagesIsOneMebibyte) {
  const std::string shell = xml("<string></string>");
  const auto listOfSize = [&](std::size_t size) {
    return xml("<string>" + std::string(size - shell.size(), 'x') + "</string>");
  };
  EXPECT_TRUE(read(listOfSize(1048576)));
  EXPECT_FALSE(read(listOfSize(1048577)));
  EXPECT_TRUE(read(listOfSize(1048577), fileLimits));
}

TEST(PropertyListLimit, DepthOfMessagesIs64) {
  EXPECT_TRUE(read(nestedXmlArrays(64)));
  EXPECT_FALSE(read(nestedXmlArrays(65)));
  EXPECT_TRUE(read(nestedBinaryArrays(64)));
  EXPECT_FALSE(read(nestedBinaryArrays(65)));
  EXPECT_TRUE(read(nestedXmlArrays(65), fileLimits));
  EXPECT_TRUE(read(nestedBinaryArrays(65), fileLimits));
}

TEST(PropertyListLimit, EmptyContainersCountAsALevel) {
  PropertyListLimits limits = wide;
  limits.depth = 1;
  EXPECT_TRUE(read(xml("<array/>"), limits));
  EXPECT_FALSE(read(xml("<array><dict/></array>"), limits));
  EXPECT_TRUE(read(binary({"\xA0"}), limits));
  EXPECT_FALSE(read(binary({"\xA1\x01", "\xD0"}), limits));
}

TEST(PropertyListLimit, DepthCannotBeHidden) {
  PropertyListLimits limits = wide;
  limits.depth = 2;
  const std::string tail = "</array></array></array>";
  EXPECT_FALSE(read(xml("<array><array><!-- </array> --><array>" + tail), limits));
  EXPECT_FALSE(read(xml("<array><array><![CDATA[</array>]]><array>" + tail), limits));
  EXPECT_FALSE(read(xml("<array><array><?x </array> ?><array>" + tail), limits));
  EXPECT_FALSE(read(xml("<array><array x=\"></array>\"><array>" + tail), limits));
  EXPECT_FALSE(read(xml("<array ><array\n><array\tx='1'>" + tail), limits));
  EXPECT_FALSE(read(xml("<array><array><string></array></string><array>" + tail), limits));
  EXPECT_FALSE(read("<?x \"?>\" <!-- ?>" + xml("<array><array><array>" + tail), limits));
}

TEST(PropertyListLimit, HundredThousandLevelsAreRefused) {
  EXPECT_FALSE(read(nestedXmlArrays(100000), fileLimits));
  EXPECT_FALSE(read(xml(repeated("<array>", 100000)), fileLimits));
  EXPECT_FALSE(read(xml(repeated("<dict><key>k</key>", 50000)), fileLimits));
  EXPECT_FALSE(read(nestedBinaryArrays(60000), fileLimits));
}

TEST(PropertyListLimit, NodesAreValuesAndKeys) {
  PropertyListLimits limits = wide;
  limits.expandedNodes = 4;
  EXPECT_FALSE(
      read(xml("<array><true/><true/><true/></array>"), limits));  // the list's own element is one more
  limits.expandedNodes = 5;
  EXPECT_TRUE(read(xml("<array><true/><true/><true/></array>"), limits));
  EXPECT_FALSE(read(xml("<dict><key>a</key><true/><key>b</key><true/></dict>"), limits));
  limits.expandedNodes = 4;
  EXPECT_TRUE(read(binary({"\xA3\x01\x01\x01", "\x09"}), limits));
  EXPECT_FALSE(read(binary({"\xA4\x01\x01\x01\x01", "\x09"}), limits));
  EXPECT_FALSE(read(binary({"\xD2\x01\x02\x03\x03", "\x51x", "\x51y", "\x09"}), limits));
  limits.expandedNodes = 5;
  EXPECT_TRUE(read(binary({"\xD2\x01\x02\x03\x03", "\x51x", "\x51y", "\x09"}), limits));
}

TEST(PropertyListLimit, BytesCountAsOftenAsTheyAreReferredTo) {
  PropertyListLimits limits = wide;
  limits.expandedBytes = 6;
  EXPECT_TRUE(read(binary({"\xA2\x01\x01", "\x53xyz"}), limits));
  EXPECT_FALSE(read(binary({"\xA3\x01\x01\x01", "\x53xyz"}), limits));
  EXPECT_TRUE(read(binary({"\xA2\x01\x01", "\x43xyz"}), limits));
  EXPECT_FALSE(read(binary({"\xA3\x01\x01\x01", "\x43xyz"}), limits));
  EXPECT_TRUE(read(binary({"\x63\x00x\x00y\x00z"s}), limits));
  EXPECT_FALSE(read(binary({"\x64\x00w\x00x\x00y\x00z"s}), limits));
}

// Nested arrays that each hold the next one twelve times: 248,832 values at the fifth level.
std::string nodeBomb(std::string_view padding = {}) {
  std::vector<std::string> objects;
  for (char next = 1; next <= 5; ++next) objects.push_back("\xAC" + std::string(12, next));
  objects.emplace_back("\x09");
  objects.emplace_back(padding);  // nothing refers to it
  return binary(objects);
}

TEST(PropertyListLimit, AShortFileExpandsToNoMoreNodesThanAMessage) {
  ASSERT_LT(nodeBomb().size(), 165u);
  EXPECT_FALSE(read(nodeBomb(), fileLimits));
}

TEST(PropertyListLimit, ALongerFileMayExpandToANodeMoreForEachByte) {
  EXPECT_FALSE(read(nodeBomb(std::string(200'000, '\0')), fileLimits));
  EXPECT_TRUE(read(nodeBomb(std::string(206'000, '\0')), fileLimits));  // 271,453 nodes
}

TEST(PropertyListLimit, TextsThatAShortFileSharesExpandTo64TimesItsSizeAndThatOfAMessage) {
  const auto shared = [](std::size_t times) {
    return binary(
        {sized(0xA, times) + std::string(times, '\x01'), sized(0x5, 100'000) + repeated("x", 100'000)});
  };
  EXPECT_TRUE(read(shared(100), fileLimits));   // 10,000,000 bytes of 4,194,304 + 64 * 100,166
  EXPECT_FALSE(read(shared(110), fileLimits));  // 11,000,000
}

TEST(PropertyListLimit, PathsThatAShortFileSharesHaveABoundThatGrowsWithIt) {
  const auto shared = [](std::size_t values) {
    return binary({"\xD1\x01\x02", sized(0x5, 10'000) + repeated("k", 10'000),
                   sized(0xA, values) + std::string(values, '\x03'), "\x09"});
  };
  EXPECT_TRUE(read(shared(4'000), fileLimits));   // 40 MB
  EXPECT_FALSE(read(shared(6'000), fileLimits));  // 60 MB of 33,554,432 + 1024 * 16,098
}

TEST(PropertyListLimit, KeyPairsAreSummedOverTheDictionaries) {
  PropertyListLimits limits = wide;
  limits.keyPairs = 8;
  const std::string two = "<dict><key>a</key><true/><key>b</key><true/></dict>";
  EXPECT_TRUE(read(xml("<array>" + two + two + "</array>"), limits));
  EXPECT_FALSE(read(xml("<array>" + two + two + "<dict><key>a</key><true/></dict></array>"), limits));
  EXPECT_TRUE(read(binary({"\xA2\x01\x01", "\xD2\x02\x03\x04\x04", "\x51x", "\x51y", "\x09"}), limits));
  EXPECT_FALSE(read(binary({"\xA3\x01\x01\x01", "\xD2\x02\x03\x04\x04", "\x51x", "\x51y", "\x09"}), limits));
}

TEST(PropertyListLimit, EntitiesCountWithTheLengthOfTheirText) {
  PropertyListLimits limits = wide;
  limits.entityMoves = 20;
  EXPECT_TRUE(read(xml("<string>&amp;&amp;</string>"), limits));
  EXPECT_FALSE(read(xml("<string>&amp;&amp;x</string>"), limits));
  EXPECT_TRUE(read(xml("<string>&amp;</string>").replace(0, 0, "<!-- &&&&&&&&&&&&&&&&&&&&&&& -->"), limits));
  EXPECT_TRUE(read(xml("<string><![CDATA[&&&&&&&&&&&&&&&&&&&&&&&&&&&&&&&&]]></string>"), limits));
}

TEST(PropertyListLimit, PathsAreTheKeysThatLeadToEachValue) {
  PropertyListLimits limits = wide;
  limits.pathBytes = 4 + 5 + 5;  // the list below "abc" and its two elements
  const std::string opened = "<dict><key>abc</key><array>";
  EXPECT_TRUE(read(xml(opened + "<true/><true/></array></dict>"), limits));
  EXPECT_FALSE(read(xml(opened + "<true/><true/><true/></array></dict>"), limits));
  EXPECT_FALSE(read(xml("<dict><key>abcd</key><array><true/><true/></array></dict>"), limits));
  EXPECT_FALSE(read(xml("<dict><key>a<![CDATA[bcd]]></key><array><true/><true/></array></dict>"), limits));
  EXPECT_TRUE(read(xml("<array>" + repeated("<true/>", 14) + "</array>"), limits));
  EXPECT_FALSE(read(xml("<array>" + repeated("<true/>", 15) + "</array>"), limits));
  EXPECT_TRUE(read(binary({"\xD1\x01\x02", "\x53\x61\x62\x63", "\xA2\x03\x03", "\x09"}), limits));
  EXPECT_FALSE(read(binary({"\xD1\x01\x02", "\x53\x61\x62\x63", "\xA3\x03\x03\x03", "\x09"}), limits));
  EXPECT_FALSE(read(binary({"\xD1\x01\x02", "\x54\x61\x62\x63\x64", "\xA2\x03\x03", "\x09"}), limits));
  EXPECT_FALSE(read(binary({"\xD1\x01\x02", "\x62\x00\x61\x00\x62"s, "\xA2\x03\x03", "\x09"}), limits));
}

TEST(PropertyListLimit, LongKeysAboveManyValuesAreRefusedInMessages) {
  const std::string key(3000, 'k');
  const std::string opened = repeated("<dict><key>" + key + "</key>", 40), closed = repeated("</dict>", 40);
  const auto list = [&](std::size_t values) {
    return xml(opened + "<array>" + repeated("<string/>", values) + "</array>" + closed);
  };
  EXPECT_TRUE(read(list(20)));
  EXPECT_FALSE(read(list(20000)));
}

TEST(PropertyListLimit, SharedReferencesCannotBlowUp) {
  std::vector<std::string> objects;
  for (int level = 1; level <= 30; ++level)
    objects.push_back("\xA8" + std::string(8, static_cast<char>(level)));
  objects.emplace_back("\x09");
  const std::string bytes = binary(objects);
  EXPECT_EQ(bytes.size(), 8 + 30 * 9 + 1 + 31 * 3 + 32U);
  EXPECT_FALSE(read(bytes));
  EXPECT_FALSE(read(bytes, fileLimits));
  EXPECT_TRUE(isReadQuickly(bytes));
}

TEST(PropertyListLimit, OneLongTextReferredToOftenIsRefused) {
  const std::string bytes =
      binary({sized(0xA, 10000) + std::string(10000, '\1'), sized(5, 100000) + std::string(100000, 'x')});
  EXPECT_FALSE(read(bytes));
  EXPECT_FALSE(read(bytes, fileLimits));
}

TEST(PropertyListLimit, CyclesAreRefused) {
  EXPECT_FALSE(read(binary({"\xA1\x00"s}), fileLimits));
  EXPECT_FALSE(read(binary({"\xA8" + std::string(8, '\0')}), fileLimits));
  EXPECT_FALSE(read(binary({"\xA1\x01", "\xA1\x00"s}), fileLimits));
  EXPECT_FALSE(read(binary({"\xD1\x01\x00"s, "\x51k"}), fileLimits));
  EXPECT_FALSE(read(binary({"\xD1\x00\x01"s, "\x09"}), fileLimits));
}

TEST(PropertyListLimit, FloodsTakeNoTime) {
  std::string uniqueKeys, oneKey, collidingKeys;
  for (int i = 0; i < 20000; ++i) uniqueKeys += "<key>" + std::to_string(i) + "</key><true/>";
  oneKey = uniqueKeys + repeated("<key>19999</key><true/>", 20000);
  for (unsigned i = 0; i < 12000; ++i) {
    collidingKeys += "<key>";
    for (unsigned bit = 0; bit < 14; ++bit) collidingKeys += (i >> bit & 1U) != 0 ? "Az" : "BY";
    collidingKeys += "</key><true/>";
  }
  const std::string longText(1000000, 'x');
  std::vector<std::string> overlapping(1, sized(0xA, 60000) + std::string(60000, '\1'));
  overlapping.push_back(overlapping[0]);
  for (const std::string& list :
       {xml("<string>" + repeated("&amp;", 200000) + "</string>"),
        xml("<string>" + repeated("&amp;", 14000) + "</string>"),
        xml("<string>" + repeated("&#65;", 1000) + longText + "</string>"),
        xml("<string>" + std::string(1000000, '&') + "</string>"),
        xml("<string>" + longText + "&</string>"),
        xml("<string>" + repeated("<!---->", 140000) + "</string>"),
        xml("<string>" + repeated("x<![CDATA[x]]>", 70000) + "</string>"),
        xml("<dict>" + uniqueKeys + "</dict>"),
        xml("<dict>" + oneKey + "</dict>"),
        xml("<dict>" + collidingKeys + "</dict>"),
        xml("<array>" + repeated("<true/>", 65000) + "</array>"),
        xml("<array>" + repeated("<dict/>", 65000) + "</array>"),
        xml("<array>" + repeated("<dict><key>a</key><dict/></dict>", 21000) + "</array>"),
        repeated("<plist>", 149000),
        std::string(1000000, '<'),
        std::string(1000000, '"'),
        repeated("<!--", 250000),
        repeated("<?\"", 300000),
        xml("<data>" + longText + "</data>"),
        xml("<integer>" + std::string(1000000, '1') + "</integer>"),
        xml("<real>" + std::string(1000000, '1') + "e-999999</real>"),
        nestedBinaryArrays(60000),
        binary(overlapping),
        binary({sized(0xA, 65000) + std::string(65000, '\1'), "\x09"}),
        binary({sized(0xA, 65000) + std::string(65000, '\1'), "\xD0"})}) {
    EXPECT_TRUE(isReadQuickly(list)) << list.substr(0, 250);
  }
}

// Lists in both encodings, changed at random. None may crash, hang, or leak.
TEST(PropertyListReading, TenThousandMutatedListsDoNoHarm) {
  Value cells = Value::ofArray();
  for (int i = 0; i < 16; ++i) {
    cells.array()->push_back(dictionary({{"RadioAccessTechnology", "LTE"},
                                         {"CellType", i == 0 ? "Serving" : "Neighbor"},
                                         {"MCC", Value::ofInteger(262)},
                                         {"BandInfo", Value::ofInteger(3)},
                                         {"RSRP", Value::ofReal(-95.5)}}));
  }
  const std::vector<std::string> seeds{asText(writeXmlPropertyList(everyKind())),
                                       asText(writeBinaryPropertyList(everyKind())),
                                       asText(writeXmlPropertyList(cells)),
                                       asText(writeBinaryPropertyList(cells)),
                                       nestedXmlArrays(60),
                                       nestedBinaryArrays(60),
                                       xml("<string>a&amp;<![CDATA[b]]>&#x20AC;<!--c--></string>")};
  const std::vector<std::string> pieces{"<array>",   "</array>", "<dict>",  "</dict>", "<key>",    "</key>",
                                        "<!--",      "-->",      "<plist>", "&amp;",   "\xFF\xFF", "\0\0"s,
                                        "<![CDATA[", "\"",       "\xA1",    "\xD1",    "\x5F\x13", "\x80"};
  std::mt19937 random(20240301);
  const auto below = [&](std::size_t bound) { return std::size_t{random()} % bound; };
  for (int round = 0; round < 10000; ++round) {
    std::string bytes = seeds[below(seeds.size())];
    for (std::size_t changes = 1 + below(4); changes > 0 && !bytes.empty(); --changes) {
      const std::size_t place = below(bytes.size());
      switch (below(5)) {
        case 0:
          bytes[place] = static_cast<char>(random());
          break;
        case 1:
          bytes[place] = static_cast<char>(static_cast<unsigned char>(bytes[place]) ^ 1U << below(8));
          break;
        case 2:
          bytes.erase(place, 1 + below(8));
          break;
        case 3:
          bytes.insert(place, pieces[below(pieces.size())]);
          break;
        default:
          bytes.insert(place, bytes.substr(below(bytes.size()), 1 + below(200)));
      }
    }
    EXPECT_TRUE(isReadQuickly(bytes)) << "round " << round;
    const auto list = read(bytes);
    EXPECT_TRUE(!list || writeBinaryPropertyList(*list)) << "round " << round;
  }
}

TEST(PropertyListWriting, BothEncodingsKeepEveryKindInOrder) {
  EXPECT_EQ(throughXml(everyKind()), everyKindOutline);
  EXPECT_EQ(throughBinary(everyKind()), everyKindOutline);
}

TEST(PropertyListWriting, XmlIsAsReadersExpectIt) {
  const std::string text = asText(writeXmlPropertyList(dictionary({{"GetTechnology", "GetTechnology"}})));
  EXPECT_TRUE(text.starts_with("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<!DOCTYPE plist PUBLIC "))
      << text;
  EXPECT_TRUE(
      text.ends_with("\n<plist version=\"1.0\">\n<dict>\n\t<key>GetTechnology</key>\n"
                     "\t<string>GetTechnology</string>\n</dict>\n</plist>\n"))
      << text;
}

TEST(PropertyListWriting, NumbersKeepTheirExactValue) {
  for (const double number : {0.1, -1.5, 1e-9, 1e20, -1e300, 123456789.123456789, 0.9999999, 5e-324,
                              std::numeric_limits<double>::max(), std::numeric_limits<double>::infinity()}) {
    const std::string expected = outline(Value::ofReal(number));
    EXPECT_EQ(throughXml(Value::ofReal(number)), expected);
    EXPECT_EQ(throughBinary(Value::ofReal(number)), expected);
  }
  for (const std::int64_t number :
       {std::numeric_limits<std::int64_t>::min(), std::int64_t{-1}, std::int64_t{0}, std::int64_t{255},
        std::int64_t{65536}, std::numeric_limits<std::int64_t>::max()}) {
    const std::string expected = std::to_string(number);
    EXPECT_EQ(throughXml(Value::ofInteger(number)), expected);
    EXPECT_EQ(throughBinary(Value::ofInteger(number)), expected);
  }
  EXPECT_EQ(throughBinary(Value::ofReal(-0.0)), "-0.0000000000000000");
}

TEST(PropertyListWriting, DatesKeepTheirSeconds) {
  for (const std::int32_t seconds : {0, -5, 730994709, std::numeric_limits<std::int32_t>::max()}) {
    const std::string expected = "date(" + std::to_string(seconds) + ",0)";
    EXPECT_EQ(throughXml(Value::ofDate({seconds, 0})), expected);
    EXPECT_EQ(throughBinary(Value::ofDate({seconds, 0})), expected);
  }
  EXPECT_EQ(throughBinary(Value::ofDate({-5, 750000})), "date(-5,750000)");
  EXPECT_EQ(throughBinary(Value::ofDate({5, 250000})), "date(5,250000)");
}

// A real number of seconds cannot hold every microsecond. The library cuts the rest off toward 2001.
TEST(PropertyListWriting, BinaryDatesComeBackWithinAMicrosecond) {
  EXPECT_EQ(throughBinary(Value::ofDate({5, 3})), "date(5,3)");
  EXPECT_EQ(throughBinary(Value::ofDate({5, 4})), "date(5,3)");
  EXPECT_EQ(throughBinary(Value::ofDate({730994709, 1})), "date(730994709,0)");
  EXPECT_EQ(throughBinary(Value::ofDate({-5, 1})), "date(-5,2)");
  EXPECT_EQ(throughBinary(Value::ofDate({-5, 999997})), "date(-5,999998)");
}

TEST(PropertyListWriting, BinaryDatesAroundTheStartOf2001KeepTheirSide) {
  EXPECT_EQ(throughBinary(Value::ofDate({-1, 500000})), "date(-1,500000)");
  EXPECT_EQ(throughBinary(Value::ofDate({-1, 0})), "date(-1,0)");
  EXPECT_EQ(throughBinary(Value::ofDate({0, 500000})), "date(0,500000)");
}

TEST(PropertyListWriting, TextsComeBackAsTheyWere) {
  for (const char* text : {"", " ", "<>&\"'", "&amp;", "]]>", "\r\n\t",
                           "\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80", "\x7F", "a\rb\r"}) {
    const std::string expected = "{"s + text + ":\"" + text + "\"}";
    EXPECT_EQ(throughXml(dictionary({{text, text}})), expected);
    EXPECT_EQ(throughBinary(dictionary({{text, text}})), expected);
  }
}

// A reader of XML takes a bare carriage return as a newline.
TEST(PropertyListWriting, CarriageReturnsAreWrittenAsReferences) {
  EXPECT_NE(asText(writeXmlPropertyList("a\r\nb\r")).find("<string>a&#13;\nb&#13;</string>"),
            std::string::npos);
}

TEST(PropertyListWriting, EmptyContentsAreKept) {
  const Value value = Value::ofArray({Value::ofData({}), Value::ofArray(), Value::ofDictionary(), ""});
  EXPECT_EQ(throughXml(value), "[<>,[],{},\"\"]");
  EXPECT_EQ(throughBinary(value), "[<>,[],{},\"\"]");
}

TEST(PropertyListWriting, TheAbsentValueHasNoForm) {
  for (const Value& value :
       {Value(), Value::ofArray({Value()}), dictionary({{"a", Value::ofArray({"b", Value()})}})}) {
    EXPECT_FALSE(writeXmlPropertyList(value));
    EXPECT_FALSE(writeBinaryPropertyList(value));
  }
}

TEST(PropertyListWriting, TextsThatNoEncodingHoldsAreRefused) {
  for (const std::string& text : {"a\0b"s, "\0"s, "\xFF"s, "\xED\xA0\x80"s, "cut \xE2\x82"s}) {
    for (const Value& value : {Value(text), dictionary({{text, "value"}}), Value::ofArray({text})}) {
      EXPECT_FALSE(writeXmlPropertyList(value));
      EXPECT_FALSE(writeBinaryPropertyList(value));
    }
  }
}

TEST(PropertyListWriting, ControlCharactersAreWrittenInBinaryOnly) {
  for (const char* text : {"\x01", "\x1B", "\x0B", "\uFFFE", "\uFFFF"}) {
    for (const Value& value : {Value(text), dictionary({{text, "value"}})}) {
      EXPECT_FALSE(writeXmlPropertyList(value));
      EXPECT_EQ(throughBinary(value), outline(value));
    }
  }
}

TEST(PropertyListWriting, DepthIsThatOfFiles) {
  EXPECT_TRUE(read(asText(writeXmlPropertyList(nestedArrays(128))), fileLimits));
  EXPECT_TRUE(read(asText(writeBinaryPropertyList(nestedArrays(128))), fileLimits));
  EXPECT_FALSE(writeXmlPropertyList(nestedArrays(129)));
  EXPECT_FALSE(writeBinaryPropertyList(nestedArrays(129)));
}

TEST(PropertyListWriting, ContainersThatHoldThemselvesAreRefused) {
  const Value once = Value::ofArray();
  once.array()->push_back(once);
  EXPECT_FALSE(writeXmlPropertyList(once));
  const Value often = Value::ofDictionary();
  for (const char* key : {"a", "b", "c"}) often.dictionary()->set(key, often);
  EXPECT_FALSE(writeXmlPropertyList(often));
  EXPECT_FALSE(writeBinaryPropertyList(often));
  once.array()->clear();
  for (const char* key : {"a", "b", "c"}) often.dictionary()->remove(key);
}

TEST(PropertyListWriting, ContainersReferredToTwiceAreWrittenTwice) {
  const Value shared = dictionary({{"k", "v"}});
  EXPECT_EQ(throughXml(Value::ofArray({shared, shared})), R"([{k:"v"},{k:"v"}])");
  EXPECT_EQ(throughBinary(Value::ofArray({shared, shared})), R"([{k:"v"},{k:"v"}])");
}

#include "programs/varnel-telephonyd/ChannelCommand.h"

#include <gtest/gtest.h>

#include <string>

namespace varnel {
namespace {

std::optional<ChannelCommand> read(const std::string& dictionary) {
  const std::string list = "<plist version=\"1.0\"><dict>" + dictionary + "</dict></plist>";
  return readChannelCommand(Bytes(list.begin(), list.end()));
}

CodeFilter filterOf(const std::optional<ChannelCommand>& command) {
  return std::get<StartRequest>(command.value()).filter;
}

const std::string streaming = "<key>SetState</key><string>Streaming</string>";

TEST(ChannelCommand, TheTechnologyIsAskedFor) {
  const auto command = read("<key>GetTechnology</key><string>GetTechnology</string>");
  ASSERT_TRUE(command);
  EXPECT_TRUE(std::holds_alternative<TechnologyRequest>(*command));
}

TEST(ChannelCommand, AStartListsTheCodes) {
  const CodeFilter filter = filterOf(
      read(streaming +
           "<key>SetKalviLogCodes</key><array><integer>45249</integer><integer>45250</integer></array>"
           "<key>SetTkExtraCodes</key><array><integer>0</integer></array>"));
  EXPECT_EQ(filter.modemCodes, (CodeFilter::Codes{45249, 45250}));
  EXPECT_EQ(filter.serverCodes, (CodeFilter::Codes{0}));
}

TEST(ChannelCommand, ListsMayBeEmptyOrMissing) {
  const CodeFilter filter = filterOf(read(streaming + "<key>SetKalviLogCodes</key><array/>"));
  EXPECT_EQ(filter.modemCodes, CodeFilter::Codes());
  EXPECT_EQ(filter.serverCodes, std::nullopt);
}

TEST(ChannelCommand, WhatIsNoCommandIsRefused) {
  EXPECT_FALSE(readChannelCommand({}));
  EXPECT_FALSE(readChannelCommand(Bytes{'x'}));
  EXPECT_FALSE(read(""));
  EXPECT_FALSE(read("<key>GetTechnology</key><string>Something</string>"));
  EXPECT_FALSE(read("<key>SetState</key><string>Idle</string>"));
  EXPECT_FALSE(read("<key>SetState</key><integer>1</integer>"));
  EXPECT_FALSE(read(streaming + "<key>SetKalviLogCodes</key><string>45249</string>"));
  EXPECT_FALSE(read(streaming + "<key>SetTkExtraCodes</key><array><string>0</string></array>"));
}

}  // namespace
}  // namespace varnel

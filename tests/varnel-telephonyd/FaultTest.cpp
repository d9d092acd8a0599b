#include "programs/varnel-telephonyd/Fault.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

using Kind = Fault::Kind;

TEST(Fault, IsNamedAndSomeHaveANumberOfMessages) {
  EXPECT_EQ(readFault("drop-channel@100"), (Fault{Kind::DropChannel, 100}));
  EXPECT_EQ(readFault("crash@1"), (Fault{Kind::Crash, 1}));
  EXPECT_EQ(readFault("garbage@7"), (Fault{Kind::Garbage, 7}));
  EXPECT_EQ(readFault("silent"), (Fault{Kind::Silent}));
  EXPECT_EQ(readFault("bad-reply"), (Fault{Kind::BadReply}));
}

TEST(Fault, OtherTextsAreNone) {
  for (const char* const text : {"", "dance", "crash", "crash@", "crash@0", "crash@-1", "crash@1x",
                                 "crash@99999999999999999999", "silent@1", "silent@", "@1", "none"})
    EXPECT_EQ(readFault(text), std::nullopt) << text;
}

TEST(Fault, NamesAreThoseThatCanBeTyped) {
  EXPECT_EQ(namesOfFaults(),
            "drop-channel@N, crash@N, garbage@N, silent, late-reply, bad-reply, empty-reply, "
            "unknown-technology, drop-after-reply, refuse-channel, no-port, wrong-port");
}

}  // namespace
}  // namespace varnel

#include "frame/FailSafe.h"

#include <gtest/gtest.h>

#include "frame/Error.h"
#include "frame/host/Host.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

using test::PromptScope;
using test::ScriptedPrompt;

TEST(FailSafeTest, ReportMessageForALocalError) {
  ErrorDetails e{91, std::string(StandardDescription(91)), "Quendal", 0};
  EXPECT_EQ(ErrorReportMessage(e, "cStarTrackGenericSCM", "Function PrintLabel", "/lib/q.so"),
            "MVE error - program error #91 (Object variable or With block variable not set) "
            "occured in module cStarTrackGenericSCM, Function PrintLabel, line 0.");
}

TEST(FailSafeTest, RemoteSourceAddsTheComponentSuffix) {
  ErrorDetails e{440, "Automation error", "1Server!x", 3};
  EXPECT_EQ(ErrorReportMessage(e, "cStarTrackDAcln", "Sub Process", "/opt/quendal/libquendal.so"),
            "MVE error - program error #440 (Automation error) occured in module cStarTrackDAcln, "
            "Sub Process, line 3. This error was generated remotely by Server, a component of "
            "/opt/quendal/libquendal.so.");
  // No "!": everything after the first character.
  e.source = "2Remote";
  EXPECT_NE(ErrorReportMessage(e, "m", "p", "L").find("remotely by Remote, a component of L."),
            std::string::npos);
  for (const char* plain : {"0Server!x", "Server!x", ""}) {
    e.source = plain;
    EXPECT_TRUE(ErrorReportMessage(e, "m", "p", "L").ends_with("line 3.")) << plain;
  }
}

TEST(FailSafeTest, UnknownNumbersGetTheGenericDescription) {
  EXPECT_EQ(StandardDescription(13), "Type mismatch");
  EXPECT_EQ(StandardDescription(31337), "Application-defined or object-defined error");
  EXPECT_EQ(Error(9).Description(), "Subscript out of range");
}

// A procedure of three steps where the second fails once or always.
struct Sample {
  int result = 0;
  int attempts = 0;
  bool failAlways = false;
  int Run() {
    Procedure proc("cSample", "Function Run");
    if (!proc([&] { result = 1; })) return result;
    if (!proc([&] {
          ++attempts;
          if (failAlways || attempts == 1) throw Error(err::kObjectNotSet);
          result = 2;
        }))
      return result;
    if (!proc([&] { result += 10; })) return result;
    return result;
  }
};

TEST(FailSafeTest, AbortReturnsTheCurrentResult) {
  auto prompt = std::make_shared<ScriptedPrompt>(std::deque{Answer::Abort});
  PromptScope scope(prompt);
  Sample s;
  EXPECT_EQ(s.Run(), 1);
  ASSERT_EQ(prompt->messages.size(), 1u);
  EXPECT_EQ(prompt->titles[0], "Unexpected Error");
  EXPECT_EQ(prompt->messages[0],
            "MVE error - program error #91 (Object variable or With block variable not set) "
            "occured in module cSample, Function Run, line 2.");
}

TEST(FailSafeTest, RetryRepeatsTheFailingStep) {
  auto prompt = std::make_shared<ScriptedPrompt>(std::deque{Answer::Retry});
  PromptScope scope(prompt);
  Sample s;
  EXPECT_EQ(s.Run(), 12);
  EXPECT_EQ(s.attempts, 2);
}

TEST(FailSafeTest, IgnoreGoesOnWithTheNextStep) {
  auto prompt = std::make_shared<ScriptedPrompt>(std::deque{Answer::Ignore});
  PromptScope scope(prompt);
  Sample s;
  s.failAlways = true;
  EXPECT_EQ(s.Run(), 11);
  EXPECT_EQ(s.attempts, 1);
}

TEST(FailSafeTest, RetryAsksAgainEachTimeTheStepFails) {
  auto prompt =
      std::make_shared<ScriptedPrompt>(std::deque{Answer::Retry, Answer::Retry, Answer::Abort});
  PromptScope scope(prompt);
  Sample s;
  s.failAlways = true;
  EXPECT_EQ(s.Run(), 1);
  EXPECT_EQ(s.attempts, 3);
  EXPECT_EQ(prompt->messages.size(), 3u);
}

TEST(FailSafeTest, TheDefaultPromptAborts) {
  Sample s;
  s.failAlways = true;
  EXPECT_EQ(s.Run(), 1);
}

TEST(FailSafeTest, NonLibraryExceptionsAreReportedToo) {
  auto prompt = std::make_shared<ScriptedPrompt>();
  PromptScope scope(prompt);
  Procedure proc("cSample", "Sub X");
  EXPECT_FALSE(proc([] { throw std::runtime_error("disk on fire"); }));
  ASSERT_EQ(prompt->messages.size(), 1u);
  EXPECT_NE(prompt->messages[0].find("#440 (disk on fire)"), std::string::npos);
}

TEST(FailSafeTest, NothingRaisesObjectNotSet) {
  Ref<host::Pack> nothing;
  try {
    (void)nothing->SSCC();
    FAIL();
  } catch (const Error& e) {
    EXPECT_EQ(e.Number(), err::kObjectNotSet);
  }
}

}  // namespace
}  // namespace quendal

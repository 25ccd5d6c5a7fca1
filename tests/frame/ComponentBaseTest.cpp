#include "frame/ComponentBase.h"

#include <gtest/gtest.h>

#include "platform/Clock.h"
#include "platform/Machine.h"
#include "tests/support/MemoryHost.h"

namespace quendal {
namespace {

using test::MemoryHost;

// A consignment-like object: logs at the error number.
class Probe : public Lifecycle {
 public:
  Probe() : Lifecycle("clsProbeDA") {}
  using ComponentBase::LastLogId;
  using ComponentBase::ModuleName;
  using ComponentBase::WriteLog;
  void Give(Ref<host::System> s) { system_ = std::move(s); }
  int closed = 0;

 protected:
  long LogLevel(long errorNumber) const override { return errorNumber; }
  void CloseOpenFile() override { ++closed; }
};

class ComponentBaseTest : public ::testing::Test {
 protected:
  void SetUp() override { SetNow(DateTime::FromParts(2024, 3, 14, 9, 0, 0)); }
  void TearDown() override { SetNow(std::nullopt); }
  MemoryHost host;
};

TEST_F(ComponentBaseTest, NamesComeFromTheClassName) {
  Probe p;
  EXPECT_EQ(p.ClassName(), "Quendal.clsProbeDA");
  EXPECT_EQ(p.ModuleName(), "cProbeDA");
}

TEST_F(ComponentBaseTest, LogBeforeAnyEntryHasIdZero) {
  Probe p;
  Ref<host::Log> log = p.Log();
  ASSERT_TRUE(log);
  EXPECT_EQ(log->ID().Whole(), 0);
}

TEST_F(ComponentBaseTest, WriteLogFillsTheEntryAndKeepsItsId) {
  Probe p;
  p.Give(host.system);
  p.WriteLog(0, "Process", "first");
  p.WriteLog(76, "Open carrier message file", "Invalid folder /nowhere/");
  ASSERT_EQ(host.logs.size(), 2u);
  const auto& e = host.logs[1];
  EXPECT_EQ(e.at("Source").Text(), "Quendal.clsProbeDA");
  EXPECT_EQ(e.at("Procedure").Text(), "Open carrier message file");
  EXPECT_EQ(e.at("ErrorNumber").Whole(), 76);
  EXPECT_EQ(e.at("Level").Whole(), 76);
  EXPECT_EQ(e.at("Message").Text(), "Invalid folder /nowhere/");
  EXPECT_EQ(e.at("UserName").Text(), "packer1");
  EXPECT_EQ(e.at("LogDate").Date().Iso(), "2024-03-14T09:00:00");
  // Set when the machine's name fits the 30-character buffer, else left unset.
  EXPECT_EQ(e.contains("ComputerName"), ComputerName().has_value());
  EXPECT_EQ(p.LastLogId(), 2);
  EXPECT_EQ(p.Log()->ID().Whole(), 2);
}

TEST_F(ComponentBaseTest, WriteLogWithoutSystemStillSavesTheEntry) {
  auto prompt = std::make_shared<test::ScriptedPrompt>();
  test::PromptScope scope(prompt);
  Probe p;
  p.WriteLog(0, "Load", "no system yet");
  EXPECT_TRUE(prompt->messages.empty());
  ASSERT_EQ(host.logs.size(), 1u);
  EXPECT_EQ(host.logs[0].at("Message").Text(), "no system yet");
  EXPECT_FALSE(host.logs[0].contains("UserName"));
  EXPECT_EQ(p.LastLogId(), 1);
}

TEST_F(ComponentBaseTest, LifecycleMembers) {
  Probe p;
  EXPECT_FALSE(p.PROCESSALL());
  p.SetPROCESSALL(true);
  EXPECT_TRUE(p.PROCESSALL());
  EXPECT_TRUE(p.Term());
  p.Cancel();
  EXPECT_EQ(p.closed, 1);
}

}  // namespace
}  // namespace quendal

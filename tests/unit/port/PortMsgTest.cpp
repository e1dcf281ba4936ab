// The message manager: counts, capture, console presentation and log file.
#include <gtest/gtest.h>

#include <string>

#include "HostTestSupport.h"
#include "TestFiles.h"
#include "port/Port.h"

namespace {

using hosttest::TempDir;

// Restores the manager's presentation settings after each test.
class PortMsg : public ::testing::Test {
protected:
    void SetUp() override { Port_MsgManager::Instance().ResetCounts(); }
    void TearDown() override {
        Port_MsgManager& m = Port_MsgManager::Instance();
        m.SetQuiet(false);
        m.SetDebug(false);
        m.SetConsole(true);
        m.CloseLog();
        m.ResetCounts();
    }
    void IssueOneOfEach() {
        auto msg = NLW_MSG();
        msg.issueStatus("Writing Verilog netlist file '%s' ...\n", "top.v");
        msg.issueInfo("%d notice", 1);
        msg.issueWarning("Padding or triming the value for hex property %s:\n", "INIT");
        msg.issueError("error %s\n", "e");
        msg.issueInternal("internal\n");
        Port_MsgManData::debugStub("Adding (%s:%s) to the recursive inclusion map.\n", "A", "B");
    }
};

TEST_F(PortMsg, CountsPerLevelAndCapturesText) {
    Port_MsgManager::Instance().SetConsole(false);
    Port_MsgCapture capture;
    IssueOneOfEach();
    Port_MsgManager& m = Port_MsgManager::Instance();
    for (Port_MsgLevel level :
         {Port_MsgLevel::Debug, Port_MsgLevel::Status, Port_MsgLevel::Info, Port_MsgLevel::Warning,
          Port_MsgLevel::Error, Port_MsgLevel::Internal})
        EXPECT_EQ(m.GetCount(level), 1) << static_cast<int>(level);
    ASSERT_EQ(capture.msgs.size(), 6u);
    EXPECT_EQ(capture.msgs[0].domain, "NetListWriters");
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Status),
              std::vector<std::string>{"Writing Verilog netlist file 'top.v' ...\n"});
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Warning),
              std::vector<std::string>{"Padding or triming the value for hex property INIT:\n"});
    // Debug traces reach capture sinks even with debug output off.
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Debug),
              std::vector<std::string>{"Adding (A:B) to the recursive inclusion map.\n"});
    m.ResetCounts();
    EXPECT_EQ(m.GetCount(Port_MsgLevel::Error), 0);
    // A capture ends with its lifetime.
    {
        Port_MsgCapture inner;
        NLW_MSG().issueWarning("both\n");
        EXPECT_EQ(inner.msgs.size(), 1u);
    }
    NLW_MSG().issueWarning("outer only\n");
    EXPECT_EQ(capture.msgs.size(), 8u);
}

TEST_F(PortMsg, ConsolePresentation) {
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    IssueOneOfEach();
    std::string out = testing::internal::GetCapturedStdout();
    std::string err = testing::internal::GetCapturedStderr();
    EXPECT_EQ(out,
              "Writing Verilog netlist file 'top.v' ...\n"
              "INFO:NetListWriters - 1 notice\n");
    nlwtest::ExpectGolden("msg/console_presentation", err);
}

TEST_F(PortMsg, QuietDropsStatusAndDebugShowsTraces) {
    Port_MsgManager& m = Port_MsgManager::Instance();
    m.SetQuiet(true);
    m.SetDebug(true);
    Port_MsgCapture capture;
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    IssueOneOfEach();
    Port_MsgManData::createObject("OtherDomain").issueWarning("from elsewhere");
    std::string out = testing::internal::GetCapturedStdout();
    std::string err = testing::internal::GetCapturedStderr();
    EXPECT_EQ(out, "INFO:NetListWriters - 1 notice\n");
    nlwtest::ExpectGolden("msg/quiet_drops_status_and_debug_shows_traces", err);
    // Quiet is about the console only.
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Status).size(), 1u);
    EXPECT_EQ(m.GetCount(Port_MsgLevel::Status), 1);
}

TEST_F(PortMsg, LogFileGetsEverything) {
    TempDir dir;
    Port_MsgManager& m = Port_MsgManager::Instance();
    m.SetConsole(false);
    m.SetQuiet(true);
    ASSERT_TRUE(m.OpenLog((dir / "run.log").c_str()));
    IssueOneOfEach();
    m.CloseLog();
    nlwtest::ExpectGolden("msg/log_file_gets_everything", hosttest::ReadFile(dir / "run.log"));
    EXPECT_FALSE(m.OpenLog((dir / "no/such/dir/run.log").c_str()));
}

TEST_F(PortMsg, LongMessagesAreWholeAndLeaveVorformAlone) {
    Port_MsgManager::Instance().SetConsole(false);
    Port_MsgCapture capture;
    std::string big(100000, 'm');
    NLW_MSG().issueError("Cannot write file '%s': %s\n", big.c_str(), "reason");
    ASSERT_EQ(capture.msgs.size(), 1u);
    EXPECT_EQ(capture.msgs[0].text, "Cannot write file '" + big + "': reason\n");
    // Issuing leaves results of vorform alone.
    const char* held = vorform("held %d", 7);
    for (int i = 0; i < 20; ++i) NLW_MSG().issueInfo("%s %d", "info", i);
    EXPECT_STREQ(held, "held 7");
}

TEST(PortMsgDeath, ExitEndsWithTheCodeAndFlushesTheLog) {
    TempDir dir;
    const std::string log = dir / "exit.log";
    EXPECT_EXIT(
        {
            Port_MsgManager& m = Port_MsgManager::Instance();
            m.SetConsole(false);
            m.OpenLog(log.c_str());
            NLW_MSG().issueError("last words\n");
            Port_MsgDispatcher::exit(3);
        },
        ::testing::ExitedWithCode(3), "");
    EXPECT_EQ(hosttest::ReadFile(log), "ERROR:NetListWriters - last words\n");
}

}  // namespace

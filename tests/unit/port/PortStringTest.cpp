// Formatted text, the host string, C-string helpers, wildcard matching,
// path helpers, the name cache and the message manager.

#include "HostTestSupport.h"
#include "port/UT.h"

namespace {

using hosttest::TempDir;
using Port::String;

TEST(Vorform, NeverTruncatesLongText) {
    EXPECT_STREQ(vorform("%d'h%s|%-4s|", 16, "ABCD", "ab"), "16'hABCD|ab  |");
    // Far beyond any buffer a fixed-size implementation would have.
    for (size_t len : {255u, 256u, 1024u, 4097u, 2000000u}) {
        std::string big(len, 'x');
        big.back() = 'y';
        EXPECT_EQ(std::string(vorform("<%s>", big.c_str())), "<" + big + ">") << len;
    }
    std::string out = "head:";
    Port_AppendFormat(out, "%s=%d;", "a", 1);
    Port_AppendFormat(out, "%s", std::string(70000, 'q').c_str());
    Port_AppendFormat(out, "%s", "");
    EXPECT_EQ(out, "head:a=1;" + std::string(70000, 'q'));
}

TEST(Vorform, ResultsSurviveSevenFurtherAndNestedCalls) {
    const char* first = vorform("first %d", 1);
    std::vector<const char*> later;
    for (int i = 0; i < 7; ++i)
        later.push_back(vorform("later %d %s", i, std::string(5000, 'z').c_str()));
    EXPECT_STREQ(first, "first 1");
    for (int i = 0; i < 7; ++i)
        EXPECT_EQ(std::string(later[i]).substr(0, 8), "later " + std::to_string(i) + " ");
    // A result used as the argument of a further call.
    const char* inner = vorform("%s[%d]", "bus", 3);
    EXPECT_STREQ(vorform("wire %s;", vorform("\\%s ", inner)), "wire \\bus[3] ;");
    std::string tail(3000, 't');
    const char* a = vorform("%s", "abc");
    EXPECT_EQ(std::string(vorform("%s%s%s", a, tail.c_str(), a)), "abc" + tail + "abc");
}

TEST(HostString, CompareAndCase) {
    String s("Clk_Buf");
    EXPECT_EQ(s.Compare("Clk_Buf"), 0);
    EXPECT_NE(s.Compare("clk_buf"), 0);
    EXPECT_EQ(s.Compare("CLK_BUF", String::IgnoreCase), 0);
    EXPECT_LT(s.Compare("Clk_Bug"), 0);
    EXPECT_GT(s.Compare("Clk_Bu"), 0);
    EXPECT_LT(s.Compare("clk_bufx", String::IgnoreCase), 0);
    EXPECT_GT(s.Compare(nullptr), 0);
    EXPECT_EQ(String().Compare(nullptr), 0);
    s.MakeUpper();
    EXPECT_STREQ(s.c_str(), "CLK_BUF");
    s.MakeLower();
    s.SetChar(0, 'C');
    s.SetChar(100, 'Z');  // out of range: ignored
    EXPECT_STREQ(s.c_str(), "Clk_buf");
}

TEST(HostString, GetUINT32ReadsWholeDecimalText) {
    for (const nlwtest::Row& c : nlwtest::Table("uint32")) {
        bool ok = c[2] != "1";
        EXPECT_EQ(String(c[0].c_str()).GetUINT32(&ok), std::stoul(c[1])) << c[0];
        EXPECT_EQ(ok, c[2] == "1") << c[0];
    }
}

TEST(HostString, SplitAtSeparatorsOutsideQuotes) {
    for (const nlwtest::Row& c : nlwtest::Table("split")) {
        std::string got;
        for (const String& s : String::Split(c[0].c_str(), c[1].c_str(), c[2] == "1",
                                             nlwtest::Opt(c[3]), nlwtest::Opt(c[4])))
            got += "<" + s.str() + ">";
        EXPECT_EQ(got, c[5]) << c[0];
    }
    EXPECT_TRUE(String::Split(nullptr, ":", true, "", "").empty());
}

// ---------------------------------------------------------------------------
// C-string helpers, wildcard matching, path helpers and the name cache.

TEST(UtStr, ComparisonsIgnoringCase) {
    EXPECT_NE(UT_STR::Compare("a", "A"), 0);
    EXPECT_EQ(UT_STR::ICompare("QDB", "qdb"), 0);
    EXPECT_EQ(UT_STR::_ICompare("qda", "QDA"), 0);
    EXPECT_LT(UT_STR::ICompare("abc", "ABD"), 0);
    EXPECT_GT(UT_STR::ICompare("abcd", "ABC"), 0);
    EXPECT_EQ(UT_STR::ICompare(nullptr, ""), 0);
    EXPECT_NE(UT_STR::ICompare(nullptr, "x"), 0);
    EXPECT_EQ(UT_STR::INCompare("DCM_ADV_x", "dcm_adv", 7), 0);
    EXPECT_NE(UT_STR::INCompare("DCM_ADV_x", "dcm_adx", 7), 0);
    EXPECT_EQ(UT_STR::INCompare("ab", "AB", 10), 0);  // both end before n
    EXPECT_NE(UT_STR::INCompare("ab", "ABC", 10), 0);
}

TEST(UtStr, IMatchPatterns) {
    for (const nlwtest::Row& c : nlwtest::Table("imatch"))
        EXPECT_EQ(UT_STR::IMatch(c[0].c_str(), c[1].c_str()) != 0, c[2] == "1")
            << c[0] << " ~ " << c[1];
    EXPECT_EQ(UT_STR::IMatch(nullptr, "*"), 1);
}

TEST(UtStr, IMatchStaysFastOnHostileStars) {
    // Exponential backtracking would never finish on this.
    std::string text(20000, 'a');
    std::string pattern;
    for (int i = 0; i < 40; ++i) pattern += "*a";
    pattern += "*b";
    EXPECT_EQ(UT_STR::IMatch(text.c_str(), pattern.c_str()), 0);
    text.back() = 'b';
    EXPECT_EQ(UT_STR::IMatch(text.c_str(), pattern.c_str()), 1);
}

TEST(UtStr, FindStringAndGetToken) {
    const char* text = "lib/cells/x.v";
    EXPECT_EQ(UT_STR::FindString(text, "cells"), text + 4);
    EXPECT_EQ(UT_STR::FindString(text, "none"), nullptr);
    EXPECT_EQ(UT_STR::FindString(nullptr, "a"), nullptr);
    for (const nlwtest::Row& c : nlwtest::Table("tokens")) {
        std::string token = "stale";
        EXPECT_EQ(UT_STR::GetToken(c[0].c_str(), token, c[1].c_str()), c[2][0]) << c[0];
        EXPECT_EQ(token, c[3]) << c[0];
    }
}

TEST(UtPath, BaseRootAndDirectory) {
    for (const nlwtest::Row& c : nlwtest::Table("paths")) {
        EXPECT_EQ(UT_PATH::GetBase(c[0].c_str()), c[1]) << c[0];
        EXPECT_EQ(UT_PATH::GetRoot(c[0].c_str()), c[2]) << c[0];
        EXPECT_STREQ(Port::FileName(c[0].c_str()).GetPath(), c[3].c_str()) << c[0];
    }
    EXPECT_EQ(UT_PATH::GetRoot(nullptr), "");
    EXPECT_STREQ(Port::FileName(nullptr).GetPath(), "");
    EXPECT_EQ(UT_PATH::InternalPath("c:\\work\\top.v"), "c:/work/top.v");
    EXPECT_EQ(UT_PATH::ExternalPath("a/b/c.v"), "a/b/c.v");
}

TEST(NameCache, CountsEachNameAndKeepsEntriesInPlace) {
    UT_NCH_CACHE cache;
    EXPECT_EQ(cache.find("a"), nullptr);
    UT_NCH_NAME* a = cache.add("a", 1);
    EXPECT_EQ(a->GetCount(), 1);
    EXPECT_EQ(cache.add("a", 1)->GetCount(), 2);
    EXPECT_EQ(cache.add("A", 1)->GetCount(), 1);  // exact comparison
    EXPECT_EQ(cache.add("", 1)->GetCount(), 1);
    EXPECT_EQ(cache.size(), 3u);
    // Enough names to make the table grow several times.
    for (int i = 0; i < 5000; ++i) cache.add(vorform("name%d", i), 1);
    EXPECT_EQ(cache.find("a"), a);
    EXPECT_EQ(cache.add("a", 1)->GetCount(), 3);
    EXPECT_STREQ(a->GetName(), "a");
}

// ---------------------------------------------------------------------------
// The message manager: counts, capture, console presentation and log file.

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

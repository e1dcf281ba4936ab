// Identifier escaping, bus range and index text, reserved words, the name
// legalizer and the usage texts.

#include <cstdio>

#include "Nlw_Verilog.h"
#include "Nlw_VerilogLU.h"
#include "TestFiles.h"
#include "model/Nlw_NlBuilder.h"

namespace {

// Names are split by the output style while a design is written.
class VerilogText : public ::testing::Test {
protected:
    void SetUp() override { Nlw_NlBus::SetInputDelimiterType(4); }
    Nlw_Verilog nlw;
};

TEST_F(VerilogText, EscapesExactlyTheNamesThatAreNoSimpleIdentifiers) {
    for (const nlwtest::Row& c : nlwtest::Table("escapes"))
        EXPECT_EQ(nlw.Escape(c[0].c_str(), c[1] == "1"), c[2]) << c[0] << " " << c[1];
    // Long names survive whole.
    const std::string longName(5000, 'n'), longStem(4000, 'c');
    EXPECT_EQ(nlw.Escape(longName.c_str(), 0), longName);
    EXPECT_EQ(nlw.Escape((longStem + "-[12]").c_str(), 1), "\\" + longStem + "- [12]");
}

// Results share one buffer; a name that is escaped already comes back as the
// caller's pointer, yet the call still takes the buffer over like any other.
TEST_F(VerilogText, EscapedNamesComeBackAsTheCallersPointer) {
    const char* first = nlw.Escape("a-b", 0);
    EXPECT_EQ(nlw.Escape("c-d", 0), first);
    EXPECT_STREQ(first, "\\c-d ");
    for (const unsigned char isBused : {0, 1}) {
        for (const char* name : {"\\a-b ", "\\x y [2]"}) {
            EXPECT_EQ(nlw.Escape(name, isBused), name);
            EXPECT_STREQ(first, name) << int(isBused);
        }
    }
    EXPECT_STREQ(nlw.Escape(nlw.Escape("x y", 0), 0), "\\x y ");
}

TEST_F(VerilogText, RecognisesEscapedForms) {
    for (const char* name : {"\\a-b ", "\\a b [3]", "\\ ", "\\a [3] "})
        EXPECT_TRUE(nlw.IsEscaped(name)) << name;
    for (const char* name : {"a-b", "\\a-b", "a b ", "", "\\a[3]", "\\a b [3"})
        EXPECT_FALSE(nlw.IsEscaped(name)) << name;
}

// Marks its own escaped form and index text: Escape and the legalizer must
// ask through the virtual operations.
class MarkedVerilog : public Nlw_Verilog {
public:
    unsigned char IsEscaped(const char* name) override {
        return std::string(name) == "keep me" || Nlw_Verilog::IsEscaped(name);
    }
    const char* GetIndexesString(DARRAY_Util_INT32*) override { return "<i>"; }
};

TEST_F(VerilogText, EscapeAsksThroughTheVirtualOperations) {
    MarkedVerilog marked;
    const char* keep = "keep me";
    EXPECT_EQ(marked.Escape(keep, 0), keep);
    EXPECT_STREQ(marked.Escape("a-b[3]", 1), "\\a-b <i>");
    EXPECT_STREQ(marked.Escape("ab[3]", 1), "ab<i>");
}

TEST_F(VerilogText, WritesBusRangesInTheBusOrder) {
    Nlw_NlView view;
    Nlw_NlBuilder builder(&view);
    Nlw_NlBlock* top = builder.CreateRoot(builder.AddModuleType("top"), "top");
    Nlw_NlBus* bus = builder.AddSignalBus(top, "d", 7, 0);
    const char* first = nlw.GetRangeString(bus);
    EXPECT_STREQ(first, "[7 : 0]");
    for (int order : {1, 5}) {
        bus->SetOrder(0, order);
        EXPECT_STREQ(nlw.GetRangeString(bus), "[0 : 7]");
    }
    EXPECT_EQ(nlw.GetRangeString(builder.AddSignalBus(top, "s", 3, -2)), first);
    EXPECT_STREQ(first, "[3 : -2]");
}

TEST_F(VerilogText, WritesBusIndexes) {
    DARRAY_Util_INT32 indexes;
    indexes.Add(-1);
    const char* first = nlw.GetIndexesString(&indexes);
    EXPECT_STREQ(first, "[-1]");
    indexes[0] = 3;
    EXPECT_STREQ(nlw.GetIndexesString(&indexes), "[3]");
    // An empty array leaves the previous text.
    DARRAY_Util_INT32 empty;
    EXPECT_EQ(nlw.GetIndexesString(&empty), first);
    EXPECT_STREQ(first, "[3]");
}

TEST(VerilogReservedWords, ListsTheKeywordsInOrder) {
    Nlw_Verilog nlw;
    std::vector<std::string> all;
    for (const char** w = nlw.GetReservedWords(); *w != nullptr; ++w) all.push_back(*w);
    ASSERT_EQ(all.size(), 103u);
    EXPECT_EQ(all[0], "always");
    EXPECT_EQ(all[44], "module");
    EXPECT_EQ(all[102], "xor");
    // The table is in alphabetical order; a swapped or misspelt word shows.
    for (size_t i = 1; i < all.size(); ++i) EXPECT_LT(all[i - 1], all[i]) << all[i];
}

// ---------------------------------------------------------------------------
// The Verilog name legalizer: which names are legal and what the others
// become, with and without escaping at write time.

// A name is legal exactly when Legalize leaves it alone, and a legalized name
// keeps its length.
TEST(VerilogLU, LegalizesWhatTheOutputStyleCannotWrite) {
    Nlw_NlBus::SetInputDelimiterType(4);
    Nlw_Verilog nlw;
    std::vector<nlwtest::Row> cases = nlwtest::Table("verilog_lu");
    cases.push_back({"0", std::string(3000, '-') + "[5]", "1", std::string(3000, '_') + "[5]"});
    for (const nlwtest::Row& c : cases) {
        SCOPED_TRACE(c[1].substr(0, 20) + (c[2] == "1" ? " bused" : "") +
                     (c[0] == "1" ? " escaping" : ""));
        Nlw_VerilogLU lu(&nlw, nullptr, true, c[0] == "1", true, true, false);
        const Port::String name(c[1].c_str());
        EXPECT_EQ(lu.IsLegal(name, c[2] == "1"), c[1] == c[3]);
        const Port::String result = lu.Legalize(name, c[2] == "1");
        EXPECT_EQ(result.str(), c[3]);
        EXPECT_EQ(result.length(), c[1].size());
    }
}

// The legalizer too asks through the writer's virtual operations.
TEST(VerilogLU, AsksTheWriterThroughItsVirtualOperations) {
    MarkedVerilog marked;
    Nlw_VerilogLU lu(&marked, nullptr, true, true, true, true, false);
    EXPECT_TRUE(lu.IsLegal(Port::String("keep me"), false));
    EXPECT_EQ(lu.Legalize(Port::String("keep me"), false).str(), "keep me");
    EXPECT_EQ(lu.Legalize(Port::String("a b[2]"), true).str(), "a_b<i>");
}

// ---------------------------------------------------------------------------
// Usage texts: the synopses the constructors store and the two help printers.

TEST(VerilogUsage, EachApplicationHasItsSynopsis) {
    Nlw_Verilog qdb2ver;
    EXPECT_STREQ(qdb2ver.GetApplicationName(), "qdb2ver");
    nlwtest::ExpectGolden("usage/qdb2ver_synopsis", qdb2ver.GetUsage());
    nlwtest::ExpectGolden("usage/tessel_synopsis", Nlw_Verilog("tessel").GetUsage());
}

TEST(VerilogUsage, ConstructorsSetTheBusStyles) {
    Nlw_NlBus::SetMultiDimensions(true);
    Nlw_NlBus::SetInputDelimiterType(4);
    Nlw_NlBus::SetOutputDelimiterType(7);
    Nlw_Verilog nlw("tessel");
    EXPECT_FALSE(Nlw_NlBus::GetMultiDimensions());
    EXPECT_EQ(Nlw_NlBus::GetInputDelimiterType(), 7);
    EXPECT_EQ(Nlw_NlBus::GetOutputDelimiterType(), 4);
}

TEST(VerilogUsage, GetHelpChoosesThePrinterByApplicationName) {
    for (const nlwtest::Row& c : nlwtest::Table("help_printers")) {
        Nlw_Verilog nlw(c[0].c_str());
        const Nlw_NetlistWriter::HelpFunction expected =
            c[1] == "1" ? &Nlw_Verilog::Help : &Nlw_Verilog::TesselHelp;
        EXPECT_EQ(nlw.GetHelp(), expected) << c[0];
    }
    Nlw_Verilog byDefault;
    EXPECT_EQ(byDefault.GetHelp(), &Nlw_Verilog::Help);
}

TEST(VerilogUsage, HelpIssuesTheOptionListLineByLine) {
    Port_MsgCapture capture;
    Nlw_Verilog::Help();
    ASSERT_EQ(capture.msgs.size(), 26u);
    EXPECT_EQ(capture.msgs[0].domain, "NetListWriters");
    nlwtest::ExpectGolden("usage/qdb2ver_help",
                          nlwtest::Joined(capture.Texts(Port_MsgLevel::Status)));
}

// tessel's overview, each status line followed by a newline of its own.
const std::string kTesselOverview = nlwtest::Data("golden/usage/tessel_overview.txt");

// Tells on stderr when the status lines issued so far are the overview, so
// that the dying process can be judged by its output.
class OverviewSink : public Port_MsgSink {
public:
    void Receive(const Port_Msg& msg) override {
        if (msg.level == Port_MsgLevel::Status) lines_.push_back(msg.text);
        if (nlwtest::Joined(lines_) == kTesselOverview) std::fputs("[overview complete]", stderr);
    }

private:
    std::vector<std::string> lines_;
};

void RunTesselHelp() {
    static OverviewSink sink;
    Port_MsgManager::Instance().AddSink(&sink);
    Nlw_Verilog::TesselHelp();
}

TEST(VerilogUsageDeathTest, TesselHelpIssuesTheOverviewAndExits) {
    EXPECT_EXIT(RunTesselHelp(), ::testing::ExitedWithCode(0), "\\[overview complete\\]");
}

}  // namespace

// Usage texts: the synopses the constructors store and the two help printers.
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "Nlw_Verilog.h"
#include "TestFiles.h"

namespace {

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
    const struct {
        const char* appName;
        bool isQdb2ver;
    } cases[] = {
        {"qdb2ver", true},   {"QDB2VER", true}, {"Qdb2Ver", true}, {"tessel", false},
        {"qdb2ver2", false}, {"qdb2", false},   {"", false},
    };
    for (const auto& c : cases) {
        Nlw_Verilog nlw(c.appName);
        const Nlw_NetlistWriter::HelpFunction expected =
            c.isQdb2ver ? &Nlw_Verilog::Help : &Nlw_Verilog::TesselHelp;
        EXPECT_EQ(nlw.GetHelp(), expected) << c.appName;
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

const std::vector<std::string> kTesselLines = {
    "\n",
    "Use \"tessel -h <netlist_type>\" to display netlist-specific options. \n",
    "Valid netlist_types are: \n\n",
    "    equivalence or ecn (display options for equivalence checking netlist)\n",
    "    simulation  or sim (display options for simulation netlist)\n",
    "    static      or sta (display options for static timing analysis netlist)\n\n",
    "tessel extracts design data from the input file and generates netlist compatible with "
    "supported equivalence checking, simulation or static timing analysis tools.\n\n",
};

// Tells on stderr when the status lines issued so far are the overview, so
// that the dying process can be judged by its output.
class OverviewSink : public Port_MsgSink {
public:
    void Receive(const Port_Msg& msg) override {
        if (msg.level == Port_MsgLevel::Status) lines_.push_back(msg.text);
        if (lines_ == kTesselLines) std::fputs("[overview complete]", stderr);
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

// The stock netlist head, the run-parameter block, the closing notices and
// the output file names.
#include "TestFiles.h"
#include "VerilogWriterTest.h"
#include "framework/Nlw_Writer.h"

// Reaches the writer object's private parts.
struct Nlw_VerilogTestPeer {
    static void WriteParams(Nlw_Verilog& n, Nlw_Writer* w) { n.WriteParams(w); }
    static void PrintInfoMessage(Nlw_Verilog& n) { n.PrintInfoMessage(); }
    static bool IsChipwideNeeded(Nlw_Verilog& n) { return n.IsChipwideNeeded(); }
    static std::string RootFileName(Nlw_Verilog& n, const char* suffix) {
        return n.GetRootFileName(suffix);
    }
    static std::string Directory(Nlw_Verilog& n) { return n.GetOutputDirectory(); }
    static std::string SdfFileName(Nlw_Verilog& n) { return n.GetSdfFileName(); }
    static std::string SdfMHPrefix(Nlw_Verilog& n) { return n.GetSdfMHPrefix(); }
    static std::string AssertionFileName(Nlw_Verilog& n) { return n.GetAssertionFileName(); }
};

namespace {

using Peer = Nlw_VerilogTestPeer;

// A writer that keeps its text in memory.
class MemoryWriter : public Nlw_Writer {
public:
    explicit MemoryWriter(Nlw_NetlistWriter* nlw)
        : Nlw_Writer(nlw, "memory", Port::Stream::Memory) {}
    void WriteView(Nlw_NlView*, unsigned char) override {}
    void WriteBlock(Nlw_NlBlock*) override {}
};

const char* const kNoticeStart =
    "If Verilog simulation is performed outside the Atelier environment, please add the "
    "chipwide module to the simulation invocation command. ";
class VerilogHeader : public vwtest::WriterTest {
protected:
    VerilogHeader() { top = b_.CreateRoot(b_.AddModuleType("top"), "top"); }

    std::string Header() {
        MemoryWriter writer(&nlw_);
        nlw_.WriteHeader(&writer);
        return writer.GetMemoryText();
    }
    size_t Notices(const Port_MsgCapture& capture) {
        size_t count = 0;
        for (const std::string& text : capture.Texts(Port_MsgLevel::Info))
            if (text.rfind(kNoticeStart, 0) == 0) ++count;
        return count;
    }

    Nlw_NlBlock* top = nullptr;
};

TEST_F(VerilogHeader, WritesTheDisclaimerOfTheMode) {
    nlwtest::ExpectGolden("header/simulation", Header());
    params_.SetStaMode(true);
    nlwtest::ExpectGolden("header/static_timing", Header());
    // Equivalence mode wins over static timing mode.
    params_.SetEcnMode(true);
    params_.SetWritePsTimePrecision(false);
    nlwtest::ExpectGolden("header/equivalence", Header());
}

TEST_F(VerilogHeader, ChipwideIsNeededForUndrivenGlobalsOrTheTopProperty) {
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw_));

    // A global set/reset that stands for a pin is provided by that pin.
    Nlw_NlSignal* gsr = b_.AddSignal(top, "GSR");
    b_.SetSetReset(gsr);
    Nlw_NlPin* pin = b_.AddPort(top, "GSR_PORT", NLW_DIR_INPUT);
    b_.SetRefPin(gsr, pin);
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw_));

    // An undriven global tristate without a pin needs the module.
    Nlw_NlSignal* gts = b_.AddSignal(top, "GTS");
    b_.SetTristate(gts);
    EXPECT_TRUE(Peer::IsChipwideNeeded(nlw_));

    // Driven, it does not.
    Nlw_NlType* driverType = b_.AddLibraryType("DRV", true, false);
    b_.AddTypePin(driverType, "O", NLW_DIR_OUTPUT);
    Nlw_NlBlock* driver = b_.CreateLeaf(top, driverType, "drv");
    b_.Connect(driver->GetPin(0), gts);
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw_));

    top->AddProperty(Vdm_Property::NewBool("NLW_CHIPWIDE_MODULE", true));
    EXPECT_TRUE(Peer::IsChipwideNeeded(nlw_));
}

TEST_F(VerilogHeader, ChipwideNoticeOncePerHeadAndAtTheEnd) {
    top->AddProperty(Vdm_Property::NewString("NLW_CHIPWIDE_MODULE", "1"));
    {
        Port_MsgCapture capture;
        Header();
        Header();
        Peer::PrintInfoMessage(nlw_);
        EXPECT_EQ(Notices(capture), 3u);
        const std::string last = capture.Texts(Port_MsgLevel::Info).back();
        EXPECT_EQ(last.substr(last.size() - 2), " \n");
        EXPECT_GT(last.size(), std::string(kNoticeStart).size() + 2);
    }
    // With a test fixture the fixture provides the globals.
    params_.SetWriteTestFile(true);
    {
        Port_MsgCapture capture;
        Header();
        Peer::PrintInfoMessage(nlw_);
        EXPECT_EQ(Notices(capture), 0u);
    }
}

TEST_F(VerilogHeader, ClosingNoticesNameTheSimulationLibrary) {
    for (bool funcell : {false, true}) {
        params_.SetFuncellMode(funcell);
        Port_MsgCapture capture;
        Peer::PrintInfoMessage(nlw_);
        EXPECT_EQ(capture.msgs.size(), 4u);
        nlwtest::ExpectGolden(funcell ? "header/closing_funcell" : "header/closing_timcell",
                              nlwtest::Joined(capture.Texts(Port_MsgLevel::Info)));
    }

    // Outside simulation only the chipwide notice can follow.
    params_.SetSimMode(false);
    params_.SetStaMode(true);
    {
        Port_MsgCapture capture;
        Peer::PrintInfoMessage(nlw_);
        EXPECT_TRUE(capture.msgs.empty());
    }
    b_.SetSetReset(b_.AddSignal(top, "GSR"));
    {
        Port_MsgCapture capture;
        Peer::PrintInfoMessage(nlw_);
        ASSERT_EQ(capture.msgs.size(), 1u);
        EXPECT_EQ(Notices(capture), 1u);
    }
}

TEST_F(VerilogHeader, WriteParamsListsTheRun) {
    params_.SetCommandLine("qdb2ver -w in.qdb out.v");
    params_.SetInputFileName("in.qdb");
    params_.SetOutputFileName("out.v");
    params_.SetVornix("/opt/vx");
    b_.CreateMacro(top, b_.AddModuleType("sub"), "u1");
    MemoryWriter writer(&nlw_);
    Peer::WriteParams(nlw_, &writer);
    nlwtest::ExpectGolden("header/write_params_lists_the_run", writer.GetMemoryText());
}

TEST_F(VerilogHeader, FileNamesDeriveFromTheNetlistName) {
    for (const nlwtest::Row& c : nlwtest::Table("file_names")) {
        params_.SetOutputFileName(c[0].c_str());
        params_.SetSdfPath(nlwtest::Opt(c[1]));
        EXPECT_EQ(Peer::SdfFileName(nlw_), c[2]) << c[0];
        EXPECT_EQ(Peer::SdfMHPrefix(nlw_), c[3]) << c[0];
        EXPECT_EQ(Peer::Directory(nlw_), c[4]) << c[0];
    }

    params_.SetOutputFileName("out/top.v");
    EXPECT_EQ(Peer::RootFileName(nlw_, ".pin"), "out/top.pin");
    EXPECT_EQ(Peer::RootFileName(nlw_, "_mhf_info.txt"), "out/top_mhf_info.txt");
    EXPECT_EQ(Peer::RootFileName(nlw_, "_ism.v"), "out/top_ism.v");

    params_.SetEcnTool("Formality");
    EXPECT_EQ(Peer::AssertionFileName(nlw_), "out/top.svf");
    params_.SetEcnTool("conformal");
    EXPECT_EQ(Peer::AssertionFileName(nlw_), "out/top.vxc");

    // Names of any length are formed whole.
    const std::string longDir(1500, 'd');
    params_.SetOutputFileName((longDir + "/top.v").c_str());
    EXPECT_EQ(Peer::RootFileName(nlw_, ".pin"), longDir + "/top.pin");
}

}  // namespace

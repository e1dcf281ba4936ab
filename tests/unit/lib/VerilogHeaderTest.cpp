// The stock netlist head, the run-parameter block, the closing notices and
// the output file names.
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

const char* const kSimBlock =
    "// This verilog netlist is a simulation model and uses simulation \n"
    "// primitives which may not represent the true implementation of the \n"
    "// device, however the netlist is functionally correct and should not \n"
    "// be modified. This file cannot be synthesized and should only be used \n"
    "// with supported simulation tools.\n"
    "\n";

const char* const kLibraryBlockStart =
    "// This verilog netlist is a simulation model and uses library \n"
    "// primitives which may not represent the true implementation of \n"
    "// the device, however the netlist is functionally correct and \n"
    "// should not be modified. This file cannot be synthesized and \n";

const char* const kNoticeStart =
    "If Verilog simulation is performed outside the Atelier environment, please add the "
    "chipwide module to the simulation invocation command. ";

const char* const kNoVornix =
    " The VORNIX environment variable must be set for this program towork. Please check your "
    "environment to ensure that it is setup properly to use the Vornix tools\n";
const char* const kNoTimcells =
    "Timcell library directory not found, the `uselib constructis omitted for the -ul "
    "option.\n";

class VerilogHeader : public ::testing::Test {
protected:
    void SetUp() override {
        nlw.SetParams(&params);
        nlw.SetView(&view);
        nlw.SetDesign(&design);
        top = builder.CreateRoot(builder.AddModuleType("top"), "top");
    }

    std::string Header() {
        MemoryWriter writer(&nlw);
        nlw.WriteHeader(&writer);
        return writer.GetMemoryText();
    }

    size_t Notices(const Port_MsgCapture& capture) {
        size_t count = 0;
        for (const std::string& text : capture.Texts(Port_MsgLevel::Info))
            if (text.rfind(kNoticeStart, 0) == 0) ++count;
        return count;
    }

    Nlw_Verilog nlw;
    Nlw_Params params;
    Nlw_NlView view;
    Nlw_Design design{"demo"};
    Nlw_NlBuilder builder{&view};
    Nlw_NlBlock* top = nullptr;
};

TEST_F(VerilogHeader, WritesTheDisclaimerOfTheMode) {
    EXPECT_EQ(Header(), std::string(kSimBlock) + "`timescale 1 ns/1 ps\n\n");

    params.SetStaMode(true);
    EXPECT_EQ(Header(), std::string(kLibraryBlockStart) +
                            "// should only be used with supported static timing analysis "
                            "tools. \n\n`timescale 1 ns/1 ps\n\n");

    // Equivalence mode wins over static timing mode.
    params.SetEcnMode(true);
    params.SetWritePsTimePrecision(false);
    EXPECT_EQ(Header(), std::string(kLibraryBlockStart) +
                            "// should only be used with supported equivalence checking tools. "
                            "\n\n`timescale 1 ns/10 ps\n\n");
}

TEST_F(VerilogHeader, UselibNamesTheFirstRootHoldingTheTimcells) {
    vwtest::TempDir tmp;
    const std::string a = tmp.Dir("a/verilog/src"), b = tmp.Dir("b/verilog/src/timcells");
    const std::string file = tmp.File("f", "x");
    struct Case {
        std::string roots;
        std::string uselib;
        std::vector<std::string> errors;
    };
    const Case cases[] = {
        {file + ":" + tmp.Path() + "/a:" + tmp.Path() + "/b:" + tmp.Path() + "/missing",
         "`uselib dir=" + b + " libext=.v\n",
         {}},
        {tmp.Path(), "", {kNoTimcells}},  // left out with an error
        {"", "", {kNoVornix, kNoTimcells}},
    };
    params.SetWriteUseLib(true);
    for (const Case& c : cases) {
        vwtest::ScopedEnv vornix("VORNIX", c.roots.c_str());
        Port_MsgCapture capture;
        EXPECT_EQ(Header(), std::string(kSimBlock) + "`timescale 1 ns/1 ps\n" + c.uselib + "\n")
            << c.roots;
        EXPECT_EQ(capture.Texts(Port_MsgLevel::Error), c.errors) << c.roots;
    }
}

TEST_F(VerilogHeader, ChipwideIsNeededForUndrivenGlobalsOrTheTopProperty) {
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw));

    // A global set/reset that stands for a pin is provided by that pin.
    Nlw_NlSignal* gsr = builder.AddSignal(top, "GSR");
    builder.SetSetReset(gsr);
    Nlw_NlPin* pin = builder.AddPort(top, "GSR_PORT", NLW_DIR_INPUT);
    builder.SetRefPin(gsr, pin);
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw));

    // An undriven global tristate without a pin needs the module.
    Nlw_NlSignal* gts = builder.AddSignal(top, "GTS");
    builder.SetTristate(gts);
    EXPECT_TRUE(Peer::IsChipwideNeeded(nlw));

    // Driven, it does not.
    Nlw_NlType* driverType = builder.AddLibraryType("DRV", true, false);
    builder.AddTypePin(driverType, "O", NLW_DIR_OUTPUT);
    Nlw_NlBlock* driver = builder.CreateLeaf(top, driverType, "drv");
    builder.Connect(driver->GetPin(0), gts);
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw));

    top->AddProperty(Vdm_Property::NewBool("NLW_CHIPWIDE_MODULE", true));
    EXPECT_TRUE(Peer::IsChipwideNeeded(nlw));
}

TEST_F(VerilogHeader, ChipwideNoticeOncePerHeadAndAtTheEnd) {
    top->AddProperty(Vdm_Property::NewString("NLW_CHIPWIDE_MODULE", "1"));
    {
        Port_MsgCapture capture;
        Header();
        Header();
        Peer::PrintInfoMessage(nlw);
        EXPECT_EQ(Notices(capture), 3u);
        const std::string last = capture.Texts(Port_MsgLevel::Info).back();
        EXPECT_EQ(last.substr(last.size() - 2), " \n");
        EXPECT_GT(last.size(), std::string(kNoticeStart).size() + 2);
    }
    // With a test fixture the fixture provides the globals.
    params.SetWriteTestFile(true);
    {
        Port_MsgCapture capture;
        Header();
        Peer::PrintInfoMessage(nlw);
        EXPECT_EQ(Notices(capture), 0u);
    }
}

TEST_F(VerilogHeader, ClosingNoticesNameTheSimulationLibrary) {
    const std::vector<std::string> rest = {
        "Setup Simulation - To perform a setup simulation, specify values in the Maximum (MAX) "
        "field with the following command line modifier:  -SDFMAX\n",
        "Hold Simulation - To perform the most accurate hold simulation, specify values in the "
        "Minimum (MIN) field with the following command line modifier:  -SDFMIN\n",
        "For more information on how to pass the SDF switches to the simulator, see your "
        "Simulator tool documentation.\n",
    };
    for (bool funcell : {false, true}) {
        params.SetFuncellMode(funcell);
        const char* lib = funcell ? "FUNCELL" : "TIMCELL";
        std::vector<std::string> expected = {
            std::string("The generated Verilog netlist contains Vornix ") + lib +
            " simulation primitives and has to be used with " + lib +
            " simulation library for correct compilation and simulation. \n"};
        expected.insert(expected.end(), rest.begin(), rest.end());
        Port_MsgCapture capture;
        Peer::PrintInfoMessage(nlw);
        EXPECT_EQ(capture.Texts(Port_MsgLevel::Info), expected);
        EXPECT_EQ(capture.msgs.size(), 4u);
    }

    // Outside simulation only the chipwide notice can follow.
    params.SetSimMode(false);
    params.SetStaMode(true);
    {
        Port_MsgCapture capture;
        Peer::PrintInfoMessage(nlw);
        EXPECT_TRUE(capture.msgs.empty());
    }
    builder.SetSetReset(builder.AddSignal(top, "GSR"));
    {
        Port_MsgCapture capture;
        Peer::PrintInfoMessage(nlw);
        ASSERT_EQ(capture.msgs.size(), 1u);
        EXPECT_EQ(Notices(capture), 1u);
    }
}

TEST_F(VerilogHeader, WriteParamsListsTheRun) {
    params.SetCommandLine("qdb2ver -w in.qdb out.v");
    params.SetInputFileName("in.qdb");
    params.SetOutputFileName("out.v");
    params.SetVornix("/opt/vx");
    builder.CreateMacro(top, builder.AddModuleType("sub"), "u1");
    MemoryWriter writer(&nlw);
    Peer::WriteParams(nlw, &writer);
    EXPECT_EQ(writer.GetMemoryText(),
              "// Command      : qdb2ver -w in.qdb out.v\n"
              "// Input file   : in.qdb\n"
              "// Output file  : out.v\n"
              "// Design name  : demo\n"
              "// # of Modules : 2\n"
              "// Vornix       : /opt/vx\n"
              "// Device       : NULL\n"
              "\n");
}

struct NameCase {
    const char* output;
    const char* sdfPath;  // null when none
    const char* sdf;
    const char* sdfPrefix;
    const char* directory;
};

TEST_F(VerilogHeader, FileNamesDeriveFromTheNetlistName) {
    const std::vector<NameCase> cases = {
        {"out/top.v", nullptr, "out/top.sdf", "out/", "out/"},
        {"out/top.v", "sdf", "sdf/top.sdf", "sdf/", "out/"},
        {"out/top.v", "", "top.sdf", "", "out/"},
        {"top.v", nullptr, "top.sdf", "", ""},
        {"/a/b.c/top.v", "/t", "/t/top.sdf", "/t/", "/a/b.c/"},
    };
    for (const NameCase& c : cases) {
        params.SetOutputFileName(c.output);
        params.SetSdfPath(c.sdfPath);
        EXPECT_EQ(Peer::SdfFileName(nlw), c.sdf) << c.output;
        EXPECT_EQ(Peer::SdfMHPrefix(nlw), c.sdfPrefix) << c.output;
        EXPECT_EQ(Peer::Directory(nlw), c.directory) << c.output;
    }

    params.SetOutputFileName("out/top.v");
    EXPECT_EQ(Peer::RootFileName(nlw, ".pin"), "out/top.pin");
    EXPECT_EQ(Peer::RootFileName(nlw, "_mhf_info.txt"), "out/top_mhf_info.txt");
    EXPECT_EQ(Peer::RootFileName(nlw, "_ism.v"), "out/top_ism.v");

    params.SetEcnTool("Formality");
    EXPECT_EQ(Peer::AssertionFileName(nlw), "out/top.svf");
    params.SetEcnTool("conformal");
    EXPECT_EQ(Peer::AssertionFileName(nlw), "out/top.vxc");

    // Names of any length are formed whole.
    const std::string longDir(1500, 'd');
    params.SetOutputFileName((longDir + "/top.v").c_str());
    EXPECT_EQ(Peer::RootFileName(nlw, ".pin"), longDir + "/top.pin");
}

}  // namespace

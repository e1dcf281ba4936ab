// The file heads: the stock netlist head, the run-parameter block, the
// closing notices and the output file names; the library search and the
// timing annotation statement; the chipwide module, the device-data maps and
// the included cell models.

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
using namespace vwtest;

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
    Nlw_NlSignal* gsr = b_.AddSignal(top_, "GSR");
    b_.SetSetReset(gsr);
    Nlw_NlPin* pin = b_.AddPort(top_, "GSR_PORT", NLW_DIR_INPUT);
    b_.SetRefPin(gsr, pin);
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw_));

    // An undriven global tristate without a pin needs the module.
    Nlw_NlSignal* gts = b_.AddSignal(top_, "GTS");
    b_.SetTristate(gts);
    EXPECT_TRUE(Peer::IsChipwideNeeded(nlw_));

    // Driven, it does not.
    Nlw_NlType* driverType = b_.AddLibraryType("DRV", true, false);
    b_.AddTypePin(driverType, "O", NLW_DIR_OUTPUT);
    Nlw_NlBlock* driver = b_.CreateLeaf(top_, driverType, "drv");
    b_.Connect(driver->GetPin(0), gts);
    EXPECT_FALSE(Peer::IsChipwideNeeded(nlw_));

    top_->AddProperty(Vdm_Property::NewBool("NLW_CHIPWIDE_MODULE", true));
    EXPECT_TRUE(Peer::IsChipwideNeeded(nlw_));
}

TEST_F(VerilogHeader, ChipwideNoticeOncePerHeadAndAtTheEnd) {
    top_->AddProperty(Vdm_Property::NewString("NLW_CHIPWIDE_MODULE", "1"));
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
    b_.SetSetReset(b_.AddSignal(top_, "GSR"));
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
    b_.CreateMacro(top_, b_.AddModuleType("sub"), "u1");
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

// ---------------------------------------------------------------------------
// File heads, the library search and the timing annotation statement.

class VerilogWriterPreamble : public vwtest::WriterTest {
protected:
    VerilogWriterPreamble() {
        params_.SetInsert_chipwide(false);
        params_.SetCommandLine("qdb2ver -w top.qdb");
        params_.SetInputFileName("top.qdb");
        params_.SetVornix("/opt/vornix");
        b_.SetDevice("vx100 fg256 -5", "vx100-fg256-5");
    }
    // The lines of the head from the purpose label to the time scale.
    std::string Purpose() {
        const std::string text = View();
        const size_t begin = text.find("// Purpose:");
        return text.substr(begin, text.find("`timescale") - begin);
    }
};

// Header fields are user texts inside "//" comments: a line break in one
// must not push the rest of the text out of the comment.
TEST_F(VerilogWriterPreamble, LineBreaksInHeaderFieldsStayInsideTheComment) {
    params_.SetCommandLine("qdb2ver \"a\nmodule evil;\" top.qdb");
    params_.SetInputFileName("dir\r\nx.qdb");
    const std::string text = View();
    EXPECT_NE(text.find("// Command\t: qdb2ver \"a module evil;\" top.qdb\n"), std::string::npos)
        << text;
    EXPECT_NE(text.find("// Input file\t: dir  x.qdb\n"), std::string::npos) << text;
    EXPECT_EQ(text.find("\nmodule evil"), std::string::npos);
}

TEST_F(VerilogWriterPreamble, SingleFileHead) {
    nlwtest::ExpectGolden("preamble/single_file_head", View());
}

TEST_F(VerilogWriterPreamble, ModuleFileNamesItsModule) {
    Nlw_NlBlock* sub = b_.CreateMacro(top_, b_.AddModuleType("sub"), "s1");
    auto writer = MakeWriter();
    writer->WriteMHBlock(sub);
    const std::string text = writer->GetMemoryText();
    EXPECT_NE(text.find("//  --|      |--  Filename: sub.v\n"), std::string::npos);
    EXPECT_NE(text.find("// Design Name\t: demo\n// Module Name: sub\n// Vornix  "),
              std::string::npos);
    EXPECT_EQ(View().find("Module Name"), std::string::npos);
}

TEST_F(VerilogWriterPreamble, PurposeTextsFollowTheModesInFixedOrder) {
    params_.SetSimMode(false);
    params_.SetStaMode(true);
    params_.SetEcnMode(true);
    params_.SetWritePsTimePrecision(false);
    nlwtest::ExpectGolden("preamble/purpose_texts_follow_the_modes_in_fixed_order", Purpose());
    EXPECT_NE(View().find("\n`timescale 1 ns/10 ps\n\n"), std::string::npos);
}

TEST_F(VerilogWriterPreamble, LibrarySearchTakesTheFirstRootHoldingTheDirectory) {
    params_.SetWriteUseLib(true);
    TempDir r1, r2, r3;
    const std::string plainFile = r1.File("plain", "x");
    r2.Dir("verilog/src/timcells");
    r2.Dir("verilog/src/funcells");
    r3.Dir("verilog/src/timcells");
    std::string out;
    for (const nlwtest::Row& c : nlwtest::Table("library_search")) {
        std::string roots = c[0];
        for (auto [tag, path] : {std::pair{"<plain>", plainFile},
                                 {"<r1>", r1.Path()},
                                 {"<r2>", r2.Path()},
                                 {"<r3>", r3.Path()}})
            roots = nlwtest::Replaced(roots, tag, path);
        vornix_.Set(roots.c_str());
        params_.SetFuncellMode(c[1] == "1");
        Port_MsgCapture capture;
        const std::string text = View();
        const size_t from = text.find("`timescale"), to = text.find("module top");
        out += c[0] + " " + c[1] + ":\n" +
               nlwtest::Replaced(text.substr(from, to - from), r2.Path(), "<r2>");
        for (const std::string& e : capture.Texts(Port_MsgLevel::Error)) out += "error: " + e;
    }
    nlwtest::ExpectGolden("preamble/library_search", out);
}

TEST_F(VerilogWriterPreamble, SdfAnnotateNeedsPropertyOptionAndEnvironment) {
    for (const nlwtest::Row& c : nlwtest::Table("sdf_annotate")) {
        if (c[0] == "1")
            top_->AddProperty(Vdm_Property::NewBool("NLW_SDFANNOTATED", true));
        else
            top_->RemoveProperty("NLW_SDFANNOTATED");
        params_.SetSdfAnnotate(c[1] == "1");
        params_.SetSdfPath(nlwtest::Opt(c[3]));
        ScopedEnv disable("VOR_SIMMODEL_DISABLE_SDF_ANNOTATE", c[2] == "1" ? "" : nullptr);
        EXPECT_EQ(Module(top_),
                  "module top (\n);\n" + c[4] + (c[4].empty() ? "" : "\n") + "endmodule\n\n");
    }
}

TEST_F(VerilogWriterPreamble, ShortModuleFileHead) {
    params_.SetWriteUseLib(true);
    params_.SetFuncellMode(true);  // the short head always looks for timcells
    root_.Dir("verilog/src/timcells");
    auto writer = MakeWriter();
    writer->WriteMHHeader(top_);
    nlwtest::ExpectGolden("preamble/short_head",
                          nlwtest::Replaced(writer->GetMemoryText(), root_.Path(), "<root>"));
    // The disclaimer follows the mode, equivalence checking first.
    params_.SetWriteUseLib(false);
    for (const char* tools : {"sta", "ecn"}) {
        params_.SetStaMode(true);
        params_.SetEcnMode(tools[0] == 'e');
        writer = MakeWriter();
        writer->WriteMHHeader(top_);
        nlwtest::ExpectGolden(std::string("preamble/short_head_") + tools, writer->GetMemoryText());
    }
}

// ---------------------------------------------------------------------------
// The chipwide module, the device-data maps and the included cell models.

const char* const kNoChipwide =
    "chipwide.v module can't be found in directory $VORNIX/verilog/src\n";

using Strings = std::vector<std::string>;
using Entries = std::vector<std::pair<std::string, std::string>>;

Entries ToEntries(const std::multimap<Port::String, Port::String>& map) {
    Entries out;
    for (const auto& e : map) out.emplace_back(e.first.str(), e.second.str());
    return out;
}

class VerilogWriterLibrary : public vwtest::WriterTest {
protected:
    std::string Chipwide() {
        auto writer = MakeWriter();
        writer->WriteChipwideModule();
        return writer->GetMemoryText();
    }
    // The cell models written ahead of the modules.
    std::string Models() {
        params_.SetWriteInstantiatedTimcells(true);
        params_.SetMHFMode(true);  // no module definitions
        return AfterHead(View());
    }
};

TEST_F(VerilogWriterLibrary, ChipwideIsCopiedInsideAGuard) {
    root_.File(
        "verilog/src/chipwide.v",
        "// $Header: /lib/chipwide.v,v 1.2 $\nmodule chipwide;\n\n  wire GSR; // $Header: x\n"
        "endmodule\n");
    EXPECT_EQ(Chipwide(),
              "\n`ifndef CHIPWIDE\n`define CHIPWIDE\nmodule chipwide;\n\nendmodule\n"
              "\n`endif\n\n");
}

TEST_F(VerilogWriterLibrary, ChipwideComesFromTheFirstRootHoldingIt) {
    TempDir r1, r2;
    const std::string plainFile = r1.File("plain", "x");
    r1.Dir("verilog/src");
    r2.File("verilog/src/chipwide.v", "second\n");
    root_.File("verilog/src/chipwide.v", "");
    Port_MsgCapture capture;
    vornix_.Set(
        (plainFile + ":/no/such:" + r1.Path() + ":" + r2.Path() + ":" + root_.Path()).c_str());
    EXPECT_EQ(Chipwide(), "\n`ifndef CHIPWIDE\n`define CHIPWIDE\nsecond\n\n`endif\n\n");
    // An empty source still gets its guard.
    vornix_.Set(root_.Path().c_str());
    EXPECT_EQ(Chipwide(), "\n`ifndef CHIPWIDE\n`define CHIPWIDE\n\n`endif\n\n");
    EXPECT_TRUE(capture.Texts(Port_MsgLevel::Warning).empty());
}

TEST_F(VerilogWriterLibrary, MissingChipwideIsReported) {
    nlw_.SetIsVornixCore(true);
    params_.SetFuncellMode(true);
    {
        Port_MsgCapture capture;
        EXPECT_EQ(Chipwide(), "// synthesis translate_off\n// synthesis translate_on\n");
        EXPECT_EQ(capture.Texts(Port_MsgLevel::Warning), Strings{kNoChipwide});
        EXPECT_TRUE(capture.Texts(Port_MsgLevel::Error).empty());
    }
    vornix_.Set("");
    Port_MsgCapture capture;
    EXPECT_EQ(Chipwide(), "// synthesis translate_off\n// synthesis translate_on\n");
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Error), Strings{kNoVornix});
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Warning), Strings{kNoChipwide});
}

TEST_F(VerilogWriterLibrary, DeviceDataItemsBecomeMapEntries) {
    root_.File("data/vdm2ver.acd",
               "BigEndingTimcell = V_FOO, V_BAR:ADDR:DATA, v_bar:'A:B'\n"
               "RecursiveInclusion = V_A:V_B:V_C, V_X\n");
    Port_MsgCapture capture;
    auto writer = MakeWriter();
    EXPECT_EQ(
        ToEntries(writer->GetBigEndingTimcellMap()),
        (Entries{{"V_BAR", "ADDR"}, {"V_BAR", "DATA"}, {"V_FOO", "V_FOO"}, {"v_bar", "A:B"}}));
    EXPECT_EQ(ToEntries(writer->GetRecursiveInclusionMap()),
              (Entries{{"V_A", "V_B"}, {"V_A", "V_C"}, {"V_X", "V_X"}}));
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Debug),
              (Strings{"Adding (V_A:V_B) to the recursive inclusion map.\n",
                       "Adding (V_A:V_C) to the recursive inclusion map.\n"}));
}

TEST_F(VerilogWriterLibrary, ModelsAreCopiedOnceAtTheirFirstNeed) {
    root_.File("data/vdm2ver.acd", "RecursiveInclusion = v_a:V_B:V_C, V_C\n");
    for (const char* m : {"V_A", "V_B", "V_C"})
        root_.File(std::string("verilog/src/timcells/") + m + ".v",
                   std::string("// $Header: ") + m + "\nmodule " + m + ";\nendmodule\n");
    Nlw_NlType* a = b_.AddLibraryType("V_A", true, false);
    b_.CreateLeaf(top_, b_.AddLibraryType("V_C", true, false), "c");
    b_.CreateLeaf(top_, a, "a1");
    b_.CreateLeaf(top_, a, "a2");
    b_.CreateLeaf(top_, b_.AddLibraryType("V_D", false, false), "d");
    Port_MsgCapture capture;
    nlwtest::ExpectGolden("library/models_once", Models());
    EXPECT_TRUE(capture.Texts(Port_MsgLevel::Error).empty());
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Debug).back(),
              "GetParams()->GetWriteInstantiatedTimcells() \n");
}

TEST_F(VerilogWriterLibrary, FunctionalModeLooksInFuncells) {
    root_.File("verilog/src/timcells/V_T.v", "timing\n");
    root_.File("verilog/src/funcells/V_T.v", "functional\n");
    b_.CreateLeaf(top_, b_.AddLibraryType("V_T", true, false), "t");
    EXPECT_EQ(Models(), "timing\n\n");
    params_.SetFuncellMode(true);
    EXPECT_EQ(Models(), "functional\n\n");
}

TEST_F(VerilogWriterLibrary, MissingModelsAreReportedOncePerFile) {
    // Lines longer than any read buffer are copied whole.
    const std::string longLine(3000, 'x');
    root_.File("verilog/src/timcells/V_OK.v", longLine + "\n");
    Nlw_NlBlock* sub = b_.CreateMacro(top_, b_.AddModuleType("sub"), "s");
    Nlw_NlType* missing = b_.AddLibraryType("V_MISSING", true, false);
    b_.CreateLeaf(top_, missing, "m1");
    b_.CreateLeaf(sub, missing, "m2");
    b_.CreateLeaf(sub, b_.AddLibraryType("V_OK", false, true), "ok");
    b_.CreateLeaf(top_, b_.AddLibraryType("V_SKIP", true, false), "skip")
        ->AddProperty(Vdm_Property::NewBool("NLW_NOT_INSTANTIATABLE", true));
    {
        Port_MsgCapture capture;
        EXPECT_EQ(Models(), longLine + "\n\n");
        EXPECT_EQ(capture.Texts(Port_MsgLevel::Error),
                  Strings{"No module file found for model V_MISSING.\n"});
    }
    vornix_.Set("");
    Port_MsgCapture capture;
    EXPECT_EQ(Models(), "");
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Error),
              (Strings{kNoVornix, "No module file found for model V_MISSING.\n", kNoVornix,
                       "No module file found for model V_OK.\n"}));
}

}  // namespace

// The chipwide module, the device-data maps and the included cell models.
#include "TestFiles.h"
#include "VerilogWriterTest.h"

namespace {

using vwtest::AfterHead;
using vwtest::TempDir;

using vwtest::kNoVornix;
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
    Nlw_NlBlock* top = b_.CreateRoot(b_.AddModuleType("top"), "top");
    Nlw_NlType* a = b_.AddLibraryType("V_A", true, false);
    b_.CreateLeaf(top, b_.AddLibraryType("V_C", true, false), "c");
    b_.CreateLeaf(top, a, "a1");
    b_.CreateLeaf(top, a, "a2");
    b_.CreateLeaf(top, b_.AddLibraryType("V_D", false, false), "d");
    Port_MsgCapture capture;
    nlwtest::ExpectGolden("library/models_once", Models());
    EXPECT_TRUE(capture.Texts(Port_MsgLevel::Error).empty());
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Debug).back(),
              "GetParams()->GetWriteInstantiatedTimcells() \n");
}

TEST_F(VerilogWriterLibrary, FunctionalModeLooksInFuncells) {
    root_.File("verilog/src/timcells/V_T.v", "timing\n");
    root_.File("verilog/src/funcells/V_T.v", "functional\n");
    Nlw_NlBlock* top = b_.CreateRoot(b_.AddModuleType("top"), "top");
    b_.CreateLeaf(top, b_.AddLibraryType("V_T", true, false), "t");
    EXPECT_EQ(Models(), "timing\n\n");
    params_.SetFuncellMode(true);
    EXPECT_EQ(Models(), "functional\n\n");
}

TEST_F(VerilogWriterLibrary, MissingModelsAreReportedOncePerFile) {
    // Lines longer than any read buffer are copied whole.
    const std::string longLine(3000, 'x');
    root_.File("verilog/src/timcells/V_OK.v", longLine + "\n");
    Nlw_NlBlock* top = b_.CreateRoot(b_.AddModuleType("top"), "top");
    Nlw_NlBlock* sub = b_.CreateMacro(top, b_.AddModuleType("sub"), "s");
    Nlw_NlType* missing = b_.AddLibraryType("V_MISSING", true, false);
    b_.CreateLeaf(top, missing, "m1");
    b_.CreateLeaf(sub, missing, "m2");
    b_.CreateLeaf(sub, b_.AddLibraryType("V_OK", false, true), "ok");
    b_.CreateLeaf(top, b_.AddLibraryType("V_SKIP", true, false), "skip")
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

// File heads, the library search and the timing annotation statement.
#include "TestFiles.h"
#include "VerilogWriterTest.h"

namespace {

using vwtest::ScopedEnv;
using vwtest::TempDir;

using vwtest::kNoVornix;
const char* const kNoLibrary =
    "Timcell library directory not found, the `uselib constructis omitted for the -ul option.\n";

class VerilogWriterPreamble : public vwtest::WriterTest {
protected:
    VerilogWriterPreamble() {
        top_ = b_.CreateRoot(b_.AddModuleType("top"), "top");
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

    Nlw_NlBlock* top_ = nullptr;
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
    struct Case {
        std::string roots;
        bool funcell;
        std::string line;  // empty: none found
        std::vector<std::string> errors;
    };
    const Case cases[] = {
        {plainFile + ":/no/such/dir:" + r1.Path() + ":" + r2.Path() + ":" + r3.Path(),
         false,
         "`uselib dir=" + r2.Path() + "/verilog/src/timcells libext=.v\n",
         {}},
        {r3.Path() + ":" + r2.Path(),
         true,
         "`uselib dir=" + r2.Path() + "/verilog/src/funcells libext=.v\n",
         {}},
        {r1.Path(), false, "", {kNoLibrary}},
        {"", false, "", {kNoVornix, kNoLibrary}},
    };
    for (const Case& c : cases) {
        vornix_.Set(c.roots.c_str());
        params_.SetFuncellMode(c.funcell);
        Port_MsgCapture capture;
        const std::string text = View();
        EXPECT_NE(text.find("`timescale 1 ns/1 ps\n" + c.line + "\nmodule top"), std::string::npos)
            << c.roots;
        EXPECT_EQ(capture.Texts(Port_MsgLevel::Error), c.errors) << c.roots;
    }
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

}  // namespace

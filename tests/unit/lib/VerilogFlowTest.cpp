// The design write flow: legalizing, the netlist files of both modes and the
// closing notices, observed through the files and messages a run leaves.
#include <algorithm>

#include "VerilogWriterTest.h"
#include "framework/Nlw_Nl_LU.h"

namespace {

namespace fs = std::filesystem;
using namespace nlwtest;

class VerilogFlow : public ::testing::Test {
protected:
    void SetUp() override {
        output = dir + "/top.v";
        params.SetOutputFileName(output.c_str());
        params.SetOutputFileMode(Port::Stream::Replace);
        params.SetInputFileType("qdb");
        nlw.SetParams(&params);
        nlw.SetView(&view);
        nlw.SetDesign(&design);

        // top holds two module instances whose types differ only in case,
        // and a net whose name no escaped identifier can hold.
        Nlw_NlBuilder builder(&view);
        Nlw_NlBlock* top = builder.CreateRoot(builder.AddModuleType("top"), "top");
        builder.CreateMacro(top, builder.AddModuleType("sub"), "u1");
        builder.CreateMacro(top, builder.AddModuleType("SUB"), "u2");
        spaced = builder.AddSignal(top, "a b");
        dashed = builder.AddSignal(top, "c-d");
        Nlw_Nl_SpkCache::Clear();
    }
    std::vector<std::string> Files() const {
        std::vector<std::string> names;
        for (const fs::directory_entry& e : fs::directory_iterator(dir))
            names.push_back(e.path().filename().string());
        std::sort(names.begin(), names.end());
        return names;
    }

    // Position of the first message with that text, or -1.
    static int IndexOf(const Port_MsgCapture& capture, const std::string& text) {
        for (size_t i = 0; i < capture.msgs.size(); ++i)
            if (capture.msgs[i].text == text) return static_cast<int>(i);
        return -1;
    }

    ScopedEnv noCache{"NLW_NO_NAMECACHE", nullptr};
    ScopedEnv noBridge{"VOR_NLW_LU_NO_BRIDGEID", nullptr};
    ScopedEnv noDump{"NLW_WRITE_NLWFILE", nullptr};
    TempDir tmp;
    std::string dir = tmp.Path(), output;
    Nlw_Verilog nlw;
    Nlw_Params params;
    Nlw_NlView view;
    Nlw_Design design{"demo"};
    Nlw_NlSignal* spaced = nullptr;
    Nlw_NlSignal* dashed = nullptr;
};

TEST_F(VerilogFlow, SingleModeWritesTheNetlistThenTheNotices) {
    Port_MsgCapture capture;
    nlw.WriteDesign();
    EXPECT_EQ(Files(), std::vector<std::string>{"top.v"});
    const int writing = IndexOf(capture, "Writing Verilog netlist file '" + output + "' ...\n");
    ASSERT_GE(writing, 0);
    EXPECT_EQ(capture.msgs[writing].level, Port_MsgLevel::Status);
    const int notice = IndexOf(capture,
                               "For more information on how to pass the SDF switches to the "
                               "simulator, see your Simulator tool documentation.\n");
    EXPECT_GT(notice, writing);
    EXPECT_EQ(Nlw_NlBus::GetInputDelimiterType(), 4);
}

class VerilogFlowLegalize : public VerilogFlow, public ::testing::WithParamInterface<int> {};

TEST_P(VerilogFlowLegalize, LegalizesNamesBeforeWritingAsTheSwitchesSay) {
    const nlwtest::Row c = nlwtest::Table("flow_legalize")[GetParam()];
    ScopedEnv set(c[0] != "-" ? c[0].c_str() : "NLW_NO_NAMECACHE", c[0] != "-" ? "" : nullptr);
    params.SetWriteEscapedNames(c[1] == "1");
    nlw.WriteDesign();
    const bool cache = c[0] != "NLW_NO_NAMECACHE";
    EXPECT_EQ(Nlw_Nl_SpkCache::IsBuilt(), cache);
    if (cache) {
        EXPECT_TRUE(Nlw_Nl_SpkCache::IsKeyword("specparam"));
    }
    EXPECT_STREQ(spaced->GetWritableName(), c[2].c_str());
    EXPECT_STREQ(spaced->GetAka(), nlwtest::Opt(c[3]));
    EXPECT_STREQ(dashed->GetWritableName(), c[4].c_str());
    EXPECT_EQ(Files(), std::vector<std::string>{"top.v"});
}

INSTANTIATE_TEST_SUITE_P(Switches, VerilogFlowLegalize, ::testing::Range(0, 4));

TEST_F(VerilogFlow, DumpsTheHostNetlistWhenAsked) {
    {
        ScopedEnv set("NLW_WRITE_NLWFILE", "");
        nlw.WriteDesign();
    }
    EXPECT_EQ(Files(), (std::vector<std::string>{"top.nlw", "top.v"}));
}

TEST_F(VerilogFlow, MultipleHierarchyWritesOneSafeFilePerModuleType) {
    // Module names that lead out of the folder or name the run's own files
    // still give a file each, inside the folder and apart from the others.
    Nlw_NlBuilder builder(&view);
    builder.CreateMacro(view.GetRootMacro(), builder.AddModuleType("../../esc"), "u3");
    builder.CreateMacro(view.GetRootMacro(), builder.AddModuleType("chipwide"), "u4");
    params.SetMHFMode(true);
    for (bool models : {false, true}) {
        SCOPED_TRACE(models);
        params.SetWriteInstantiatedTimcells(models);
        Port_MsgCapture capture;
        nlw.WriteDesign();
        // sub and SUB are two modules, and on a file system that ignores
        // case they must not share a file.
        std::vector<std::string> files = {"SUB.v",        "______esc.v", "chipwide.v",
                                          "chipwide_1.v", "sub_2.v",     "top.v"};
        if (models) files.push_back("top_ism.v");
        files.push_back("top_mhf_info.txt");
        EXPECT_EQ(Files(), files);
        const int netlists =
            IndexOf(capture, "Writing multiple Verilog netlists for design 'demo' ...\n");
        EXPECT_GE(netlists, 0);
        const int modelFile =
            IndexOf(capture, "Writing Verilog simulation model file '" + dir + "/top_ism.v' ...\n");
        if (models) {
            EXPECT_GT(modelFile, netlists);
        }
        EXPECT_GT(IndexOf(capture, "Writing hierarchy information file '" + dir +
                                       "/top_mhf_info.txt' ...\n"),
                  std::max(netlists, modelFile));
        // Every block names the file that holds its type (a module called
        // chipwide renamed by the legalizer); the shared files are listed as
        // written.
        nlwtest::ExpectGolden(
            models ? "flow/mhf_info_models" : "flow/mhf_info",
            nlwtest::Replaced(nlwtest::ReadFile(dir + "/top_mhf_info.txt"), dir, "<dir>"));
        for (const std::string& text : capture.Texts(Port_MsgLevel::Status))
            EXPECT_EQ(text.find("Writing Verilog netlist file"), std::string::npos) << text;
    }
}

TEST_F(VerilogFlow, RequestedFilesAreWrittenBesideTheNetlist) {
    params.SetWriteSdfFile(true);
    params.SetInputFileType("qda");
    params.SetWritePinFile(true);
    params.SetWriteTestFile(true);
    params.SetStaMode(true);
    params.SetSimMode(false);
    nlw.WriteDesign();
    EXPECT_EQ(Files(),
              (std::vector<std::string>{"top.pcs", "top.pin", "top.sdf", "top.tv", "top.v"}));
}

// The guidance file of each tool: one line per record of each FLOW part,
// every name as the netlist writes it (legalized, then escaped), the
// files of both tools from the same records; a -w-less run still gets its
// whole file although every FLOW key writes it.
TEST_F(VerilogFlow, AssertionFileFollowsTheToolsFlowWithWrittenNames) {
    ScopedEnv vornix("VORNIX", NLW_SOURCE_SHARE_DIR);
    params.SetOutputFileMode(Port::Stream::Create);
    params.SetEcnMode(true);
    params.SetSimMode(false);
    params.SetQdmFileName("design.qdm");
    Nlw_NlBlock* u1 = view.GetRootMacro()->GetChildren()[0];
    std::vector<AnnoVacuum>& records = nlw.GetAnnoVacuums();
    records.push_back(
        {AnnoVacuum::Renamed, view.GetRootMacro()->GetType(), "x-y", '0', nullptr, spaced});
    records.push_back({AnnoVacuum::Merged, u1->GetType(), "q.r[2]", '0', u1, nullptr});
    records.push_back({AnnoVacuum::Constant, u1->GetType(), "c", '1', nullptr, nullptr});
    const struct {
        const char* tool;
        const char* file;
    } cases[] = {{"Formality", "top.svf"}, {"other", "top.vxc"}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.tool);
        params.SetEcnTool(c.tool);
        Port_MsgCapture capture;
        nlw.WriteDesign();
        EXPECT_TRUE(capture.Texts(Port_MsgLevel::Error).empty());
        nlwtest::ExpectGolden(std::string("flow/assertions_") + c.file,
                              nlwtest::ReadFile(dir + "/" + c.file));
        fs::remove(output);
    }
}

TEST_F(VerilogFlow, NothingToWriteWithoutAView) {
    nlw.SetView(nullptr);
    Port_MsgCapture capture;
    nlw.WriteDesign();
    EXPECT_TRUE(Files().empty());
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Internal).size(), 1u);
}

}  // namespace

// The design write flow: legalizing, the netlist files of both modes and the
// closing notices, observed through the files and messages a run leaves.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

#include "Nlw_NlBuilder.h"
#include "Nlw_Nl_LU.h"
#include "Nlw_Verilog.h"

namespace {

namespace fs = std::filesystem;

class ScopedEnv {
public:
    ScopedEnv(const char* name, const char* value) : name_(name) {
        if (const char* old = getenv(name)) {
            hadOld_ = true;
            old_ = old;
        }
        if (value)
            setenv(name, value, 1);
        else
            unsetenv(name);
    }
    ~ScopedEnv() {
        if (hadOld_)
            setenv(name_.c_str(), old_.c_str(), 1);
        else
            unsetenv(name_.c_str());
    }

private:
    std::string name_;
    std::string old_;
    bool hadOld_ = false;
};

class VerilogFlow : public ::testing::Test {
protected:
    void SetUp() override {
        char pattern[] = "/tmp/nlw_flow_XXXXXX";
        dir = mkdtemp(pattern);
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
    void TearDown() override { fs::remove_all(dir); }

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
    std::string dir;
    std::string output;
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

TEST_F(VerilogFlow, DumpsTheHostNetlistWhenAsked) {
    {
        ScopedEnv set("NLW_WRITE_NLWFILE", "");
        nlw.WriteDesign();
    }
    EXPECT_EQ(Files(), (std::vector<std::string>{"top.nlw", "top.v"}));
}

TEST_F(VerilogFlow, LegalizesNamesBeforeWriting) {
    nlw.WriteDesign();
    EXPECT_TRUE(Nlw_Nl_SpkCache::IsBuilt());
    EXPECT_TRUE(Nlw_Nl_SpkCache::IsKeyword("specparam"));
    EXPECT_STREQ(spaced->GetWritableName(), "a_b");
    ASSERT_NE(spaced->GetAka(), nullptr);
    EXPECT_STREQ(spaced->GetAka(), "a b");
    // Escaped when written, so left alone.
    EXPECT_STREQ(dashed->GetWritableName(), "c-d");
}

TEST_F(VerilogFlow, LegalizesEveryCharacterWhenNamesAreNotEscaped) {
    params.SetWriteEscapedNames(false);
    nlw.WriteDesign();
    EXPECT_STREQ(spaced->GetWritableName(), "a_b");
    EXPECT_STREQ(dashed->GetWritableName(), "c_d");
}

TEST_F(VerilogFlow, NoNameCacheSkipsKeywordsAndLegalizer) {
    ScopedEnv set("NLW_NO_NAMECACHE", "");
    nlw.WriteDesign();
    EXPECT_FALSE(Nlw_Nl_SpkCache::IsBuilt());
    EXPECT_STREQ(spaced->GetWritableName(), "a b");
    EXPECT_EQ(Files(), std::vector<std::string>{"top.v"});
}

TEST_F(VerilogFlow, NoBridgeIdKeepsNoOriginalName) {
    ScopedEnv set("VOR_NLW_LU_NO_BRIDGEID", "");
    nlw.WriteDesign();
    EXPECT_STREQ(spaced->GetWritableName(), "a_b");
    EXPECT_EQ(spaced->GetAka(), nullptr);
}

TEST_F(VerilogFlow, MultipleHierarchyWritesOneFilePerModuleType) {
    params.SetMHFMode(true);
    Port_MsgCapture capture;
    nlw.WriteDesign();
    // The descending walk meets u2 (SUB) before u1 (sub), which then writes
    // nothing; the chipwide file is always written.
    EXPECT_EQ(Files(), (std::vector<std::string>{"SUB.v", "chipwide.v", "top.v"}));
    EXPECT_GE(IndexOf(capture, "Writing multiple Verilog netlists for design 'demo' ...\n"), 0);
    for (const std::string& text : capture.Texts(Port_MsgLevel::Status))
        EXPECT_EQ(text.find("Writing Verilog netlist file"), std::string::npos) << text;
}

TEST_F(VerilogFlow, MultipleHierarchyModelFileOnlyWhenAsked) {
    params.SetMHFMode(true);
    params.SetWriteInstantiatedTimcells(true);
    Port_MsgCapture capture;
    nlw.WriteDesign();
    EXPECT_EQ(Files(), (std::vector<std::string>{"SUB.v", "chipwide.v", "top.v", "top_ism.v"}));
    const int netlists =
        IndexOf(capture, "Writing multiple Verilog netlists for design 'demo' ...\n");
    const int models =
        IndexOf(capture, "Writing Verilog simulation model file '" + dir + "/top_ism.v' ...\n");
    EXPECT_GE(netlists, 0);
    EXPECT_GT(models, netlists);
}

TEST_F(VerilogFlow, RequestsOfFilesWithoutWritersLeaveTheNetlistAlone) {
    params.SetWriteSdfFile(true);
    params.SetInputFileType("qda");
    params.SetWritePinFile(true);
    params.SetWriteTestFile(true);
    params.SetStaMode(true);
    params.SetSimMode(false);
    nlw.WriteDesign();
    EXPECT_EQ(Files(), std::vector<std::string>{"top.v"});
}

TEST_F(VerilogFlow, NothingToWriteWithoutAView) {
    nlw.SetView(nullptr);
    Port_MsgCapture capture;
    nlw.WriteDesign();
    EXPECT_TRUE(Files().empty());
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Internal).size(), 1u);
}

}  // namespace

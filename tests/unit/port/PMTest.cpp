// Parts and device data sets.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "HostTestSupport.h"
#include "port/PM.h"

namespace {

using hosttest::EnvSetting;
using hosttest::MakeDirs;
using hosttest::QuietCapture;
using hosttest::TempDir;
using hosttest::WriteFile;

std::string Text(const char* s) {
    return s ? s : "-";
}

TEST(PmPic, SplitsThePartName) {
    for (const nlwtest::Row& c : nlwtest::Table("parts")) {
        PM_PIC pic(c[0].c_str(), true, 0);
        EXPECT_EQ(Text(pic.get_device()), c[1]) << c[0];
        EXPECT_EQ(Text(pic.get_package()), c[2]) << c[0];
        EXPECT_EQ(Text(pic.get_speed()), c[3]) << c[0];
        EXPECT_STREQ(pic.get_partname(), c[0].c_str());
    }
    PM_PIC none(nullptr, true, 0);
    EXPECT_STREQ(none.get_partname(), "");
    EXPECT_EQ(none.get_device(), nullptr);
}

class PmDevkey : public ::testing::Test {
protected:
    void SetUp() override {
        MakeDirs(dir_ / "first/data");
        MakeDirs(dir_ / "second/data");
        root_ = std::make_unique<EnvSetting>(
            "VORNIX", (dir_.path() + "/first:" + dir_.path() + "/second").c_str());
    }
    std::vector<std::string> Items(const PM_DEVKEY& key, const char* name) {
        std::vector<std::string> out;
        for (int i = 0; const char* item = key.getstringbykey(name, ",", i, nullptr, 0); ++i)
            out.push_back(item);
        return out;
    }
    TempDir dir_;
    std::unique_ptr<EnvSetting> root_;
};

TEST_F(PmDevkey, ReadsListsUnderKeys) {
    // A second line of a key appends; quotes and colons stay in an item.
    WriteFile(dir_ / "first/data/device.key", nlwtest::Data("pm/device.key"));
    PM_PIC pic("vx100-fg256-5", true, 0);
    PM_DEVKEY key("device.key", &pic, false, true, true);
    EXPECT_TRUE(key.IsLoaded());
    EXPECT_EQ(std::string(key.GetFileName()), dir_ / "first/data/device.key");
    using V = std::vector<std::string>;
    EXPECT_EQ(Items(key, "HexStringProperty"),
              (V{"INIT", "INITP_00", "SRVAL", "INIT_A", "INIT_B"}));
    EXPECT_EQ(Items(key, "BitStringProperty"), (V{"MODE"}));
    EXPECT_EQ(Items(key, "BigEndingTimcell"), (V{"X_RAMB16:'DOA':DOB", "X_MULT"}));
    EXPECT_EQ(Items(key, "Empty"), V{});
    EXPECT_EQ(Items(key, "Missing"), V{});
    EXPECT_EQ(key.getstringbykey("HexStringProperty", ",", -1, nullptr, 0), nullptr);
    EXPECT_EQ(key.getstringbykey("HexStringProperty", ",", 5, nullptr, 0), nullptr);
    EXPECT_EQ(key.getstringbykey("hexstringproperty", ",", 0, nullptr, 0), nullptr);  // exact keys
    EXPECT_EQ(key.getstringbykey(nullptr, ",", 0, nullptr, 0), nullptr);
}

TEST_F(PmDevkey, FirstRootHoldingTheSetWins) {
    QuietCapture capture;
    {
        // None holds it: empty and silent.
        PM_DEVKEY key("Nlw_formality", nullptr, false, true, true);
        EXPECT_FALSE(key.IsLoaded());
        EXPECT_EQ(key.getstringbykey("FLOW", ",", 0, nullptr, 0), nullptr);
        EXPECT_TRUE(capture.msgs.empty());
    }
    WriteFile(dir_ / "second/data/Nlw_formality", "FLOW = second\n");
    {
        PM_DEVKEY key("Nlw_formality", nullptr, false, true, true);
        EXPECT_STREQ(key.getstringbykey("FLOW", ",", 0, nullptr, 0), "second");
    }
    WriteFile(dir_ / "first/data/Nlw_formality", "FLOW = first, again\n");
    PM_DEVKEY key("Nlw_formality", nullptr, false, true, true);
    EXPECT_STREQ(key.getstringbykey("FLOW", ",", 0, nullptr, 0), "first");
    EXPECT_STREQ(key.getstringbykey("FLOW", ",", 1, nullptr, 0), "again");
    EXPECT_EQ(key.getstringbykey("FLOW", ",", 2, nullptr, 0), nullptr);
}

TEST_F(PmDevkey, LineWithoutKeyIsWarnedAndSkipped) {
    WriteFile(dir_ / "first/data/device.key", "A = 1\nno equals sign\n= orphan\nA = 2\n");
    QuietCapture capture;
    PM_DEVKEY key("device.key", nullptr, false, true, true);
    EXPECT_STREQ(key.getstringbykey("A", ",", 1, nullptr, 0), "2");
    ASSERT_EQ(capture.Count(Port_MsgLevel::Warning), 2u);
    EXPECT_NE(capture.Texts(Port_MsgLevel::Warning)[0].find("line 2"), std::string::npos);
    EXPECT_NE(capture.Texts(Port_MsgLevel::Warning)[1].find("line 3"), std::string::npos);
}

}  // namespace

// The netlist writer base: padding, device data and the simulatable
// property table.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "HostTestSupport.h"
#include "framework/Nlw_NetlistWriter.h"

namespace {

using hosttest::EnvSetting;
using hosttest::MakeDirs;
using hosttest::QuietCapture;
using hosttest::StubNetlistWriter;
using hosttest::TempDir;
using hosttest::WriteFile;

// "CELL:PARAM:TYPE:DEFAULT" per definition, in table order.
std::vector<std::string> Dump(const Nlw_NetlistWriter& nlw) {
    std::vector<std::string> out;
    for (const auto& entry : nlw.simPropTable)
        for (const Nlw_Property& p : *entry.second)
            out.push_back(std::string(entry.first.c_str()) + ":" + p.GetName().c_str() + ":" +
                          p.GetType().c_str() + ":" + p.GetDefault().c_str());
    return out;
}

TEST(NetlistWriter, PadOrTrimKeepsLeastSignificantDigits) {
    StubNetlistWriter nlw;
    for (const nlwtest::Row& c : nlwtest::Table("pad_or_trim")) {
        Port::String text(c[1].c_str());
        nlw.PadOrTrim(std::stoul(c[0]), text, nlwtest::Opt(c[2]));
        EXPECT_EQ(text.str(), c[3]) << c[0] << " " << c[1];
    }
}

TEST(NetlistWriter, DevkeyWithoutViewUsesAnEmptyPart) {
    TempDir dir;
    MakeDirs(dir / "data");
    WriteFile(dir / "data/device.key", "HexStringProperty = INIT\n");
    EnvSetting root("VORNIX", dir.path().c_str());
    StubNetlistWriter nlw;
    EXPECT_STREQ(nlw.GetPmPic()->get_partname(), "");
    PM_DEVKEY* key = nlw.GetDevkey();
    ASSERT_NE(key, nullptr);
    EXPECT_EQ(nlw.GetDevkey(), key);  // made once
    EXPECT_STREQ(key->getstringbykey("HexStringProperty", ",", 0, nullptr, 0), "INIT");
}

TEST(NetlistWriter, LoadsTheSimulatablePropertyTable) {
    StubNetlistWriter nlw;
    QuietCapture capture;
    // Comments, empty lines, tabs, CRLF; a cell type in another case and a
    // second definition of a parameter are kept after the first.
    ASSERT_TRUE(nlw.LoadSimPropTable(NLW_TEST_DATA_DIR "/sim_table.tbl"));
    EXPECT_TRUE(capture.msgs.empty());
    using V = std::vector<std::string>;
    EXPECT_EQ(Dump(nlw), (V{"X_FF:INIT:bl:FALSE", "X_LUT4:INIT:HV:16'h0000", "X_LUT4:MODE:S:\"A\"",
                            "X_LUT4:INIT:BV:4'b0000", "X_RAM:WIDTH:I:4"}));
    // Lookup ignores case.
    EXPECT_NE(nlw.simPropTable.find(Port::String("x_ram")), nlw.simPropTable.end());
}

TEST(NetlistWriter, BadOrMissingTableChangesNothing) {
    TempDir dir;
    for (const nlwtest::Row& c : nlwtest::Table("bad_sim_tables")) {
        WriteFile(dir / "bad.tbl", c[0]);
        StubNetlistWriter nlw;
        nlw.AddSimProperty("KEEP", "P", "I", "0");
        QuietCapture capture;
        EXPECT_FALSE(nlw.LoadSimPropTable((dir / "bad.tbl").c_str())) << c[0];
        std::vector<std::string> errors = capture.Texts(Port_MsgLevel::Error);
        ASSERT_EQ(errors.size(), 1u) << c[0];
        EXPECT_NE(errors[0].find("line " + c[1] + " "), std::string::npos) << errors[0];
        EXPECT_NE(errors[0].find(dir / "bad.tbl"), std::string::npos) << errors[0];
        EXPECT_EQ(Dump(nlw), std::vector<std::string>{"KEEP:P:I:0"});
    }
    // A missing table is silent; a directory in its place is unreadable.
    StubNetlistWriter nlw;
    QuietCapture capture;
    EXPECT_FALSE(nlw.LoadSimPropTable((dir / "none.tbl").c_str()));
    EXPECT_FALSE(nlw.LoadSimPropTable(nullptr));
    EXPECT_TRUE(capture.msgs.empty());
    EXPECT_FALSE(nlw.LoadSimPropTable(dir.path().c_str()));
    EXPECT_EQ(capture.Count(Port_MsgLevel::Error), 1u);
}

TEST(NetlistWriter, CopyHasItsOwnTable) {
    StubNetlistWriter nlw;
    nlw.AddSimProperty("X_LUT4", "INIT", "HV", "16'h0000");
    std::vector<Nlw_Property> hostList{Nlw_Property("W", "I", "1")};
    nlw.simPropTable.emplace(Port::String("HOST"), &hostList);
    StubNetlistWriter copy(nlw);
    nlw.AddSimProperty("X_LUT4", "MODE", "S", "A");
    EXPECT_EQ(Dump(copy), (std::vector<std::string>{"HOST:W:I:1", "X_LUT4:INIT:HV:16'h0000"}));
    EXPECT_EQ(copy.simPropTable.find(Port::String("HOST"))->second, &hostList);
    StubNetlistWriter assigned;
    assigned = nlw;
    EXPECT_EQ(Dump(assigned), Dump(nlw));
    const Port::String lut("X_LUT4");
    EXPECT_NE(assigned.simPropTable.find(lut)->second, nlw.simPropTable.find(lut)->second);
}

}  // namespace

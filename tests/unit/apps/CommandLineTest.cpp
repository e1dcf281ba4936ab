#include "Nlw_CommandLine.h"
#include "TestFiles.h"

namespace {

Nlw_CommandLine Parse(Nlw_Program p, std::vector<std::string> args) {
    return Nlw_ParseCommandLine(p, args);
}

// Each switch's effect on the written files is checked end to end
// (tests/data/options/rows.txt); here the defaults, values and refusals.
TEST(CommandLine, DefaultsWithoutOptions) {
    Nlw_CommandLine cl = Parse(Nlw_Program::Qdb2ver, {"dir.x/design.qda"});
    ASSERT_EQ(cl.error, "");
    const Nlw_Params& p = cl.params;
    EXPECT_TRUE(p.GetSimMode());
    EXPECT_TRUE(p.GetWritePsTimePrecision());
    EXPECT_TRUE(p.GetWriteEscapedNames());
    EXPECT_TRUE(p.GetInsert_chipwide());
    EXPECT_EQ(p.GetOutputFileMode(), Port::Stream::Create);
    EXPECT_STREQ(p.GetInputFileType(), "qda");
    EXPECT_STREQ(p.GetOutputFileName(), "dir.x/design.v");
    EXPECT_EQ(p.GetSdfPath(), nullptr);
}

TEST(CommandLine, OutputNameGetsVerilogExtension) {
    EXPECT_STREQ(Parse(Nlw_Program::Qdb2ver, {"a.json", "out/net"}).params.GetOutputFileName(),
                 "out/net.v");
    EXPECT_STREQ(Parse(Nlw_Program::Qdb2ver, {"a.json", "net.v"}).params.GetOutputFileName(),
                 "net.v");
    EXPECT_STREQ(Parse(Nlw_Program::Tessel, {"-dir", "o", "x/a.json"}).params.GetOutputFileName(),
                 "o/a.v");
}

TEST(CommandLine, ValuesAndOptionalValues) {
    EXPECT_FALSE(Parse(Nlw_Program::Qdb2ver, {"-insert_chipwide", "FALSE", "a.json"})
                     .params.GetInsert_chipwide());
    // Without a following file name the word after -sdf_path is the input.
    Nlw_CommandLine bare = Parse(Nlw_Program::Qdb2ver, {"-sdf_path", "a.json"});
    ASSERT_EQ(bare.error, "");
    EXPECT_EQ(bare.params.GetSdfPath(), nullptr);
    EXPECT_STREQ(bare.params.GetInputFileName(), "a.json");
}

TEST(CommandLine, TesselHostOptions) {
    Nlw_CommandLine cl =
        Parse(Nlw_Program::Tessel, {"--r", "-fn", "-bd", "a.mem", "tag", "u/ram", "-bd", "b.mem",
                                    "-s", "-5", "-module", "-tb", "a.json"});
    ASSERT_EQ(cl.error, "");
    EXPECT_TRUE(cl.params.GetFlatten());  // the last of -fn and -r wins
    ASSERT_EQ(cl.bramData.size(), 2u);
    EXPECT_EQ(cl.bramData[0].file + "|" + cl.bramData[0].tag, "a.mem|u/ram");
    EXPECT_EQ(cl.bramData[1].file + "|" + cl.bramData[1].tag, "b.mem|");
    EXPECT_STREQ(cl.params.GetSpeed(), "5");
    EXPECT_FALSE(cl.params.GetWriteTestFile());  // refused with -module
}

TEST(CommandLine, UnusableCommandLines) {
    for (const nlwtest::Row& c : nlwtest::Table("bad_command_lines")) {
        const Nlw_Program program = c[0] == "tessel" ? Nlw_Program::Tessel : Nlw_Program::Qdb2ver;
        EXPECT_NE(Parse(program, nlwtest::Unbracketed(c[1])).error, "") << c[0] << " " << c[1];
    }
}

TEST(CommandLine, HelpWithAndWithoutTopic) {
    EXPECT_TRUE(Parse(Nlw_Program::Qdb2ver, {"-h"}).help);
    Nlw_CommandLine t = Parse(Nlw_Program::Tessel, {"-h", "sim"});
    EXPECT_TRUE(t.help);
    EXPECT_EQ(t.helpTopic, "sim");
    EXPECT_EQ(t.error, "");
}

}  // namespace

// The test fixture writer: file head, port declarations, unit under test,
// waveform dumps, the column header with its monitor and the stimulus (the
// run that writes it: test_programs.sh and the option rows).

#include "Nlw_VerilogTestWriter.h"
#include "VerilogWriterTest.h"

namespace {

using namespace vwtest;

class VerilogTestWriter : public vwtest::WriterTest {
protected:
    VerilogTestWriter() { params_.SetCommandLine("qdb2ver -tf top.json"); }

    // The fixture module alone.
    std::string Fixture() {
        Nlw_VerilogTestWriter writer(&nlw_, "memory.tv", Port::Stream::Memory);
        writer.WriteBlock(top_);
        return writer.GetMemoryText();
    }
    // The whole file.
    std::string File() {
        Nlw_VerilogTestWriter writer(&nlw_, "memory.tv", Port::Stream::Memory);
        writer.WriteView(&view_, 0);
        return writer.GetMemoryText();
    }
    // The texts between the quotes of the $display lines.
    std::vector<std::string> HeaderRows() {
        std::vector<std::string> rows;
        const std::string text = Fixture();
        const std::string open = "$display(\"";
        for (size_t pos = text.find(open); pos != std::string::npos;
             pos = text.find(open, pos + 1)) {
            const size_t begin = pos + open.size();
            rows.push_back(text.substr(begin, text.find("\");\n", begin) - begin));
        }
        return rows;
    }
    std::string MonitorLine() {
        const std::string text = Fixture();
        const size_t begin = text.find("$monitor");
        return text.substr(begin, text.find('\n', begin) - begin);
    }
    // The stimulus block, the module's last initial block.
    std::string Stimulus() {
        const std::string text = Fixture();
        const size_t begin = text.rfind("    initial begin\n");
        return text.substr(begin, text.find("  endmodule") - begin);
    }

    // A global signal of the root with its connection value and floating
    // value.
    Nlw_NlSignal* Global(Nlw_NlBuilder& b, bool setReset, int conn, int floatVal) {
        Nlw_NlSignal* s = b.AddSignal(top_, setReset ? "GSR" : "GTS");
        if (setReset)
            b.SetSetReset(s);
        else
            b.SetTristate(s);
        s->AddProperty(
            Vdm_Property::NewInt(setReset ? "NLW_SETRESET_CONN" : "NLW_TRISTATE_CONN", conn));
        b.GetOrCreateNetwork(s)->AddProperty(Vdm_Property::NewInt("VL_FLOATVAL", floatVal));
        return s;
    }
};

TEST_F(VerilogTestWriter, WholeFileOfASmallDesign) {
    const std::string chipwide = root_.File("verilog/src/chipwide.v", "module chipwide;\n");
    b_.AddPort(top_, "clk", NLW_DIR_INPUT);
    b_.AddPortBus(top_, "d", NLW_DIR_INPUT, 7, 0);
    b_.AddPort(top_, "q", NLW_DIR_OUTPUT);
    b_.AddPortBus(top_, "cnt", NLW_DIR_OUTPUT, 8, 0);
    Global(b_, true, 3, 0);
    nlwtest::ExpectGolden("testfixture/small_design",
                          nlwtest::Replaced(File(), chipwide, "<root>/verilog/src/chipwide.v"));
}

// ---------------------------------------------------------------------------
// File head

TEST_F(VerilogTestWriter, IncludeComesFromTheFirstRootHoldingTheChipwideFile) {
    TempDir dirs;
    const std::string plainFile = dirs.File("plain", "not a directory");
    const std::string empty = dirs.Dir("empty");
    dirs.Dir("dirAsFile/verilog/src/chipwide.v");
    const std::string good = dirs.File("good/verilog/src/chipwide.v", "");
    dirs.File("later/verilog/src/chipwide.v", "");
    const std::string list = dirs.Path() + "/missing:" + plainFile + ":" + empty + ":" +
                             dirs.Path() + "/dirAsFile:" + dirs.Path() + "/good:" + dirs.Path() +
                             "/later";
    ScopedEnv vornix("VORNIX", list.c_str());
    Port_MsgCapture capture;
    nlwtest::ExpectGolden("testfixture/include_first_root",
                          nlwtest::Replaced(File(), good, "<good>"));
    EXPECT_TRUE(capture.msgs.empty());
}

TEST_F(VerilogTestWriter, NoIncludeWithoutTheChipwideFileOrWithoutRoots) {
    params_.SetWritePsTimePrecision(false);
    {
        // Roots without the file: silently no include.
        Port_MsgCapture capture;
        nlwtest::ExpectGolden("testfixture/no_include", File());
        EXPECT_TRUE(capture.msgs.empty());
    }
    {
        // No roots at all: an error, and the file goes on.
        ScopedEnv vornix("VORNIX", "");
        Port_MsgCapture capture;
        nlwtest::ExpectGolden("testfixture/no_include", File());
        ASSERT_EQ(capture.msgs.size(), 1u);
        EXPECT_EQ(capture.msgs[0].level, Port_MsgLevel::Error);
        EXPECT_EQ(capture.msgs[0].domain, "NetListWriters");
        EXPECT_EQ(capture.msgs[0].text, kNoVornix);
    }
}

TEST_F(VerilogTestWriter, HeadFieldsStayInsideTheirComments) {
    params_.SetCommandLine("qdb2ver \"x\nmodule evil;\"");
    nlwtest::ExpectGolden("testfixture/head_fields_in_comments", File());
}

// ---------------------------------------------------------------------------
// Declarations and the unit under test

TEST_F(VerilogTestWriter, InputsAreRegistersAndEverythingElseWires) {
    b_.AddPort(top_, "i", NLW_DIR_INPUT);
    b_.AddPort(top_, "o", NLW_DIR_OUTPUT);
    b_.AddPort(top_, "io", NLW_DIR_INOUT);
    b_.AddPort(top_, "u", NLW_DIR_UNTYPED);
    b_.AddPortBus(top_, "bi", NLW_DIR_INPUT, 3, 0);
    b_.AddPortBus(top_, "bo", NLW_DIR_OUTPUT, 0, 3);
    b_.AddPortBus(top_, "bio", NLW_DIR_INOUT, 1, 0);
    b_.SetVisible(b_.AddPort(top_, "hidden", NLW_DIR_INPUT), false);
    b_.SetValid(b_.AddPortBus(top_, "gone", NLW_DIR_INPUT, 1, 0), false);
    b_.AddPort(top_, "a b", NLW_DIR_INPUT);
    const std::string text = Fixture();
    nlwtest::ExpectGolden("testfixture/inputs_are_registers_and_everything_else_wires",
                          text.substr(0, text.find("    top ")));
}

TEST_F(VerilogTestWriter, OnlyGlobalsReachedThroughChipwideGetARegister) {
    Global(b_, true, 3, 0);
    Global(b_, false, 3, 0);
    nlwtest::ExpectGolden("testfixture/globals_through_chipwide", Fixture());

    for (int conn : {0, 1, 2}) {
        SCOPED_TRACE(conn);
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        top_ = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlSignal* s = b.AddSignal(top_, "GSR");
        b.SetSetReset(s);
        s->AddProperty(Vdm_Property::NewInt("NLW_SETRESET_CONN", conn));
        const std::string text = Fixture();
        EXPECT_EQ(text.find("chipwide"), std::string::npos);
        EXPECT_EQ(text.find("reg GSR"), std::string::npos);
    }
}

TEST_F(VerilogTestWriter, UnitUnderTestNameAndPortMaps) {
    nlwtest::ExpectGolden("testfixture/no_ports", Fixture());
    b_.AddPortBus(top_, "d", NLW_DIR_INPUT, 1, 0);
    b_.AddPort(top_, "a-b", NLW_DIR_OUTPUT);
    params_.SetRootInstanceName("dut 1");
    nlwtest::ExpectGolden("testfixture/escaped_ports", Fixture());
}

// ---------------------------------------------------------------------------
// Waveform dumps

TEST_F(VerilogTestWriter, DumpBlocksFollowTheOptionsShmFirst) {
    params_.SetOutputFileName("out/top.v");
    for (int dumps = 0; dumps < 4; ++dumps) {
        params_.SetWriteShm(dumps & 1);
        params_.SetWriteVcd(dumps & 2);
        nlwtest::ExpectGolden("testfixture/dumps_" + std::to_string(dumps), Fixture());
    }
}

TEST_F(VerilogTestWriter, DumpNamesAreEscapedInsideTheirStringLiterals) {
    params_.SetOutputFileName("run \"1\"\\x.v");
    params_.SetWriteShm(true);
    params_.SetWriteVcd(true);
    const std::string text = Fixture();
    EXPECT_NE(text.find("      $shm_open(\"run \\\"1\\\"\\\\x.shm\");\n"), std::string::npos)
        << text;
    EXPECT_NE(text.find("      $dumpfile(\"run \\\"1\\\"\\\\x.vcd\");\n"), std::string::npos);
}

// ---------------------------------------------------------------------------
// Column header and monitor

TEST_F(VerilogTestWriter, BusColumnsAreTheHexDigitsOfTheBus) {
    int n = 0;
    for (const nlwtest::Row& c : nlwtest::Table("bus_columns")) {
        const Nlw_NlPinBus* bus = b_.AddPortBus(top_, vorform("b%d", n++), NLW_DIR_INPUT,
                                                std::stoi(c[0]), std::stoi(c[1]));
        EXPECT_EQ(Nlw_VerilogTestWriter::GetBusColumns(bus), std::stoi(c[2]))
            << c[0] << ":" << c[1];
    }
}

// 8 bits take two columns, 9 bits three, also in the rows below the bus's
// label: the next column stands right of them in every row. Later, longer
// names start rows aligned with the earlier columns. A backslash or quote is
// escaped in the string literal and a percent sign doubled, so that each
// prints as the one character of the name.
TEST_F(VerilogTestWriter, ColumnHeaderAndMonitor) {
    b_.AddPortBus(top_, "d", NLW_DIR_INPUT, 7, 0);
    b_.AddPortBus(top_, "e", NLW_DIR_INPUT, 8, 0);
    b_.AddPortBus(top_, "f", NLW_DIR_OUTPUT, 0, 0);
    b_.AddPort(top_, "abcdefghij", NLW_DIR_OUTPUT);
    b_.AddPort(top_, "a", NLW_DIR_INPUT);
    b_.AddPort(top_, "bb", NLW_DIR_INPUT);
    b_.AddPort(top_, "longer", NLW_DIR_OUTPUT);
    b_.AddPort(top_, "c", NLW_DIR_OUTPUT);
    b_.AddPort(top_, "\\a\\b ", NLW_DIR_INPUT);
    b_.AddPort(top_, "\\q\"%r ", NLW_DIR_INPUT);
    nlwtest::ExpectGolden("testfixture/column_header", Fixture());
}

TEST_F(VerilogTestWriter, NamesLongerThanTheGridKeepTheirFirstCharacters) {
    std::string name(300, 'n');
    name[255] = 'E';
    name[256] = 'X';
    b_.AddPort(top_, name.c_str(), NLW_DIR_INPUT);
    b_.AddPort(top_, "z", NLW_DIR_INPUT);
    const std::vector<std::string> rows = HeaderRows();
    ASSERT_EQ(rows.size(), 256u);
    EXPECT_EQ(rows[0], "           T nz");
    EXPECT_EQ(rows[255], std::string(13, ' ') + "E ");
    // The monitor still names the whole port.
    EXPECT_NE(MonitorLine().find(name + ",z);"), std::string::npos);
}

// ---------------------------------------------------------------------------
// Stimulus

TEST_F(VerilogTestWriter, StimulusDrivesTheGlobalsByConnection) {
    for (const nlwtest::Row& c : nlwtest::Table("fixture_globals")) {
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        top_ = b.CreateRoot(b.AddModuleType("top"), "top");
        b.ReservePorts(top_, 2);
        Nlw_NlPin* rst = b.AddPort(top_, "rst_n", NLW_DIR_INPUT);
        Nlw_NlPin* ts = b.AddPort(top_, "ts", NLW_DIR_INPUT);
        for (bool setReset : {true, false}) {
            int conn, floatVal, refPin;
            if (std::sscanf(c[setReset ? 1 : 2].c_str(), "%d, %d, %d", &conn, &floatVal, &refPin) !=
                3)
                continue;
            Nlw_NlSignal* s = Global(b, setReset, conn, floatVal);
            if (refPin) {
                Nlw_NlPin* pin = setReset ? rst : ts;
                b.ConnectChild(pin, s);
                b.SetRefPin(s, pin);
            }
        }
        nlwtest::ExpectGolden("testfixture/stimulus_" + c[0], Stimulus());
    }
}

}  // namespace

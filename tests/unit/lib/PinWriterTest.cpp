// The signal/pin map file: header, device lines, one padded line per pad
// cell with its instance path, and the driver that writes it.
#include <algorithm>
#include <fstream>
#include <sstream>

#include "Nlw_PinWriter.h"
#include "VerilogWriterTest.h"

namespace {

using vwtest::ScopedEnv;
using vwtest::TempDir;

class PinWriter : public vwtest::WriterTest {
protected:
    PinWriter() {
        // A pad cell: the pad pin I meets the package pin, O drives the
        // design.
        pad_ = b_.AddLibraryType("V_IBUF", false, false, NLW_PRIM_PAD);
        b_.AddTypePin(pad_, "I", NLW_DIR_INPUT, NLW_PINTYPE_PAD);
        b_.AddTypePin(pad_, "O", NLW_DIR_OUTPUT);
        obuf_ = b_.AddLibraryType("V_OBUF", false, false, NLW_PRIM_PAD);
        b_.AddTypePin(obuf_, "I", NLW_DIR_INPUT);
        b_.AddTypePin(obuf_, "O", NLW_DIR_OUTPUT, NLW_PINTYPE_PAD);
        lut_ = b_.AddLibraryType("V_LUT1", false, false);
        b_.AddTypePin(lut_, "I0", NLW_DIR_INPUT);
        b_.AddTypePin(lut_, "O", NLW_DIR_OUTPUT);
        top_ = b_.CreateRoot(b_.AddModuleType("top"), "top");
    }

    // A port of the macro joined to a new signal of the same name inside.
    Nlw_NlSignal* Port(Nlw_NlBlock* macro, const char* name, int dir) {
        Nlw_NlSignal* inside = b_.AddSignal(macro, name);
        b_.ConnectChild(b_.AddPort(macro, name, dir), inside);
        return inside;
    }
    // A pad cell in the macro whose pad pin is on signal (none when null),
    // with the package pin pinName (none when null).
    Nlw_NlBlock* Pad(Nlw_NlBlock* macro, const char* name, Nlw_NlSignal* signal,
                     const char* pinName, Nlw_NlType* type = nullptr) {
        Nlw_NlBlock* pad = b_.CreateLeaf(macro, type ? type : pad_, name);
        if (signal) b_.Connect(pad->FindPin(type == obuf_ ? "O" : "I"), signal);
        if (pinName) pad->AddProperty(Vdm_Property::NewString("PINNAME", pinName));
        return pad;
    }
    std::string Pins() {
        Nlw_PinWriter writer(&nlw_, "memory.pin", Port::Stream::Memory);
        writer.WriteView(&view_, 0);
        EXPECT_TRUE(writer.GetHierarchyPath().empty());
        return writer.GetMemoryText();
    }
    std::string Header(const std::string& deviceLines) {
        return std::string("// Vornix signal/pin map file produced by program ") +
               nlw_.GetApplicationName() + " " + nlw_.GetApplicationVersion() +
               "\n"
               "// Date: Thu Jan  1 00:00:00 2026\n"
               "// Design name: demo\n"
               "\n" +
               deviceLines + "\n";
    }
    // The text after the header.
    static std::string Body(const std::string& text) {
        const size_t pos = text.find("\n\n", text.find("\n\n") + 2);
        return pos == std::string::npos ? text : text.substr(pos + 2);
    }

    Nlw_NlType* pad_ = nullptr;
    Nlw_NlType* obuf_ = nullptr;
    Nlw_NlType* lut_ = nullptr;
    Nlw_NlBlock* top_ = nullptr;
};

TEST_F(PinWriter, WritesHeaderDeviceLinesAndOnePaddedLinePerPad) {
    b_.SetDevice("vx100 fg256 -5", "vx100-fg256-5");
    Pad(top_, "clk_ibuf", Port(top_, "clk", NLW_DIR_INPUT), "P12");
    EXPECT_EQ(Pins(), Header("// Part 100\n"
                             "// Package fg256\n"
                             "// Speed 5\n") +
                          "clk                 \tINPUT     \tP12       \n");
}

TEST_F(PinWriter, WithoutDeviceDataNamesThePartOnce) {
    Pad(top_, "clk_ibuf", Port(top_, "clk", NLW_DIR_INPUT), "P12");
    EXPECT_EQ(Pins(),
              Header("// Device: NULL\n") + "clk                 \tINPUT     \tP12       \n");
}

// Pads without a package pin, without a connected pad pin, and cells that
// are no pads write nothing, not even the header.
TEST_F(PinWriter, DesignWithoutAcceptedPadsGivesAnEmptyFile) {
    Nlw_NlSignal* a = Port(top_, "a", NLW_DIR_INPUT);
    Pad(top_, "no_pinname", a, nullptr);
    Pad(top_, "unconnected", nullptr, "P1");
    Nlw_NlBlock* lut = b_.CreateLeaf(top_, lut_, "lut");
    b_.Connect(lut->FindPin("I0"), a);
    lut->AddProperty(Vdm_Property::NewString("PINNAME", "P2"));
    Nlw_NlBlock* numbered = Pad(top_, "numbered", a, nullptr);
    numbered->AddProperty(Vdm_Property::NewInt("PINNAME", 7));
    EXPECT_EQ(Pins(), "");

    Nlw_NlView empty;
    Nlw_PinWriter writer(&nlw_, "memory.pin", Port::Stream::Memory);
    writer.WriteView(&empty, 0);
    EXPECT_EQ(writer.GetMemoryText(), "");
}

TEST_F(PinWriter, FieldsArePaddedButNeverCut) {
    struct Case {
        const char* port;
        const char* pinName;
        const char* line;
    };
    const Case cases[] = {
        {"d", "A1", "d                   \tINPUT     \tA1        \n"},
        {"exactly_twenty_chars", "B2", "exactly_twenty_chars\tINPUT     \tB2        \n"},
        {"a_signal_of_25_characters", "C3", "a_signal_of_25_characters\tINPUT     \tC3        \n"},
        {"e", "a_long_package_pin", "e                   \tINPUT     \ta_long_package_pin\n"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.port);
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        Nlw_NlType* pad = b.AddLibraryType("V_IBUF", false, false, NLW_PRIM_PAD);
        b.AddTypePin(pad, "I", NLW_DIR_INPUT, NLW_PINTYPE_PAD);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlSignal* s = b.AddSignal(top, c.port);
        b.ConnectChild(b.AddPort(top, c.port, NLW_DIR_INPUT), s);
        Nlw_NlBlock* leaf = b.CreateLeaf(top, pad, "ib");
        b.Connect(leaf->FindPin("I"), s);
        leaf->AddProperty(Vdm_Property::NewString("PINNAME", c.pinName));
        Nlw_PinWriter writer(&nlw_, "memory.pin", Port::Stream::Memory);
        writer.WriteView(&view, 0);
        EXPECT_EQ(Body(writer.GetMemoryText()), c.line);
    }
}

// The direction written is the pad pin's: an output buffer on a port
// declared inout is still an output pad.
TEST_F(PinWriter, DirectionIsThePadPins) {
    Pad(top_, "ob", Port(top_, "io", NLW_DIR_INOUT), "P3", obuf_);
    EXPECT_EQ(Body(Pins()), "io                  \tOUTPUT    \tP3        \n");
}

// Lines follow the depth-first walk; every signal name carries the path of
// the instances below the root, which shrinks again on the way back up.
TEST_F(PinWriter, NestedPadsCarryTheirInstancePath) {
    Nlw_NlBlock* u1 = b_.CreateMacro(top_, b_.AddModuleType("mid"), "u1");
    Nlw_NlBlock* u2 = b_.CreateMacro(u1, b_.AddModuleType("low"), "u2");
    Pad(u2, "ib", Port(u2, "din", NLW_DIR_INPUT), "P20");
    Pad(u1, "ib", Port(u1, "m", NLW_DIR_INPUT), "P21");
    Nlw_NlBlock* u3 = b_.CreateMacro(top_, b_.AddModuleType("other"), "u3");
    Pad(u3, "ib", Port(u3, "q", NLW_DIR_INPUT), "P22");
    Pad(top_, "ib", Port(top_, "t", NLW_DIR_INPUT), "P23");
    EXPECT_EQ(Body(Pins()),
              "u1/u2/din           \tINPUT     \tP20       \n"
              "u1/m                \tINPUT     \tP21       \n"
              "u3/q                \tINPUT     \tP22       \n"
              "t                   \tINPUT     \tP23       \n");
}

// The header comes with the first accepted pad even when its signal reaches
// no port; it is not written a second time.
TEST_F(PinWriter, HeaderIsWrittenOnceFromTheFirstAcceptedPad) {
    Pad(top_, "internal", b_.AddSignal(top_, "n1"), "P5");
    Pad(top_, "ib", Port(top_, "a", NLW_DIR_INPUT), "P6");
    Pad(top_, "internal2", b_.AddSignal(top_, "n2"), "P7");
    EXPECT_EQ(Pins(),
              Header("// Device: NULL\n") + "a                   \tINPUT     \tP6        \n");

    Nlw_NlView view;
    Nlw_NlBuilder b(&view);
    Nlw_NlType* pad = b.AddLibraryType("V_IBUF", false, false, NLW_PRIM_PAD);
    b.AddTypePin(pad, "I", NLW_DIR_INPUT, NLW_PINTYPE_PAD);
    Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
    Nlw_NlBlock* leaf = b.CreateLeaf(top, pad, "ib");
    b.Connect(leaf->FindPin("I"), b.AddSignal(top, "n"));
    leaf->AddProperty(Vdm_Property::NewString("PINNAME", "P9"));
    Nlw_PinWriter writer(&nlw_, "memory.pin", Port::Stream::Memory);
    writer.WriteView(&view, 0);
    EXPECT_EQ(writer.GetMemoryText(), Header("// Device: NULL\n"));
}

// The port found for a signal is remembered: every pad on it gets its line.
TEST_F(PinWriter, PadsSharingASignalNameTheSamePort) {
    Nlw_NlSignal* s = Port(top_, "bus_in", NLW_DIR_INPUT);
    Pad(top_, "a", s, "P1");
    Pad(top_, "b", s, "P2");
    EXPECT_EQ(Body(Pins()),
              "bus_in              \tINPUT     \tP1        \n"
              "bus_in              \tINPUT     \tP2        \n");
}

TEST(PinWriterDevice, StripsTheFamilyPrefix) {
    const std::pair<const char*, const char*> cases[] = {
        {"vx100", "100"}, {"VX2", "2"},   {"vX3", "3"}, {"v50", "50"},  {"V", ""},
        {"x200", "x200"}, {"abc", "abc"}, {"", ""},     {"xv1", "xv1"},
    };
    for (const auto& c : cases)
        EXPECT_STREQ(Nlw_PinWriter::StripFamilyPrefix(c.first), c.second) << c.first;
    EXPECT_EQ(Nlw_PinWriter::StripFamilyPrefix(nullptr), nullptr);
}

TEST_F(PinWriter, PartLineShowsTheDeviceWithoutItsPrefix) {
    const std::pair<const char*, const char*> cases[] = {
        {"vq9-cs1-2", "// Part q9\n// Package cs1\n// Speed 2\n"},
        {"ab7-pq2", "// Part ab7\n// Package pq2\n// Speed NULL\n"},
        {"vx5", "// Part 5\n// Package NULL\n// Speed NULL\n"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.first);
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        b.SetDevice(c.first, c.first);
        nlw_.SetView(&view);
        Nlw_NlType* pad = b.AddLibraryType("V_IBUF", false, false, NLW_PRIM_PAD);
        b.AddTypePin(pad, "I", NLW_DIR_INPUT, NLW_PINTYPE_PAD);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlBlock* leaf = b.CreateLeaf(top, pad, "ib");
        b.Connect(leaf->FindPin("I"), b.AddSignal(top, "n"));
        leaf->AddProperty(Vdm_Property::NewString("PINNAME", "P1"));
        Nlw_PinWriter writer(&nlw_, "memory.pin", Port::Stream::Memory);
        writer.WriteView(&view, 0);
        EXPECT_EQ(writer.GetMemoryText(), Header(c.second));
    }
    nlw_.SetView(&view_);
}

// Hierarchies of any depth: the path grows past any fixed buffer and the
// walk does not run out of stack.
TEST_F(PinWriter, DeepHierarchyIsWalkedWhole) {
    const int depth = 100000;
    Nlw_NlBlock* macro = top_;
    Nlw_NlType* level = b_.AddModuleType("level");
    std::string path;
    for (int i = 0; i < depth; ++i) {
        macro = b_.CreateMacro(macro, level, "u");
        path += "u/";
    }
    Pad(macro, "ib", Port(macro, "p", NLW_DIR_INPUT), "P1");
    EXPECT_EQ(Body(Pins()), vorform("%-20s\tINPUT     \tP1        \n", (path + "p").c_str()));
}

// The driver names the file after the output root, announces it and writes
// it whole, with the names the legalizer gave.
TEST(PinWriterFlow, WritesTheRootPinFile) {
    TempDir dir;
    ScopedEnv stamp("NLW_TIMESTAMP", "Thu Jan  1 00:00:00 2026");
    ScopedEnv noCache("NLW_NO_NAMECACHE", nullptr);
    Nlw_Verilog nlw;
    Nlw_Params params;
    Nlw_NlView view;
    Nlw_Design design("demo");
    const std::string output = dir.Path() + "/top.v";
    params.SetOutputFileName(output.c_str());
    params.SetOutputFileMode(Port::Stream::Replace);
    params.SetInputFileType("qdb");
    params.SetWritePinFile(true);
    nlw.SetParams(&params);
    nlw.SetView(&view);
    nlw.SetDesign(&design);

    Nlw_NlBuilder b(&view);
    Nlw_NlType* pad = b.AddLibraryType("V_IBUF", false, false, NLW_PRIM_PAD);
    b.AddTypePin(pad, "I", NLW_DIR_INPUT, NLW_PINTYPE_PAD);
    Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
    Nlw_NlSignal* s = b.AddSignal(top, "rst");
    b.ConnectChild(b.AddPort(top, "rst", NLW_DIR_INPUT), s);
    Nlw_NlBlock* leaf = b.CreateLeaf(top, pad, "ib");
    b.Connect(leaf->FindPin("I"), s);
    leaf->AddProperty(Vdm_Property::NewString("PINNAME", "K3"));

    Port_MsgCapture capture;
    nlw.WriteDesign();
    const std::string pinFile = dir.Path() + "/top.pin";
    const std::vector<std::string> status = capture.Texts(Port_MsgLevel::Status);
    EXPECT_NE(std::find(status.begin(), status.end(), "Writing pin file '" + pinFile + "' ...\n"),
              status.end());
    std::ifstream in(pinFile);
    std::stringstream text;
    text << in.rdbuf();
    EXPECT_NE(text.str().find("\nrst                 \tINPUT     \tK3        \n"),
              std::string::npos)
        << text.str();
    EXPECT_EQ(text.str().rfind("// Vornix signal/pin map file produced by program qdb2ver ", 0),
              0u);
}

}  // namespace

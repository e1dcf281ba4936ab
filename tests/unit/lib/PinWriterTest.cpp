// The signal/pin map file: header, device lines, one padded line per pad
// cell with its instance path (the run that writes it: test_programs.sh).
#include "Nlw_PinWriter.h"
#include "TestFiles.h"
#include "VerilogWriterTest.h"

namespace {

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
    // The text after the header.
    static std::string Body(const std::string& text) {
        const size_t pos = text.find("\n\n", text.find("\n\n") + 2);
        return pos == std::string::npos ? text : text.substr(pos + 2);
    }
    // A view holding one pad, on an internal net, of a device named device.
    std::string OnePadOf(const char* device) {
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        if (device) b.SetDevice(device, device);
        nlw_.SetView(&view);
        Nlw_NlType* pad = b.AddLibraryType("V_IBUF", false, false, NLW_PRIM_PAD);
        b.AddTypePin(pad, "I", NLW_DIR_INPUT, NLW_PINTYPE_PAD);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlBlock* leaf = b.CreateLeaf(top, pad, "ib");
        b.Connect(leaf->FindPin("I"), b.AddSignal(top, "n"));
        leaf->AddProperty(Vdm_Property::NewString("PINNAME", "P1"));
        Nlw_PinWriter writer(&nlw_, "memory.pin", Port::Stream::Memory);
        writer.WriteView(&view, 0);
        nlw_.SetView(&view_);
        return writer.GetMemoryText();
    }

    Nlw_NlType* pad_ = nullptr;
    Nlw_NlType* obuf_ = nullptr;
    Nlw_NlType* lut_ = nullptr;
};

TEST_F(PinWriter, WritesHeaderDeviceLinesAndOnePaddedLinePerPad) {
    Pad(top_, "clk_ibuf", Port(top_, "clk", NLW_DIR_INPUT), "P12");
    nlwtest::ExpectGolden("pin/no_device", Pins());
    b_.SetDevice("vx100 fg256 -5", "vx100-fg256-5");
    nlwtest::ExpectGolden("pin/device", Pins());
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

// Fields are padded but never cut. The direction written is the pad pin's:
// an output buffer on a port declared inout is still an output pad. The port
// found for a signal is remembered: every pad on it gets its line.
TEST_F(PinWriter, PaddedLinesWithThePadPinsDirection) {
    Pad(top_, "p0", Port(top_, "d", NLW_DIR_INPUT), "A1");
    Pad(top_, "p1", Port(top_, "exactly_twenty_chars", NLW_DIR_INPUT), "B2");
    Pad(top_, "p2", Port(top_, "a_signal_of_25_characters", NLW_DIR_INPUT), "C3");
    Pad(top_, "p3", Port(top_, "e", NLW_DIR_INPUT), "a_long_package_pin");
    Pad(top_, "ob", Port(top_, "io", NLW_DIR_INOUT), "P3", obuf_);
    Nlw_NlSignal* s = Port(top_, "bus_in", NLW_DIR_INPUT);
    Pad(top_, "a", s, "P1");
    Pad(top_, "b", s, "P2");
    nlwtest::ExpectGolden("pin/padded_lines", Body(Pins()));
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
    nlwtest::ExpectGolden("pin/nested_pads_carry_their_instance_path", Body(Pins()));
}

// The header comes with the first accepted pad even when its signal reaches
// no port; it is not written a second time.
TEST_F(PinWriter, HeaderIsWrittenOnceFromTheFirstAcceptedPad) {
    Pad(top_, "internal", b_.AddSignal(top_, "n1"), "P5");
    Pad(top_, "ib", Port(top_, "a", NLW_DIR_INPUT), "P6");
    Pad(top_, "internal2", b_.AddSignal(top_, "n2"), "P7");
    nlwtest::ExpectGolden("pin/header_once", Pins());
    nlwtest::ExpectGolden("pin/internal_pad_only", OnePadOf(nullptr));
}

TEST(PinWriterDevice, StripsTheFamilyPrefix) {
    for (const nlwtest::Row& c : nlwtest::Table("family_prefix"))
        EXPECT_STREQ(Nlw_PinWriter::StripFamilyPrefix(c[0].c_str()), c[1].c_str()) << c[0];
    EXPECT_EQ(Nlw_PinWriter::StripFamilyPrefix(nullptr), nullptr);
}

TEST_F(PinWriter, PartLineShowsTheDeviceWithoutItsPrefix) {
    for (const char* device : {"vq9-cs1-2", "ab7-pq2", "vx5"})
        nlwtest::ExpectGolden(std::string("pin/part_") + device, OnePadOf(device));
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

}  // namespace

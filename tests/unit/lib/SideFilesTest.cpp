// The side files: the signal/pin map file (header, device lines, one padded
// line per pad cell with its instance path) and the translation file (port,
// net and instance records, the clock component records and the clock tracer
// behind them). The runs that write them: test_programs.sh and the option
// rows.

#include <map>

#include "Nlw_PcsWriter.h"
#include "Nlw_PinWriter.h"
#include "VerilogWriterTest.h"

struct Nlw_PcsWriterTestPeer {
    static void WriteDcmInfo(Nlw_PcsWriter& w, Nlw_NlBlock* b) { w.WriteDcmInfo(b); }
};

namespace {

using PinList = std::vector<std::pair<const char*, int>>;
using Lines = std::vector<std::string>;

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

// ---------------------------------------------------------------------------
// The translation file: port, net and instance records, the clock component
// records and the clock tracer behind them.

constexpr int IN = NLW_DIR_INPUT, OUT = NLW_DIR_OUTPUT, IO = NLW_DIR_INOUT;

class PcsWriterTest : public vwtest::WriterTest {
protected:
    PcsWriterTest() { b_.ReservePorts(top_, 32); }

    // A library cell type, made once per name.
    Nlw_NlType* Type(const char* name, const PinList& pins, bool timcell = true) {
        auto it = types_.find(name);
        if (it != types_.end()) return it->second;
        Nlw_NlType* type = b_.AddLibraryType(name, timcell, false);
        for (const auto& pin : pins) b_.AddTypePin(type, pin.first, pin.second);
        return types_[name] = type;
    }
    Nlw_NlType* Buffer(const char* name) { return Type(name, {{"I", IN}, {"O", OUT}}); }
    Nlw_NlType* Dcm() {
        return Type("V_DCM", {{"CLKIN", IN}, {"CLKFB", IN}, {"CLK0", OUT}, {"CLK180", OUT}});
    }
    Nlw_NlType* Mux(const char* name = "V_BUFGMUX") {
        return Type(name, {{"I0", IN}, {"I1", IN}, {"S", IN}, {"O", OUT}});
    }
    Nlw_NlBlock* Cell(Nlw_NlType* type, const std::string& name, Nlw_NlBlock* parent = nullptr) {
        return b_.CreateLeaf(parent ? parent : top_, type, name.c_str());
    }
    Nlw_NlSignal* Net(const std::string& name, Nlw_NlBlock* macro = nullptr) {
        return b_.AddSignal(macro ? macro : top_, name.c_str());
    }
    void Wire(Nlw_NlBlock* block, const char* pin, Nlw_NlSignal* net) {
        b_.Connect(block->FindPin(pin), net);
    }
    // A port of the top module joined to its net inside.
    Nlw_NlSignal* TopPort(const std::string& name, int dir) {
        Nlw_NlSignal* net = Net(name);
        b_.ConnectChild(b_.AddPort(top_, name.c_str(), dir), net);
        return net;
    }
    // A cell driven from net on input "I" and driving a new net from "O".
    Nlw_NlSignal* Through(const char* type, const char* name, Nlw_NlSignal* in) {
        Nlw_NlBlock* cell = Cell(Buffer(type), name);
        Nlw_NlSignal* out = Net(std::string(name) + "_o");
        Wire(cell, "I", in);
        Wire(cell, "O", out);
        return out;
    }
    std::string Pcs() {
        Nlw_PcsWriter writer(&nlw_, "memory.pcs", Port::Stream::Memory);
        writer.WriteView(&view_, 0);
        return nlwtest::Replaced(writer.GetMemoryText(), NLW_VERSION, "<version>");
    }

    std::map<std::string, Nlw_NlType*> types_;
};

// Ports, nets and instances of a flat design, each case one object of it.
TEST_F(PcsWriterTest, PortNetAndInstanceRecords) {
    TopPort("clk", IN);
    TopPort("q", OUT);
    TopPort("io", IO);
    TopPort("hidden", IN);
    TopPort("odd", NLW_DIR_UNTYPED);
    top_->FindPin("q")->SetAka("Q_PAD");
    b_.SetVisible(top_->FindPin("hidden"), false);
    int n = 0;
    for (const nlwtest::Row& c : nlwtest::Table("pcs_nets")) {
        Nlw_NlSignal* net = Net("n" + std::to_string(n));
        net->SetWritableName(vorform("n%d_w", n++));
        if (c[3] == "1") net->SetAka("N_AKA");
        b_.SetVisible(net, c[0] == "1");
        if (c[1] != "-") net->AddProperty(Vdm_Property::NewInt(c[1].c_str(), 1));
        if (c[2] != "-")
            b_.GetOrCreateNetwork(net)->AddProperty(Vdm_Property::NewInt(c[2].c_str(), 1));
    }
    n = 0;
    for (const nlwtest::Row& c : nlwtest::Table("pcs_cells")) {
        Nlw_NlBlock* cell = Cell(Type(c[0].c_str(), {}, c[2] == "1"), "c" + std::to_string(n++));
        if (c[1] != "-") cell->SetAka(c[1].c_str());
        if (c[3] != "1") cell->AddProperty(Vdm_Property::NewInt("NLW_NOT_INSTANTIATABLE", 1));
    }
    Port_MsgCapture capture;
    nlwtest::ExpectGolden("pcs/flat_records", Pcs());
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Internal),
              Lines{"Nlw_VerilogWriter: Notype top/odd detected.\n"});
}

TEST_F(PcsWriterTest, HierarchicalDesignListsSubModuleInstancesButNotItsNets) {
    Nlw_NlBlock* sub = b_.CreateMacro(top_, b_.AddModuleType("sub"), "u1");
    Nlw_NlType* fd = Type("V_FD", {{"D", IN}, {"Q", OUT}});
    Cell(fd, "ff_top")->SetAka("FF_A");
    Cell(fd, "ff_sub", sub)->SetAka("FF_B");
    Nlw_NlSignal* inner = Net("n_sub", sub);
    inner->SetAka("N_SUB");
    inner->AddProperty(Vdm_Property::NewInt("USER_VISIBLE", 1));
    // Clock components in sub-modules give no record.
    for (Nlw_NlType* type : {Dcm(), Mux(), Buffer("V_CKBUF")}) Cell(type, "c", sub)->SetAka("AKA");
    // Macros are walked from the last down to the root.
    nlwtest::ExpectGolden("pcs/hierarchical", Pcs());
}

TEST_F(PcsWriterTest, ClockComponentRecords) {
    Nlw_NlSignal* bufg = Through("V_CKBUF", "buf0", TopPort("clk_in", IN));
    bufg->SetWritableName("clk_bufg");
    Nlw_NlType* type = Type("V_DCM", {{"CLKIN", IN},
                                      {"CLKFB", IN},
                                      {"CLK0", OUT},
                                      {"LOCKED", OUT},
                                      {"DO", OUT},
                                      {"SPARE", IO},
                                      {"TEST", NLW_DIR_UNTYPED}});
    b_.AddTypePinBus(type, "STATUS", OUT, 1, 0);  // bused pins get no record
    Nlw_NlBlock* dcm = Cell(type, "dcm0");
    Wire(dcm, "CLKIN", bufg);
    Wire(dcm, "CLK0", Net("clk0"));
    b_.SetVisible(dcm->FindPin("DO"), false);
    dcm->AddProperty(Vdm_Property::NewFloat("CLKDV_DIVIDE", 2.5));
    dcm->AddProperty(Vdm_Property::NewString("CLKIN_DIVIDE_BY_2", "TRUE"));
    dcm->AddProperty(Vdm_Property::NewFloat("CLKFX_DIVIDE", 3.9));  // read as 3
    dcm->AddProperty(Vdm_Property::NewInt("CLK_FEEDBACK", 1));      // a number for a text
    dcm->AddProperty(Vdm_Property::NewInt("PHASE_SHIFT", -20));
    // A whole divider gets one decimal; any case of the type name dispatches.
    int k = 0;
    for (Vdm_Property* value :
         {Vdm_Property::NewFloat("CLKDV_DIVIDE", 2), Vdm_Property::NewInt("CLKDV_DIVIDE", 2)}) {
        Nlw_NlBlock* adv = Cell(Type("v_dcm_adv", {}), "adv" + std::to_string(k++));
        adv->SetAka("DCM_A");
        adv->AddProperty(value);
    }
    // Multiplexers name the inputs that trace to a port, or give no record.
    for (int m = 0; m < 4; ++m) {
        const std::string k = std::to_string(m);
        Nlw_NlBlock* mux = Cell(Mux(), "mux" + k);
        Nlw_NlSignal* a = Net("a" + k);
        Nlw_NlSignal* b = Net("b" + k);
        Wire(mux, "I0", a);
        Wire(mux, "I1", b);
        if (m & 1) b_.ConnectChild(b_.AddPort(top_, ("ca" + k).c_str(), IN), a);
        if (m & 2) b_.ConnectChild(b_.AddPort(top_, ("cb" + k).c_str(), IN), b);
    }
    // A clock buffer on a bidirectional port traces nowhere.
    Nlw_NlBlock* buf = Cell(Buffer("V_CKBUF"), "buf1");
    Wire(buf, "I", TopPort("clk_io", IO));
    Wire(buf, "O", Net("o"));
    nlwtest::ExpectGolden("pcs/clock_records", Pcs());
}

// ---------------------------------------------------------------------------
// The tracer

class PcsTracerTest : public PcsWriterTest {
protected:
    // Traces the input "I" of a sink cell on net. What it finds: the port,
    // the component's and the writer's primary clock, whether inverted, the
    // nearest clock device and its pin ("-": none).
    std::string Trace(Nlw_NlSignal* net, Nlw_NlBlock* parent = nullptr) {
        Nlw_NlBlock* sink = Cell(Type("SINK", {{"I", IN}}), "sink", parent);
        Wire(sink, "I", net);
        comp_ = Nlw_PcsComp(sink);
        return Found(writer_.GetPrimaryClock(sink->FindPin("I"), comp_), comp_);
    }
    std::string Found(const Nlw_NlPin* port, const Nlw_PcsComp& c) {
        auto name = [](const auto* x) { return x ? x->ToString() : std::string("-"); };
        return name(port) + ", " + name(c.primaryClock) + ", " +
               name(writer_.GetLastPrimaryClock()) + (c.inverted ? ", inverted, " : ", ") +
               name(c.clockDevice) + ", " + name(c.clockDevicePin);
    }
    Nlw_PcsWriter writer_{&nlw_, "memory.pcs", Port::Stream::Memory};
    Nlw_PcsComp comp_;
};

TEST_F(PcsTracerTest, InverterAndInvertingClockOutputCancel) {
    Nlw_NlBlock* dcm = Cell(Dcm(), "dcm0");
    Nlw_NlSignal* c180 = Net("c180");
    Wire(dcm, "CLKIN", TopPort("clk", IN));
    Wire(dcm, "CLK180", c180);
    EXPECT_EQ(Trace(Through("V_INV", "inv", c180)),
              "top/clk, top/clk, top/clk, V_DCM dcm0, dcm0/CLK180");
}

TEST_F(PcsTracerTest, InvertingStagesFlipTheFlag) {
    for (const char* type : {"V_INV", "V_BUF", "V_TRI", "V_IBUFDS"}) {
        SCOPED_TRACE(type);
        const std::string port = std::string("top/") + type + ", ";
        EXPECT_EQ(Trace(Through(type, type, TopPort(type, IN))),
                  port + port + port + (type == std::string("V_INV") ? "inverted, " : "") + "-, -");
    }
    Nlw_NlBlock* mux = Cell(Mux("V_BUFGMUX_1"), "mux1");
    Wire(mux, "I1", TopPort("m", IN));  // I0 left open: the mux's I0 is still followed
    Nlw_NlSignal* out = Net("mux_o");
    Wire(mux, "O", out);
    EXPECT_EQ(Trace(out), "-, -, -, inverted, V_BUFGMUX_1 mux1, mux1/O");
}

TEST_F(PcsTracerTest, UntracedDriversAndMissingInputsArePassedOver) {
    Nlw_NlSignal* net = Net("n");
    Wire(Cell(Type("V_FD", {{"D", IN}, {"Q", OUT}}), "ff"), "Q", net);
    Wire(Cell(Buffer("v_buf"), "lower"), "O", net);  // case matters here
    Wire(Cell(Type("V_CKBUF", {{"A", IN}, {"O", OUT}}), "noinput"), "O", net);
    b_.ConnectChild(b_.AddPort(top_, "out", OUT), net);
    Nlw_NlBlock* buf = Cell(Buffer("V_BUF"), "buf");
    Wire(buf, "O", net);
    Wire(buf, "I", TopPort("clk", IN));
    // The clock buffer without an input is recorded all the same.
    EXPECT_EQ(Trace(net), "top/clk, top/clk, top/clk, V_CKBUF noinput, noinput/O");
}

TEST_F(PcsTracerTest, FoundInputThatLeadsNowhereEndsTheTrace) {
    Nlw_NlSignal* net = Net("n");
    Wire(Cell(Buffer("V_BUF"), "dead"), "O", net);  // its input is open
    Nlw_NlBlock* live = Cell(Buffer("V_BUF"), "live");
    Wire(live, "O", net);
    Wire(live, "I", TopPort("clk", IN));
    EXPECT_EQ(Trace(net), "-, -, -, -, -");
}

TEST_F(PcsTracerTest, OnlyTopLevelInputPortsAreClocks) {
    EXPECT_EQ(Trace(TopPort("bidir", IO)), "-, -, -, -, -");
    Nlw_NlBlock* sub = b_.CreateMacro(top_, b_.AddModuleType("sub"), "u1");
    Nlw_NlSignal* inner = Net("inner", sub);
    b_.ConnectChild(b_.AddPort(sub, "p", IN), inner);
    EXPECT_EQ(Trace(inner, sub), "-, -, -, -, -");
}

TEST_F(PcsTracerTest, FirstClockDeviceRecordedIsTheNearest) {
    Nlw_NlSignal* bufg = Through("V_CKBUF", "buf0", TopPort("clk", IN));
    Nlw_NlBlock* dcm = Cell(Dcm(), "dcm0");
    Nlw_NlSignal* clk0 = Net("clk0");
    Wire(dcm, "CLKIN", bufg);
    Wire(dcm, "CLK0", clk0);
    EXPECT_EQ(Trace(clk0), "top/clk, top/clk, top/clk, V_DCM dcm0, dcm0/CLK0");
    Nlw_PcsComp fromDcm(dcm);
    EXPECT_EQ(Found(writer_.GetPrimaryClock(dcm->FindPin("CLKIN"), fromDcm), fromDcm),
              "top/clk, top/clk, top/clk, V_CKBUF buf0, buf0/O");
}

TEST_F(PcsTracerTest, LoopsOfBuffersEndWithoutAPort) {
    Nlw_NlSignal* c = Net("c");
    Nlw_NlBlock* b2 = Cell(Buffer("V_INV"), "b2");
    Wire(b2, "I", Through("V_BUF", "b1", c));
    Wire(b2, "O", c);
    EXPECT_EQ(Trace(c), "-, -, -, -, -");
    Nlw_NlSignal* a = Net("a");
    Nlw_NlBlock* b3 = Cell(Buffer("V_BUF"), "b3");  // a buffer feeding itself
    Wire(b3, "I", a);
    Wire(b3, "O", a);
    EXPECT_EQ(Trace(a), "-, -, -, -, -");
}

TEST_F(PcsTracerTest, InputPinsMatchByNameIgnoringCaseAndMustBeInputs) {
    Nlw_NlBlock* cell = Cell(Type("X", {{"clkin", OUT}, {"ClkIn", IN}, {"CLKIN", IN}}), "x");
    EXPECT_EQ(writer_.GetInputPin(cell, "CLKIN"), cell->GetPin(1));
    EXPECT_EQ(writer_.GetInputPin(cell, "I"), nullptr);
    EXPECT_EQ(writer_.GetInputPin(nullptr, "I"), nullptr);
}

TEST_F(PcsTracerTest, ClockManagerWithoutTraceHasNoBracedPort) {
    Nlw_NlBlock* dcm = Cell(Dcm(), "dcm0");
    Wire(dcm, "CLKIN", Net("floating"));
    Nlw_PcsWriterTestPeer::WriteDcmInfo(writer_, dcm);
    EXPECT_EQ(writer_.GetMemoryText(),
              "INST#V_DCM=dcm0,INPUT|CLKIN=floating;\nINST#V_DCM=dcm0,INPUT|CLKFB=;\n"
              "INST#V_DCM=dcm0,OUTPUT|CLK0=;\nINST#V_DCM=dcm0,OUTPUT|CLK180=;\n");
}

}  // namespace

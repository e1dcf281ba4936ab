// The translation file: port, net and instance records, the clock component
// records and the clock tracer behind them.
#include <algorithm>
#include <fstream>
#include <map>
#include <sstream>
#include <utility>
#include <vector>

#include "Nlw_PcsWriter.h"
#include "VerilogWriterTest.h"

struct Nlw_PcsWriterTestPeer {
    static void WriteDcmInfo(Nlw_PcsWriter& w, Nlw_NlBlock* b) { w.WriteDcmInfo(b); }
};

namespace {

using PinList = std::vector<std::pair<const char*, int>>;
constexpr int IN = NLW_DIR_INPUT, OUT = NLW_DIR_OUTPUT, IO = NLW_DIR_INOUT;

class PcsWriterTest : public vwtest::WriterTest {
protected:
    PcsWriterTest() {
        top_ = b_.CreateRoot(b_.AddModuleType("top"), "top");
        b_.ReservePorts(top_, 16);
    }

    // A library cell type, made once per name.
    Nlw_NlType* Type(const char* name, const PinList& pins, bool timcell = true) {
        auto it = types_.find(name);
        if (it != types_.end()) return it->second;
        Nlw_NlType* type = b_.AddLibraryType(name, timcell, false);
        for (const auto& pin : pins) b_.AddTypePin(type, pin.first, pin.second);
        return types_[name] = type;
    }
    Nlw_NlType* Buffer(const char* name) { return Type(name, {{"I", IN}, {"O", OUT}}); }
    Nlw_NlType* Dcm(const char* name = "V_DCM") {
        return Type(name, {{"CLKIN", IN}, {"CLKFB", IN}, {"CLK0", OUT}, {"CLK180", OUT}});
    }
    Nlw_NlType* Mux(const char* name = "V_BUFGMUX") {
        return Type(name, {{"I0", IN}, {"I1", IN}, {"S", IN}, {"O", OUT}});
    }

    Nlw_NlBlock* Cell(Nlw_NlType* type, const char* name, Nlw_NlBlock* parent = nullptr) {
        return b_.CreateLeaf(parent ? parent : top_, type, name);
    }
    Nlw_NlSignal* Net(const char* name, Nlw_NlBlock* macro = nullptr) {
        return b_.AddSignal(macro ? macro : top_, name);
    }
    void Wire(Nlw_NlBlock* block, const char* pin, Nlw_NlSignal* net) {
        b_.Connect(block->FindPin(pin), net);
    }
    // A port of the top module joined to its net inside.
    Nlw_NlSignal* TopPort(const char* name, int dir) {
        Nlw_NlSignal* net = Net(name);
        b_.ConnectChild(b_.AddPort(top_, name, dir), net);
        return net;
    }
    // A cell driven from net on input "I" and driving a new net from "O".
    Nlw_NlSignal* Through(const char* type, const char* name, Nlw_NlSignal* in) {
        Nlw_NlBlock* cell = Cell(Buffer(type), name);
        Nlw_NlSignal* out = Net((std::string(name) + "_o").c_str());
        Wire(cell, "I", in);
        Wire(cell, "O", out);
        return out;
    }

    std::string Pcs() {
        Nlw_PcsWriter writer(&nlw_, "memory.pcs", Port::Stream::Memory);
        writer.WriteView(&view_, 0);
        return writer.GetMemoryText();
    }
    // The records: every line after the header.
    std::vector<std::string> Records() {
        std::istringstream in(Pcs());
        std::vector<std::string> lines;
        std::string line;
        for (int i = 0; i < 6 && std::getline(in, line);) ++i;
        while (std::getline(in, line)) lines.push_back(line);
        return lines;
    }
    // The records of one component (lines starting with "INST#<type>=").
    std::vector<std::string> Inst(const char* type) {
        std::vector<std::string> lines;
        for (const std::string& line : Records())
            if (line.rfind(std::string("INST#") + type + "=", 0) == 0) lines.push_back(line);
        return lines;
    }

    Nlw_NlBlock* top_ = nullptr;
    std::map<std::string, Nlw_NlType*> types_;
};

using Lines = std::vector<std::string>;

// ---------------------------------------------------------------------------
// File layout, ports, nets and instances

TEST_F(PcsWriterTest, WritesHeaderPortsAndFlatDesignKind) {
    TopPort("clk", IN);
    TopPort("q", OUT);
    TopPort("io", IO);
    TopPort("hidden", IN);
    TopPort("odd", NLW_DIR_UNTYPED);
    top_->FindPin("q")->SetAka("Q_PAD");
    b_.SetVisible(top_->FindPin("hidden"), false);
    Port_MsgCapture capture;
    EXPECT_EQ(Pcs(), std::string("// Vornix qcf2dcf translation file produced by qdb2ver "
                                 "application (version ") +
                         NLW_VERSION +
                         ")\n"
                         "// This file is to be used with the qcf2sdc translator program that "
                         "converts a\n"
                         "// Vornix QCF file to Synopsys SDC file. This file should not be "
                         "modified.\n"
                         "\n"
                         "// Design name: demo\n"
                         "\n"
                         "MODULE#top,INPUT|clk;\n"
                         "MODULE#top,OUTPUT|Q_PAD?q;\n"
                         "MODULE#top,BIDIR|io;\n"
                         "DESIGN#FLAT;\n");
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
    // Macros are walked from the last down to the root.
    EXPECT_EQ(Records(),
              (Lines{"INST#V_FD=FF_B?ff_sub;", "INST#V_FD=FF_A?ff_top;", "DESIGN#HIERARCHICAL;"}));
}

TEST_F(PcsWriterTest, NetRecordsFollowVisibilityPropertiesAndAka) {
    struct Case {
        bool visible;
        const char* own;      // property on the net, or null
        const char* network;  // property on its network, or null
        bool aka;
        bool written;
    } cases[] = {
        {true, "USER_VISIBLE", nullptr, true, true},
        {true, "NAME_RECOVERED", nullptr, true, true},
        {true, nullptr, "NAME_RECOVERED", true, true},
        {true, nullptr, "USER_VISIBLE", true, true},
        {true, "USER_VISIBLE", nullptr, false, false},
        {true, nullptr, nullptr, true, false},
        {true, nullptr, "OTHER", true, false},
        {false, "USER_VISIBLE", nullptr, true, false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << c.visible << (c.own ? c.own : "-")
                                        << (c.network ? c.network : "-") << c.aka);
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlSignal* net = b.AddSignal(top, "n1");
        net->SetWritableName("n1_w");
        if (c.aka) net->SetAka("N1_AKA");
        b.SetVisible(net, c.visible);
        if (c.own) net->AddProperty(Vdm_Property::NewInt(c.own, 1));
        if (c.network) b.GetOrCreateNetwork(net)->AddProperty(Vdm_Property::NewInt(c.network, 1));
        Nlw_PcsWriter writer(&nlw_, "memory.pcs", Port::Stream::Memory);
        writer.WriteView(&view, 0);
        // The model name comes first, not the also-known-as name.
        const std::string text = writer.GetMemoryText();
        if (c.written)
            EXPECT_NE(text.find("\n\nNET#n1?n1_w;\nDESIGN#FLAT;\n"), std::string::npos) << text;
        else
            EXPECT_EQ(text.find("NET#"), std::string::npos) << text;
    }
}

TEST_F(PcsWriterTest, InstanceRecordsDependOnCellTypeAkaAndLibrary) {
    struct Case {
        const char* type;
        const char* aka;
        bool timcell;
        bool instantiatable;
        const char* record;  // null: none
    } cases[] = {
        {"V_RAMB16_S36", nullptr, true, true, "INST#V_RAMB16_S36=c;"},
        {"v_ramb4_s8", "RAM", true, true, "INST#v_ramb4_s8=RAM?c;"},
        {"V_FDDRCPE", nullptr, true, true, "INST#V_FDDRCPE=c;"},
        {"v_fddrrse", "DDR", true, true, "INST#v_fddrrse=DDR?c;"},
        {"V_FD", nullptr, true, true, nullptr},
        {"V_FD", "FF", true, true, "INST#V_FD=FF?c;"},
        {"V_RAMB16_S36", nullptr, false, true, nullptr},
        {"V_RAMB16_S36", nullptr, true, false, nullptr},
        {"V_FDDRRSEX", nullptr, true, true, nullptr},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.type);
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlBlock* cell = b.CreateLeaf(top, b.AddLibraryType(c.type, c.timcell, false), "c");
        if (c.aka) cell->SetAka(c.aka);
        if (!c.instantiatable) cell->AddProperty(Vdm_Property::NewInt("NLW_NOT_INSTANTIATABLE", 1));
        Nlw_PcsWriter writer(&nlw_, "memory.pcs", Port::Stream::Memory);
        writer.WriteView(&view, 0);
        const std::string text = writer.GetMemoryText();
        if (c.record)
            EXPECT_NE(text.find(std::string(c.record) + "\nDESIGN#FLAT;\n"), std::string::npos)
                << text;
        else
            EXPECT_EQ(text.find("INST#"), std::string::npos) << text;
    }
}

// ---------------------------------------------------------------------------
// Clock component records

TEST_F(PcsWriterTest, ClockManagerWritesTracedPinsAndAttributes) {
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
    EXPECT_EQ(Inst("V_CKBUF"), Lines{"INST#V_CKBUF=buf0,OUTPUT|O{clk_in}=clk_bufg;"});
    EXPECT_EQ(Inst("V_DCM"), (Lines{
                                 "INST#V_DCM=dcm0,INPUT|CLKIN{clk_in}=clk_bufg;",
                                 "INST#V_DCM=dcm0,INPUT|CLKFB=;",
                                 "INST#V_DCM=dcm0,OUTPUT|CLK0=clk0;",
                                 "INST#V_DCM=dcm0,OUTPUT|LOCKED=;",
                                 "INST#V_DCM=dcm0,BIDIR|SPARE=;",
                                 "INST#V_DCM=dcm0,ATTRIB|CLKDV_DIVIDE=2.5;",
                                 "INST#V_DCM=dcm0,ATTRIB|CLK_FEEDBACK=1;",
                                 "INST#V_DCM=dcm0,ATTRIB|CLKFX_DIVIDE=3;",
                                 "INST#V_DCM=dcm0,ATTRIB|CLKFX_DIVIDE_BY_2=TRUE;",
                                 "INST#V_DCM=dcm0,ATTRIB|PHASE_SHIFT=-20;",
                             }));
}

TEST_F(PcsWriterTest, ClockManagerDividerIsWrittenWithOneDecimal) {
    for (Vdm_Property* value :
         {Vdm_Property::NewFloat("CLKDV_DIVIDE", 2), Vdm_Property::NewInt("CLKDV_DIVIDE", 2)}) {
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        Nlw_NlType* type = b.AddLibraryType("v_dcm_adv", true, false);  // any case dispatches
        Nlw_NlBlock* dcm = b.CreateLeaf(top, type, "dcm0");
        dcm->SetAka("DCM_A");
        dcm->AddProperty(value);
        Nlw_PcsWriter writer(&nlw_, "memory.pcs", Port::Stream::Memory);
        writer.WriteView(&view, 0);
        EXPECT_NE(writer.GetMemoryText().find(
                      "\nINST#v_dcm_adv=DCM_A?dcm0,ATTRIB|CLKDV_DIVIDE=2.0;\nDESIGN#FLAT;\n"),
                  std::string::npos)
            << writer.GetMemoryText();
    }
}

TEST_F(PcsWriterTest, ClockMultiplexerNamesTheInputsThatTrace) {
    struct Case {
        bool i0, i1;
        const char* record;  // null: none
    } cases[] = {
        {true, true, "INST#V_BUFGMUX=mux,INPUT|I0{ca}=a,I1{cb}=b;"},
        {true, false, "INST#V_BUFGMUX=mux,INPUT|I0{ca}=a;"},
        {false, true, "INST#V_BUFGMUX=mux,INPUT|I1{cb}=b;"},
        {false, false, nullptr},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(testing::Message() << c.i0 << c.i1);
        Nlw_NlView view;
        Nlw_NlBuilder b(&view);
        Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
        b.ReservePorts(top, 2);
        Nlw_NlType* mux = b.AddLibraryType("V_BUFGMUX", true, false);
        for (const char* pin : {"I0", "I1"}) b.AddTypePin(mux, pin, IN);
        Nlw_NlBlock* m = b.CreateLeaf(top, mux, "mux");
        Nlw_NlSignal* a = b.AddSignal(top, "a");
        Nlw_NlSignal* bb = b.AddSignal(top, "b");
        b.Connect(m->FindPin("I0"), a);
        b.Connect(m->FindPin("I1"), bb);
        if (c.i0) b.ConnectChild(b.AddPort(top, "ca", IN), a);
        if (c.i1) b.ConnectChild(b.AddPort(top, "cb", IN), bb);
        Nlw_PcsWriter writer(&nlw_, "memory.pcs", Port::Stream::Memory);
        writer.WriteView(&view, 0);
        const std::string text = writer.GetMemoryText();
        if (c.record)
            EXPECT_NE(text.find(std::string("\n") + c.record + "\n"), std::string::npos) << text;
        else
            EXPECT_EQ(text.find("INST#"), std::string::npos) << text;
    }
}

TEST_F(PcsWriterTest, ClockComponentsInSubModulesGiveNoRecord) {
    Nlw_NlBlock* sub = b_.CreateMacro(top_, b_.AddModuleType("sub"), "u1");
    for (Nlw_NlType* type : {Dcm(), Mux(), Buffer("V_CKBUF")}) {
        Nlw_NlBlock* cell = Cell(type, "c", sub);
        cell->SetAka("AKA");
    }
    EXPECT_EQ(Records(), Lines{"DESIGN#HIERARCHICAL;"});
}

TEST_F(PcsWriterTest, ClockBufferWithoutTraceWritesNothing) {
    Nlw_NlBlock* buf = Cell(Buffer("V_CKBUF"), "buf0");
    Wire(buf, "I", TopPort("clk", IO));  // not an input port
    Wire(buf, "O", Net("o"));
    EXPECT_EQ(Records(), (Lines{"MODULE#top,BIDIR|clk;", "DESIGN#FLAT;"}));
}

// ---------------------------------------------------------------------------
// The tracer

class PcsTracerTest : public PcsWriterTest {
protected:
    // Traces the input "I" of a sink cell on net.
    Nlw_NlPin* Trace(Nlw_NlSignal* net) {
        Nlw_NlBlock* sink = Cell(Type("SINK", {{"I", IN}}), "sink");
        Wire(sink, "I", net);
        comp_ = Nlw_PcsComp(sink);
        return writer_.GetPrimaryClock(sink->FindPin("I"), comp_);
    }
    Nlw_PcsWriter writer_{&nlw_, "memory.pcs", Port::Stream::Memory};
    Nlw_PcsComp comp_;
};

TEST_F(PcsTracerTest, InverterAndInvertingClockOutputCancel) {
    Nlw_NlSignal* clk = TopPort("clk", IN);
    Nlw_NlBlock* dcm = Cell(Dcm(), "dcm0");
    Nlw_NlSignal* c180 = Net("c180");
    Wire(dcm, "CLKIN", clk);
    Wire(dcm, "CLK180", c180);
    Nlw_NlPin* port = Trace(Through("V_INV", "inv", c180));
    EXPECT_EQ(port, top_->FindPin("clk"));
    EXPECT_EQ(comp_.primaryClock, port);
    EXPECT_EQ(writer_.GetLastPrimaryClock(), port);
    EXPECT_FALSE(comp_.inverted);
    EXPECT_EQ(comp_.clockDevice, dcm);
    EXPECT_EQ(comp_.clockDevicePin, dcm->FindPin("CLK180"));
}

TEST_F(PcsTracerTest, InvertingStagesFlipTheFlag) {
    struct Case {
        const char* type;
        bool inverted;
    } cases[] = {{"V_INV", true}, {"V_BUF", false}, {"V_TRI", false}, {"V_IBUFDS", false}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.type);
        EXPECT_NE(Trace(Through(c.type, c.type, TopPort(c.type, IN))), nullptr);
        EXPECT_EQ(bool(comp_.inverted), c.inverted);
        EXPECT_EQ(comp_.clockDevice, nullptr);
    }
    Nlw_NlBlock* mux = Cell(Mux("V_BUFGMUX_1"), "mux1");
    Wire(mux, "I1", TopPort("m", IN));  // I0 left open: the mux's I0 is still followed
    Nlw_NlSignal* out = Net("mux_o");
    Wire(mux, "O", out);
    EXPECT_EQ(Trace(out), nullptr);
    EXPECT_TRUE(comp_.inverted);
    EXPECT_EQ(comp_.clockDevice, mux);
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
    EXPECT_EQ(Trace(net), top_->FindPin("clk"));
    // The clock buffer without an input is recorded all the same.
    EXPECT_EQ(comp_.clockDevice->GetWritableName(), std::string("noinput"));
}

TEST_F(PcsTracerTest, FoundInputThatLeadsNowhereEndsTheTrace) {
    Nlw_NlSignal* net = Net("n");
    Wire(Cell(Buffer("V_BUF"), "dead"), "O", net);  // its input is open
    Nlw_NlBlock* live = Cell(Buffer("V_BUF"), "live");
    Wire(live, "O", net);
    Wire(live, "I", TopPort("clk", IN));
    EXPECT_EQ(Trace(net), nullptr);
    EXPECT_EQ(writer_.GetLastPrimaryClock(), nullptr);
}

TEST_F(PcsTracerTest, OnlyTopLevelInputPortsAreClocks) {
    EXPECT_EQ(Trace(TopPort("bidir", IO)), nullptr);
    EXPECT_EQ(comp_.primaryClock, nullptr);

    // An input port of a sub-module is not a primary clock either.
    Nlw_NlBlock* sub = b_.CreateMacro(top_, b_.AddModuleType("sub"), "u1");
    Nlw_NlSignal* inner = Net("inner", sub);
    b_.ConnectChild(b_.AddPort(sub, "p", IN), inner);
    Nlw_NlBlock* sink = Cell(Type("SINK", {{"I", IN}}), "sink_sub", sub);
    Wire(sink, "I", inner);
    Nlw_PcsComp comp(sink);
    EXPECT_EQ(writer_.GetPrimaryClock(sink->FindPin("I"), comp), nullptr);
}

TEST_F(PcsTracerTest, FirstClockDeviceRecordedIsTheNearest) {
    Nlw_NlSignal* bufg = Through("V_CKBUF", "buf0", TopPort("clk", IN));
    Nlw_NlBlock* dcm = Cell(Dcm(), "dcm0");
    Nlw_NlSignal* clk0 = Net("clk0");
    Wire(dcm, "CLKIN", bufg);
    Wire(dcm, "CLK0", clk0);
    EXPECT_EQ(Trace(clk0), top_->FindPin("clk"));
    EXPECT_EQ(comp_.clockDevice, dcm);
    EXPECT_EQ(comp_.clockDevicePin, dcm->FindPin("CLK0"));
    EXPECT_FALSE(comp_.inverted);

    Nlw_PcsComp fromDcm(dcm);
    EXPECT_EQ(writer_.GetPrimaryClock(dcm->FindPin("CLKIN"), fromDcm), top_->FindPin("clk"));
    EXPECT_EQ(fromDcm.clockDevice->GetWritableName(), std::string("buf0"));
}

TEST_F(PcsTracerTest, LoopOfBuffersEndsWithoutAPort) {
    Nlw_NlSignal* a = Net("a");
    Nlw_NlSignal* c = Net("c");
    Nlw_NlBlock* b1 = Cell(Buffer("V_BUF"), "b1");
    Nlw_NlBlock* b2 = Cell(Buffer("V_INV"), "b2");
    Wire(b1, "I", c);
    Wire(b1, "O", a);
    Wire(b2, "I", a);
    Wire(b2, "O", c);
    EXPECT_EQ(Trace(a), nullptr);
    // A buffer feeding itself.
    Nlw_NlSignal* self = Net("self");
    Nlw_NlBlock* b3 = Cell(Buffer("V_BUF"), "b3");
    Wire(b3, "I", self);
    Wire(b3, "O", self);
    EXPECT_EQ(Trace(self), nullptr);
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

// ---------------------------------------------------------------------------
// The driver

TEST(PcsFile, StaticTimingRunWritesTheTranslationFile) {
    vwtest::TempDir dir;
    vwtest::ScopedEnv stamp("NLW_TIMESTAMP", "Thu Jan  1 00:00:00 2026");
    Nlw_NlView view;
    Nlw_NlBuilder b(&view);
    b.CreateRoot(b.AddModuleType("top"), "top");
    Nlw_Params params;
    const std::string output = dir.Path() + "/top.v";
    params.SetOutputFileName(output.c_str());
    params.SetOutputFileMode(Port::Stream::Replace);
    params.SetStaMode(true);
    params.SetSimMode(false);
    Nlw_Design design("demo");
    Nlw_Verilog nlw;
    nlw.SetParams(&params);
    nlw.SetView(&view);
    nlw.SetDesign(&design);
    Port_MsgCapture capture;
    nlw.WriteDesign();
    const std::string pcs = dir.Path() + "/top.pcs";
    const Lines status = capture.Texts(Port_MsgLevel::Status);
    EXPECT_NE(std::find(status.begin(), status.end(), "Writing PCS file '" + pcs + "' ...\n"),
              status.end());
    std::ifstream in(pcs);
    std::stringstream text;
    text << in.rdbuf();
    EXPECT_NE(text.str().find("// Design name: demo\n\nDESIGN#FLAT;\n"), std::string::npos)
        << text.str();
}

}  // namespace

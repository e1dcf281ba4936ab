// Port lists and declarations, wire declarations and the assign statement.
#include "TestFiles.h"
#include "VerilogWriterTest.h"

namespace {

class VerilogWriterPorts : public vwtest::WriterTest {
protected:
    Nlw_NlBlock* Root(const char* name = "m") {
        return b_.CreateRoot(b_.AddModuleType(name), name);
    }
};

TEST_F(VerilogWriterPorts, ScalarsComeBeforeBusesWhateverThePinOrder) {
    Nlw_NlBlock* m = Root();
    b_.AddPort(m, "a", NLW_DIR_INPUT);
    b_.AddPortBus(m, "d", NLW_DIR_INPUT, 3, 0);
    b_.AddPort(m, "y", NLW_DIR_OUTPUT);
    b_.AddPortBus(m, "q", NLW_DIR_INOUT, 0, 1);
    b_.AddPort(m, "e-1", NLW_DIR_INOUT);
    b_.SetVisible(b_.AddPort(m, "hidden", NLW_DIR_INPUT), false);
    b_.SetValid(b_.AddPortBus(m, "bad", NLW_DIR_INPUT, 1, 0), false);
    nlwtest::ExpectGolden("ports/scalars_come_before_buses_whatever_the_pin_order", Module(m));
}

TEST_F(VerilogWriterPorts, UntypedPortIsListedButNotDeclared) {
    Nlw_NlBlock* m = Root();
    Nlw_NlPin* u = b_.AddPort(m, "u", NLW_DIR_UNTYPED);
    b_.AddPort(m, "a", NLW_DIR_INPUT);
    Nlw_NlPinBus* ub = b_.AddPortBus(m, "ub", NLW_DIR_UNTYPED, 1, 0);
    Port_MsgCapture capture;
    EXPECT_EQ(Module(m), "module m (\n  u, a, ub\n);\n  input a;\nendmodule\n\n");
    EXPECT_EQ(
        capture.Texts(Port_MsgLevel::Internal),
        (std::vector<std::string>{"Nlw_VerilogWriter: Notype " + u->ToString() + " detected.\n",
                                  "Nlw_VerilogWriter: Notype " + ub->ToString() + " detected.\n"}));
}

TEST_F(VerilogWriterPorts, PortLineOnlyWithPortsAndIndentedForBusesAlone) {
    Nlw_NlBlock* m = Root();
    EXPECT_EQ(Module(m), "module m (\n);\nendmodule\n\n");
    b_.AddPortBus(m, "d", NLW_DIR_OUTPUT, 1, 0);
    EXPECT_EQ(Module(m), "module m (\n  d\n);\n  output [1 : 0] d;\nendmodule\n\n");
}

TEST_F(VerilogWriterPorts, AkaCommentsOnlyWhenAsked) {
    Nlw_NlBlock* m = Root();
    b_.AddPort(m, "a", NLW_DIR_INPUT)->SetAka("A_orig");
    b_.AddPortBus(m, "d", NLW_DIR_INPUT, 1, 0)->SetAka("D_orig");
    b_.AddSignal(m, "n")->SetAka("N_orig");
    const std::string plain = Module(m);
    EXPECT_EQ(plain.find("AKA"), std::string::npos);
    params_.SetWriteAka(true);
    nlwtest::ExpectGolden("ports/aka_comments_only_when_asked", Module(m));
}

TEST_F(VerilogWriterPorts, WiresListScalarsBeforeBuses) {
    Nlw_NlBlock* m = Root();
    b_.AddSignal(m, "n1");
    b_.AddSignalBus(m, "bus", 3, 0);
    b_.SetVisible(b_.AddSignal(m, "hidden"), false);
    b_.AddSignal(m, "n-2");
    b_.SetValid(b_.AddSignalBus(m, "bad", 1, 0), false);
    Nlw_NlBus* sb = b_.AddSignalBus(m, "sb", 1, 0);
    b_.GetSignalBusMember(sb, 1);  // a member is declared with its bus only
    nlwtest::ExpectGolden("ports/wires_list_scalars_before_buses", Module(m));
}

TEST_F(VerilogWriterPorts, AssignJoinsPortsToDifferentlyNamedNets) {
    Nlw_NlBlock* m = Root();
    Nlw_NlType* drv = b_.AddLibraryType("DRV", true, false);
    b_.AddTypePin(drv, "O", NLW_DIR_OUTPUT);
    // Ports that are neither inputs nor outputs need a driver on their net;
    // those without one take no part, first or last.
    const std::vector<nlwtest::Row> ports = nlwtest::Table("assign_ports");
    for (const nlwtest::Row& p : ports) b_.AddPort(m, p[0].c_str(), std::stoi(p[1]));
    for (const nlwtest::Row& p : ports) {
        Nlw_NlSignal* net = b_.AddSignal(m, p[2].c_str());
        b_.ConnectChild(m->FindPin(p[0].c_str()), net);
        if (p[3] == "1") b_.Connect(b_.CreateLeaf(m, drv, "u")->FindPin("O"), net);
    }
    Port_MsgCapture capture;  // the untyped ports are reported
    // The host counts an inout port as a driver of its own net.
    nlwtest::ExpectGolden("ports/assign_by_direction", Module(m));
}

// A port on its own net takes no part; a global signal is written unescaped;
// a bus bit keeps its index outside the escape.
TEST_F(VerilogWriterPorts, AssignWritesGlobalsUnescapedAndBitIndexesOutside) {
    Nlw_NlBlock* m = Root();
    b_.ConnectChild(b_.AddPort(m, "a", NLW_DIR_INPUT), b_.AddSignal(m, "a"));
    Nlw_NlSignal* gsr = b_.AddSignal(m, "chipwide.GSR");
    gsr->AddProperty(Vdm_Property::NewBool("NLW_GLOBAL_SIGNAL", true));
    b_.ConnectChild(b_.AddPort(m, "gsr", NLW_DIR_INPUT), gsr);
    b_.ConnectChild(b_.AddPort(m, "o", NLW_DIR_OUTPUT), b_.AddSignal(m, "n.o"));
    b_.AddPortBus(m, "d", NLW_DIR_INPUT, 1, 0);
    Nlw_NlBus* inner = b_.AddSignalBus(m, "n-x", 1, 0);
    b_.ConnectChild(m->GetPinByAlias("d[1]"), b_.GetSignalBusMember(inner, 1));
    nlwtest::ExpectGolden("ports/assign_globals_and_bits", Module(m));
}

}  // namespace

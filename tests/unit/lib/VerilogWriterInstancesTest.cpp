// Instance statements and port maps.
#include "TestFiles.h"
#include "VerilogWriterTest.h"

namespace {

using vwtest::AfterHead;

class VerilogWriterInstances : public vwtest::WriterTest {
protected:
    VerilogWriterInstances() { top_ = b_.CreateRoot(b_.AddModuleType("top"), "top"); }

    // A cell with the scalar pins A, B, Y around the bus D[1:0].
    Nlw_NlType* Cell(const char* name) {
        Nlw_NlType* t = b_.AddLibraryType(name, true, false);
        b_.AddTypePin(t, "A", NLW_DIR_INPUT);
        b_.AddTypePinBus(t, "D", NLW_DIR_INPUT, 1, 0);
        b_.AddTypePin(t, "B", NLW_DIR_INPUT);
        b_.AddTypePin(t, "Y", NLW_DIR_OUTPUT);
        return t;
    }
    // A memory cell with the buses ADDR[1:0] and DATA[1:0], each bit on the
    // matching bit of the nets a and d.
    Nlw_NlBlock* Memory(const char* type, const char* name) {
        Nlw_NlType* t = view_.FindType(type);
        if (!t) {
            t = b_.AddLibraryType(type, true, false);
            b_.AddTypePinBus(t, "ADDR", NLW_DIR_INPUT, 1, 0);
            b_.AddTypePinBus(t, "DATA", NLW_DIR_OUTPUT, 1, 0);
        }
        if (!a_) {
            a_ = b_.AddSignalBus(top_, "a", 1, 0);
            d_ = b_.AddSignalBus(top_, "d", 1, 0);
        }
        Nlw_NlBlock* u = b_.CreateLeaf(top_, t, name);
        for (int i = 0; i < 2; ++i) {
            b_.Connect(u->GetPinByAlias(i ? "ADDR[1]" : "ADDR[0]"), b_.GetSignalBusMember(a_, i));
            b_.Connect(u->GetPinByAlias(i ? "DATA[1]" : "DATA[0]"), b_.GetSignalBusMember(d_, i));
        }
        return u;
    }
    // The instance statements of top.
    std::string Instances() {
        std::string text = Module(top_);
        size_t begin = text.find(");\n") + 3;
        while (text.compare(begin, 7, "  wire ") == 0) begin = text.find('\n', begin) + 1;
        return text.substr(begin, text.rfind("endmodule") - begin);
    }

    Nlw_NlBlock* top_ = nullptr;
    Nlw_NlBus* a_ = nullptr;
    Nlw_NlBus* d_ = nullptr;
};

TEST_F(VerilogWriterInstances, PortMapConnectsScalarsThenBuses) {
    Nlw_NlType* cell = Cell("V_CELL");
    Nlw_NlBus* nd = b_.AddSignalBus(top_, "net_d", 1, 0);
    Nlw_NlBlock* u1 = b_.CreateLeaf(top_, cell, "u1");
    b_.Connect(u1->FindPin("A"), b_.AddSignal(top_, "net_a"));
    b_.SetTieOff(u1->FindPin("B"), 0);
    b_.Connect(u1->FindPin("Y"), b_.AddSignal(top_, "net_y"));
    b_.Connect(u1->GetPinByAlias("D[1]"), b_.GetSignalBusMember(nd, 1));
    b_.SetTieOff(u1->GetPinByAlias("D[0]"), 1);
    // Nothing on A and D: the scalar is left out, the bus bits float.
    Nlw_NlBlock* u2 = b_.CreateLeaf(top_, cell, "u/2");
    b_.Connect(u2->FindPin("Y"), b_.AddSignal(top_, "n-y"));
    nlwtest::ExpectGolden("instances/port_map_connects_scalars_then_buses", Instances());
}

TEST_F(VerilogWriterInstances, NotInstantiatableChildWritesNothing) {
    params_.SetWriteAka(true);
    Nlw_NlBlock* u = b_.CreateLeaf(top_, Cell("V_CELL"), "u");
    u->SetAka("orig");
    u->AddProperty(Vdm_Property::NewBool("NLW_NOT_INSTANTIATABLE", true));
    EXPECT_EQ(Instances(), "");
}

TEST_F(VerilogWriterInstances, BitInitDrivesInputsLastCharacterFirst) {
    Nlw_NlBlock* u = b_.CreateLeaf(top_, Cell("V_CELL"), "u");
    u->AddProperty(Vdm_Property::NewString("NLW_BIT_INIT", "0110"));
    b_.Connect(u->FindPin("Y"), b_.AddSignal(top_, "y"));
    params_.SetWriteAka(true);
    u->SetAka("orig_u");
    nlwtest::ExpectGolden("instances/bit_init_drives_inputs_last_character_first", Instances());
}

// Without any port connection after them the bit-init lines must not end
// the list with a comma.
TEST_F(VerilogWriterInstances, BitInitWithoutConnectionsEndsWithoutComma) {
    Nlw_NlType* lut = b_.AddLibraryType("V_LUT2", true, false);
    b_.AddTypePin(lut, "I0", NLW_DIR_INPUT);
    b_.AddTypePin(lut, "I1", NLW_DIR_INPUT);
    Nlw_NlBlock* u = b_.CreateLeaf(top_, lut, "u");
    u->AddProperty(Vdm_Property::NewString("NLW_BIT_INIT", "10"));
    nlwtest::ExpectGolden("instances/bit_init_without_connections_ends_without_comma", Instances());
}

TEST_F(VerilogWriterInstances, BigEndingCellsConnectLeastSignificantBitFirst) {
    // The keys match type names ignoring case; a value naming the key itself
    // means every bus.
    // Entries of one type under keys of different case all apply.
    root_.File("data/vdm2ver.acd",
               "BigEndingTimcell = v_ram, V_ROM:addr, V_DUAL:ADDR, v_dual:data\n");
    Memory("V_RAM", "r");
    Memory("V_ROM", "m");
    Memory("V_REG", "g");
    Memory("V_Dual", "x");
    nlwtest::ExpectGolden("instances/big_ending_cells_connect_least_significant_bit_first",
                          Instances());
}

TEST_F(VerilogWriterInstances, BigEndingMapLeavesOtherCellsAlone) {
    root_.File("data/vdm2ver.acd", "BigEndingTimcell = V_RAM\n");
    // A functional cell of a listed name is no timing cell.
    Nlw_NlType* t = b_.AddLibraryType("V_RAM", false, true);
    b_.AddTypePinBus(t, "ADDR", NLW_DIR_INPUT, 1, 0);
    b_.AddTypePinBus(t, "DATA", NLW_DIR_OUTPUT, 1, 0);
    Memory("V_RAM", "f");
    nlwtest::ExpectGolden("instances/functional_cell_not_big_ending", Instances());
}

TEST_F(VerilogWriterInstances, MacroChildrenAreInstantiatedByPort) {
    Nlw_NlBlock* sub = b_.CreateMacro(top_, b_.AddModuleType("sub"), "s1");
    Nlw_NlPin* i = b_.AddPort(sub, "i", NLW_DIR_INPUT);
    b_.AddPortBus(sub, "o", NLW_DIR_OUTPUT, 0, 1);
    b_.Connect(i, b_.AddSignal(top_, "n"));
    Nlw_NlBus* w = b_.AddSignalBus(top_, "w", 1, 0);
    b_.Connect(sub->GetPinByAlias("o[0]"), b_.GetSignalBusMember(w, 0));
    nlwtest::ExpectGolden("instances/macro_children_are_instantiated_by_port", AfterHead(View()));
}

}  // namespace

// One module definition: traversal and layout, port lists and declarations,
// wires and the assign statement, instance statements and port maps, cell
// parameters.

#include "VerilogWriterTest.h"

namespace {

using vwtest::AfterHead;
using vwtest::ScopedEnv;

class VerilogWriterModules : public vwtest::WriterTest {
protected:
    VerilogWriterModules() { params_.SetInsert_chipwide(false); }

    // top holds a1 (type A, port x), b1 (type B) and a2 (type A, port z), in
    // this order, so the macro list is top, a1, b1, a2.
    void BuildThreeMacros() {
        Nlw_NlType* a = b_.AddModuleType("A");
        Nlw_NlBlock* a1 = b_.CreateMacro(top_, a, "a1");
        b_.AddPort(a1, "x", NLW_DIR_INPUT);
        b_.CreateMacro(top_, b_.AddModuleType("B"), "b1");
        a2_ = b_.CreateMacro(top_, a, "a2");
        b_.AddPort(a2_, "z", NLW_DIR_INPUT);
    }

    Nlw_NlBlock* a2_ = nullptr;
};

TEST_F(VerilogWriterModules, WritesEachTypeOnceInReverseMacroOrder) {
    BuildThreeMacros();
    // A comes from a2, the later of the two macros of that type.
    nlwtest::ExpectGolden("modules/writes_each_type_once_in_reverse_macro_order",
                          AfterHead(View()));
}

TEST_F(VerilogWriterModules, CellDefineWrapsModuleOneLevelDeeper) {
    BuildThreeMacros();
    params_.SetWriteCellDefine(true);
    nlwtest::ExpectGolden("modules/cell_define_wraps_module_one_level_deeper", Module(a2_));
}

TEST_F(VerilogWriterModules, UseLibDirectiveEndsFileAfterChipwide) {
    BuildThreeMacros();
    params_.SetWriteUseLib(true);
    params_.SetInsert_chipwide(true);
    root_.Dir("verilog/src/timcells");
    root_.File("verilog/src/chipwide.v", "module chipwide;\nendmodule\n");
    nlwtest::ExpectGolden("modules/uselib_after_chipwide",
                          nlwtest::Replaced(AfterHead(View()), root_.Path(), "<root>"));
}

TEST_F(VerilogWriterModules, MultipleHierarchyModeWritesOnlyThePreambleFromView) {
    BuildThreeMacros();
    params_.SetMHFMode(true);
    const std::string text = View();
    EXPECT_NE(text.find("`timescale 1 ns/1 ps\n\n"), std::string::npos);
    EXPECT_EQ(AfterHead(text), "");
}

TEST_F(VerilogWriterModules, ModuleFileHasHeadModuleAndClosingUseLib) {
    BuildThreeMacros();
    params_.SetWriteUseLib(true);
    root_.Dir("verilog/src/timcells");
    auto writer = MakeWriter();
    writer->WriteMHBlock(a2_);
    const std::string text = writer->GetMemoryText();
    EXPECT_NE(text.find("// Module Name: A\n"), std::string::npos);
    EXPECT_EQ(AfterHead(text), "module A (\n  z\n);\n  input z;\nendmodule\n\n`uselib\n");
}

TEST_F(VerilogWriterModules, BlackBoxModeHidesTheBodyFromSynthesis) {
    BuildThreeMacros();
    nlw_.SetIsVornixCore(true);
    params_.SetFuncellMode(true);
    nlwtest::ExpectGolden("modules/black_box_mode_hides_the_body_from_synthesis", Module(a2_));
    // Either flag alone writes a plain module.
    nlw_.SetIsVornixCore(false);
    EXPECT_EQ(Module(a2_), "module A (\n  z\n);\n  input z;\nendmodule\n\n");
}

TEST_F(VerilogWriterModules, AkaCommentFollowsTheOpeningParenthesis) {
    BuildThreeMacros();
    a2_->SetAka("orig/a2\nnext");
    EXPECT_EQ(Module(a2_).substr(0, 11), "module A (\n");
    params_.SetWriteAka(true);
    // A line break in the name must not end the comment early.
    EXPECT_EQ(Module(a2_).substr(0, 33), "module A ( // AKA:orig/a2 next\n  ");
}

// ---------------------------------------------------------------------------
// Port lists and declarations, wire declarations and the assign statement.

using VerilogWriterPorts = vwtest::WriterTest;

TEST_F(VerilogWriterPorts, ScalarsComeBeforeBusesWhateverThePinOrder) {
    Nlw_NlBlock* m = top_;
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
    Nlw_NlBlock* m = top_;
    Nlw_NlPin* u = b_.AddPort(m, "u", NLW_DIR_UNTYPED);
    b_.AddPort(m, "a", NLW_DIR_INPUT);
    Nlw_NlPinBus* ub = b_.AddPortBus(m, "ub", NLW_DIR_UNTYPED, 1, 0);
    Port_MsgCapture capture;
    EXPECT_EQ(Module(m), "module top (\n  u, a, ub\n);\n  input a;\nendmodule\n\n");
    EXPECT_EQ(
        capture.Texts(Port_MsgLevel::Internal),
        (std::vector<std::string>{"Nlw_VerilogWriter: Notype " + u->ToString() + " detected.\n",
                                  "Nlw_VerilogWriter: Notype " + ub->ToString() + " detected.\n"}));
}

TEST_F(VerilogWriterPorts, PortLineOnlyWithPortsAndIndentedForBusesAlone) {
    Nlw_NlBlock* m = top_;
    EXPECT_EQ(Module(m), "module top (\n);\nendmodule\n\n");
    b_.AddPortBus(m, "d", NLW_DIR_OUTPUT, 1, 0);
    EXPECT_EQ(Module(m), "module top (\n  d\n);\n  output [1 : 0] d;\nendmodule\n\n");
}

TEST_F(VerilogWriterPorts, AkaCommentsOnlyWhenAsked) {
    Nlw_NlBlock* m = top_;
    b_.AddPort(m, "a", NLW_DIR_INPUT)->SetAka("A_orig");
    b_.AddPortBus(m, "d", NLW_DIR_INPUT, 1, 0)->SetAka("D_orig");
    b_.AddSignal(m, "n")->SetAka("N_orig");
    const std::string plain = Module(m);
    EXPECT_EQ(plain.find("AKA"), std::string::npos);
    params_.SetWriteAka(true);
    nlwtest::ExpectGolden("ports/aka_comments_only_when_asked", Module(m));
}

TEST_F(VerilogWriterPorts, WiresListScalarsBeforeBuses) {
    Nlw_NlBlock* m = top_;
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
    Nlw_NlBlock* m = top_;
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
    Nlw_NlBlock* m = top_;
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

// ---------------------------------------------------------------------------
// Instance statements and port maps.

class VerilogWriterInstances : public vwtest::WriterTest {
protected:
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

// ---------------------------------------------------------------------------
// Cell parameters: inline lists, defparam statements, typed formatting and
// the hex and bit string classification.

class VerilogWriterParams : public vwtest::WriterTest {
protected:
    VerilogWriterParams() {
        lut_ = b_.AddLibraryType("V_LUT4", true, false);
        b_.AddTypePin(lut_, "O", NLW_DIR_OUTPUT);
    }
    // An instance of V_LUT4 whose external list holds the given elements.
    Nlw_NlBlock* Lut(const char* name, std::initializer_list<Vdm_Property*> elements,
                     Nlw_NlType* type = nullptr) {
        Nlw_NlBlock* u = b_.CreateLeaf(top_, type ? type : lut_, name);
        Vdm_Property* list = Vdm_Property::NewList("EXTERNAL");
        for (Vdm_Property* e : elements) list->Add(e);
        u->SetExternalProperties(list);
        return u;
    }
    std::string Inline(Nlw_NlBlock* u) {
        auto writer = MakeWriter();
        writer->WriteInlineParamStatements(u);
        return writer->GetMemoryText();
    }
    std::string Defparam(Nlw_NlBlock* u) {
        auto writer = MakeWriter();
        writer->WriteDefparamStatements(u);
        return writer->GetMemoryText();
    }

    Nlw_NlType* lut_ = nullptr;
};

TEST_F(VerilogWriterParams, InlineListStandsBetweenTypeAndInstanceName) {
    Nlw_NlBlock* u1 = Lut("u1", {Vdm_Property::NewString("INIT", "16'h8000"),
                                 Vdm_Property::NewString("MODE", "\"FAST\"")});
    b_.Connect(u1->FindPin("O"), b_.AddSignal(top_, "o"));
    Lut("u2", {Vdm_Property::NewString("INIT", "16'h0001")});
    Lut("u3", {});
    nlwtest::ExpectGolden("params/inline", Module(top_));
}

// Module definitions written on two threads give the text and the messages
// of one thread, in module order.
TEST_F(VerilogWriterParams, TwoThreadsWriteWhatOneWrites) {
    for (const char* name : {"m1", "m2", "m3", "m4", "m5"}) {
        Nlw_NlBlock* m = b_.CreateMacro(top_, b_.AddModuleType(name), name);
        Nlw_NlBlock* u = b_.CreateLeaf(m, lut_, "u");
        Vdm_Property* list = Vdm_Property::NewList("EXTERNAL");
        list->Add(Vdm_Property::NewBool(name, true));
        list->Add(Vdm_Property::NewString("INIT", "16'h8000"));
        u->SetExternalProperties(list);
    }
    auto run = [&](const char* threads) {
        ScopedEnv env("NLW_WRITE_THREADS", threads);
        Port_MsgCapture capture;
        const std::string text = View();
        return std::make_pair(text, capture.Texts(Port_MsgLevel::Internal));
    };
    const auto one = run("1"), two = run("2");
    EXPECT_EQ(two.first, one.first);
    ASSERT_EQ(one.second.size(), 5u);
    EXPECT_EQ(two.second, one.second);
    EXPECT_NE(one.second[0].find("'m5'"), std::string::npos) << one.second[0];
}

TEST_F(VerilogWriterParams, DefparamModeWritesStatementsBeforeEveryParametrisedLeaf) {
    ScopedEnv defparm("NLW_VERILOG_DEFPARM", "");
    Lut("u1",
        {Vdm_Property::NewString("INIT", "16'h8000"), Vdm_Property::NewString("MODE", "\"FAST\"")});
    // Neither a timing nor a functional cell (a black box, a yosys cell):
    // its parameters all the same, else it would take its defaults.
    Lut("u-2", {Vdm_Property::NewString("INIT", "16'h8000")},
        b_.AddLibraryType("V_OTHER", false, false));
    nlwtest::ExpectGolden("params/defparam", Module(top_));
}

TEST_F(VerilogWriterParams, TypedFormattingFollowsTypeAndClassification) {
    ScopedEnv typed("NLW_OLD_PFD", "1");
    root_.File(
        "data/device.key",
        "HexStringProperty = hexint, HEXSTR, hexstr\nBitStringProperty = BITS, INIT_BIT, XON\n");
    Nlw_NlBlock* u = Lut(
        "u-1", {Vdm_Property::NewFloat("F", 1.5), Vdm_Property::NewInt("HEXINT", 10),
                Vdm_Property::NewInt("N", -5), Vdm_Property::NewString("HEXSTR", "1F"),
                Vdm_Property::NewString("xon", "true"), Vdm_Property::NewString("XON", "0"),
                Vdm_Property::NewString("init_bit", "01"), Vdm_Property::NewString("BITS", "0110"),
                Vdm_Property::NewString("MODE", "fast\"x")});
    nlwtest::ExpectGolden("params/typed_inline", Inline(u));
    nlwtest::ExpectGolden("params/typed_defparam", Defparam(u));
}

TEST_F(VerilogWriterParams, VerbatimFormattingWritesTextsAsTheyStand) {
    Nlw_NlBlock* u = Lut("u", {Vdm_Property::NewString("MODE", "fast")});
    EXPECT_EQ(Inline(u), "#(\n  .MODE ( fast ))\n");
    EXPECT_EQ(Defparam(u), "defparam u.MODE = fast;\n");
}

TEST_F(VerilogWriterParams, UnexpectedTypeIsReportedAndTakesNoSeparator) {
    Nlw_NlBlock* u = Lut("u", {Vdm_Property::NewBool("B", true), Vdm_Property::NewInt("N", 3),
                               Vdm_Property::NewBits("V", "01")});
    ScopedEnv typed("NLW_OLD_PFD", "");
    Port_MsgCapture capture;
    EXPECT_EQ(Inline(u), "#(\n  .N ( 3 ))\n");
    EXPECT_EQ(Defparam(u), "defparam u.N = 3;\n");
    const std::string on = u->ToString();
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Internal),
              (std::vector<std::string>{
                  "Unexpected bool property type (name='B') in external list on " + on + ".\n",
                  "Unexpected bits property type (name='V') in external list on " + on + ".\n",
                  "Unexpected bool property type (name='B') in external list on " + on + ".\n",
                  "Unexpected bits property type (name='V') in external list on " + on + ".\n"}));
    // Nothing writable: no list at all.
    EXPECT_EQ(Inline(Lut("w", {Vdm_Property::NewBool("B", true)})), "");
}

TEST_F(VerilogWriterParams, SwitchesAreNeverExternalForFunctionalModels) {
    root_.File("data/vdm2ver.pfd", "HIDDEN\n");
    auto make = [&] {
        return Lut(
            "u", {Vdm_Property::NewString("MSGON", "TRUE"), Vdm_Property::NewString("xon", "FALSE"),
                  Vdm_Property::NewString("HIDDEN", "1"), Vdm_Property::NewString("P", "1")});
    };
    EXPECT_EQ(Inline(make()), "#(\n  .MSGON ( TRUE ),\n  .xon ( FALSE ),\n  .P ( 1 ))\n");
    params_.SetFuncellMode(true);
    EXPECT_EQ(Inline(make()), "#(\n  .P ( 1 ))\n");
    // Static timing netlists install no filter.
    params_.SetFuncellMode(false);
    params_.SetStaMode(true);
    EXPECT_EQ(Inline(make()),
              "#(\n  .MSGON ( TRUE ),\n  .xon ( FALSE ),\n  .HIDDEN ( 1 ),\n  .P ( 1 ))\n");
}

TEST_F(VerilogWriterParams, NameTablesIgnoreCase) {
    root_.File("data/device.key", "HexStringProperty = init, INIT, Init, other\n");
    auto writer = MakeWriter();
    EXPECT_EQ(writer->GetHexStringPropertyCount(), 2u);
    EXPECT_EQ(writer->GetBitStringPropertyCount(), 0u);
    Nlw_NlBlock* u = Lut("u", {});
    Vdm_Property init("INIT", VDM_PROP_STRING);
    EXPECT_TRUE(writer->IsHexStringProperty(&init, u));
    EXPECT_FALSE(writer->IsBitStringProperty(&init, u));
}

TEST_F(VerilogWriterParams, TypeLibraryAddsHexAndBitProperties) {
    Ldm_TypeLib lib;
    Ldm_TypeBlock* foo = lib.AddBlock("FOO");
    foo->AddDefinition("Config_General_Data", Vdm_Property::NewTypeDef("INITP", {"16'h0000"}));
    foo->AddDefinition("Config_General_Data", Vdm_Property::NewTypeDef("MASK", {"4'b0000"}));
    foo->AddDefinition("Config_General_Data", Vdm_Property::NewString("PLAIN", "8'hFF"));
    Vdm_Property initp("initp", VDM_PROP_STRING), mask("MASK", VDM_PROP_STRING),
        plain("PLAIN", VDM_PROP_STRING);

    nlw_.SetTypeLib(&lib);
    auto writer = MakeWriter();
    for (const nlwtest::Row& c : nlwtest::Table("type_library_props")) {
        Nlw_NlBlock* u = b_.CreateLeaf(top_, lut_, "u");
        u->AddProperty(Vdm_Property::NewString("TYPE", c[0].c_str()));
        if (c[1] == "1") {
            u->AddProperty(Vdm_Property::NewString("INITP", "0"));
            u->AddProperty(Vdm_Property::NewString("MASK", "0"));
            u->AddProperty(Vdm_Property::NewString("PLAIN", "0"));
        }
        EXPECT_EQ(writer->IsHexStringProperty(&initp, u), c[2] == "1") << c[0];
        EXPECT_EQ(writer->IsBitStringProperty(&initp, u), c[3] == "1") << c[0];
        EXPECT_EQ(writer->IsBitStringProperty(&mask, u), c[4] == "1") << c[0];
        EXPECT_FALSE(writer->IsHexStringProperty(&plain, u)) << c[0];
    }
    // Without a type library only the tables answer.
    nlw_.SetTypeLib(nullptr);
    Nlw_NlBlock* u = b_.CreateLeaf(top_, lut_, "v");
    u->AddProperty(Vdm_Property::NewString("TYPE", "FOO"));
    u->AddProperty(Vdm_Property::NewString("INITP", "0"));
    EXPECT_FALSE(writer->IsHexStringProperty(&initp, u));
}

}  // namespace

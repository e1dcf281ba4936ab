// Cell parameters: inline lists, defparam statements, typed formatting and
// the hex and bit string classification.
#include "TestFiles.h"
#include "VerilogWriterTest.h"

namespace {

using vwtest::ScopedEnv;

class VerilogWriterParams : public vwtest::WriterTest {
protected:
    VerilogWriterParams() {
        top_ = b_.CreateRoot(b_.AddModuleType("top"), "top");
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

    Nlw_NlBlock* top_ = nullptr;
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

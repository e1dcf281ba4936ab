// Module traversal and the layout of one module definition.
#include "TestFiles.h"
#include "VerilogWriterTest.h"

namespace {

using vwtest::AfterHead;

class VerilogWriterModules : public vwtest::WriterTest {
protected:
    VerilogWriterModules() { params_.SetInsert_chipwide(false); }

    // top holds a1 (type A, port x), b1 (type B) and a2 (type A, port z), in
    // this order, so the macro list is top, a1, b1, a2.
    void BuildThreeMacros() {
        top_ = b_.CreateRoot(b_.AddModuleType("top"), "top");
        Nlw_NlType* a = b_.AddModuleType("A");
        Nlw_NlBlock* a1 = b_.CreateMacro(top_, a, "a1");
        b_.AddPort(a1, "x", NLW_DIR_INPUT);
        b_.CreateMacro(top_, b_.AddModuleType("B"), "b1");
        a2_ = b_.CreateMacro(top_, a, "a2");
        b_.AddPort(a2_, "z", NLW_DIR_INPUT);
    }

    Nlw_NlBlock* top_ = nullptr;
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

}  // namespace

// Netlists that yosys writes from small designs, read back.
#include <set>

#include "ReaderTestSupport.h"
#include "framework/Nlw_Util.h"

using namespace readertest;

namespace {

class JsonReaderYosys : public ::testing::Test {
protected:
    void SetUp() override {
        if (!HaveYosys()) GTEST_SKIP() << "yosys is not installed";
    }
    Loaded Synth(const std::string& verilog, const std::string& script,
                 Nlw_ReadOptions options = {}) {
        std::string json = Synthesize(dir_, verilog, script);
        Loaded l = LoadFile(json, options);
        EXPECT_TRUE(l.ok) << (l.errors.empty() ? "" : l.errors[0]);
        return l;
    }
    // The real installation's cell library is not what yosys maps to.
    Installation inst_{DataFiles{{"cells.dat", TestCells()}}};
    TempDir dir_;
};

const std::string kBusDesign = nlwtest::Data("verilog/bus_design.v");

TEST_F(JsonReaderYosys, ReadsHierarchyBusesAndConstants) {
    Loaded l = Synth(kBusDesign, "synth -top t");
    if (!l.ok) return;
    Nlw_NlBlock* root = l.root();
    EXPECT_STREQ(root->GetTypeName(), "t");
    struct Bus {
        const char* name;
        int msb, lsb, dir;
    } buses[] = {{"a", 3, 0, NLW_DIR_INPUT},
                 {"b", 0, 3, NLW_DIR_INPUT},
                 {"y", 3, 0, NLW_DIR_OUTPUT},
                 {"u", 1, 2, NLW_DIR_OUTPUT}};
    Nlw_NlBlock* s = Child(root, "s");
    ASSERT_NE(s, nullptr);
    ASSERT_TRUE(s->IsMacro());
    for (const Bus& b : buses) {
        for (Nlw_NlBlock* blk : {root, s}) {
            if (blk == s && std::string(b.name) == "u") continue;
            Nlw_NlPinBus* pb = PinBus(blk, b.name);
            ASSERT_NE(pb, nullptr) << b.name;
            EXPECT_EQ(pb->GetMSB(0), b.msb) << b.name;
            EXPECT_EQ(pb->GetLSB(0), b.lsb) << b.name;
            EXPECT_EQ(pb->GetDirection(), b.dir) << b.name;
        }
    }
    // Constant ports inside and out; a port on another port's net.
    EXPECT_EQ(InsideOf(root, "k"), "1'b1");
    EXPECT_EQ(InsideOf(root, "w"), "a[0]");
    EXPECT_EQ(InsideOf(s, "z"), "1'b0");
    EXPECT_EQ(InsideOf(s, "u[2]"), "1'b1");
    EXPECT_EQ(InsideOf(s, "u[1]"), "a[0]");
    // The instance's ports connect to the parent's nets bit by bit.
    EXPECT_EQ(NetOf(s, "a[2]"), "a[2]");
    EXPECT_EQ(NetOf(s, "b[0]"), "b[0]");
    EXPECT_EQ(NetOf(s, "u[1]"), "u[1]");
}

TEST_F(JsonReaderYosys, ReadsLookupTablesOfEveryWidth) {
    Loaded l = Synth(nlwtest::Data("verilog/luts.v"), "synth -top t -lut 4");
    if (!l.ok) return;
    std::set<int> widths;
    for (Nlw_NlBlock* c : l.root()->GetChildren()) {
        ASSERT_STREQ(c->GetTypeName(), "$lut");
        const Vdm_Property* width = c->GetPropertyByName("WIDTH");
        const Vdm_Property* lut = c->GetPropertyByName("LUT");
        ASSERT_TRUE(width && lut);
        EXPECT_EQ(lut->GetType(), VDM_PROP_BITS);
        int w = static_cast<int>(std::stoul(width->GetString(), nullptr, 2));
        widths.insert(w);
        EXPECT_EQ(std::string(lut->GetString()).size(), size_t(1) << w);
        // Each table's input bus is as wide as the table, every bit driven.
        Nlw_NlPin* y = c->GetPinByAlias("Y");
        ASSERT_NE(y, nullptr);
        EXPECT_EQ(y->GetDirection(), NLW_DIR_OUTPUT);
        if (w == 1) {
            EXPECT_NE(NetOf(c, "A"), "");
            continue;
        }
        Nlw_NlPinBus* a = PinBus(c, "A");
        ASSERT_NE(a, nullptr);
        EXPECT_EQ(a->GetDirection(), NLW_DIR_INPUT);
        EXPECT_EQ(a->GetWidth(), w);
        for (int i = 0; i < w; ++i) {
            std::string bit = "A[" + std::to_string(i) + "]";
            EXPECT_TRUE(NetOf(c, bit) != "" || TieOf(c, bit) >= 0) << bit;
        }
    }
    EXPECT_GT(widths.size(), 1u);
    EXPECT_TRUE(l.warnings.empty());
}

TEST_F(JsonReaderYosys, TakesBlackboxModulesAsCellTypes) {
    Loaded l = Synth(nlwtest::Data("verilog/blackbox.v"), "hierarchy -top t; proc");
    if (!l.ok) return;
    EXPECT_EQ(l.view->GetNumMacros(), 1u);
    Nlw_NlBlock* m = Child(l.root(), "m");
    ASSERT_NE(m, nullptr);
    EXPECT_FALSE(m->IsMacro());
    EXPECT_EQ(m->GetPinByAlias("d[1]")->GetDirection(), NLW_DIR_INPUT);
    EXPECT_EQ(NetOf(m, "d[1]"), "d[1]");
    EXPECT_EQ(m->GetPinByAlias("q")->GetDirection(), NLW_DIR_OUTPUT);
    const char* mode = Nlw_Util::GetStringProp(m, "MODE");
    ASSERT_NE(mode, nullptr);
    EXPECT_STREQ(mode, "FAST");
    const Vdm_Property* w = m->GetPropertyByName("W");
    ASSERT_NE(w, nullptr);
    EXPECT_EQ(w->GetType(), VDM_PROP_BITS);
    EXPECT_EQ(std::string(w->GetString()).substr(29), "011");
}

const std::string kTwoLevels = nlwtest::Data("verilog/two_levels.v");

// Flattened by yosys (keeping hdlnames) or by the reader on request.
TEST_F(JsonReaderYosys, ReadsATwoLevelDesignFlattenedEitherWay) {
    Loaded h = Synth(kTwoLevels, "synth -top t -flatten");
    ASSERT_TRUE(h.ok);
    int withAka = 0;
    for (Nlw_NlBlock* c : h.root()->GetChildren())
        if (c->GetAka() && std::string(c->GetAka()).find("u1/u2/") == 0) ++withAka;
    for (Nlw_NlSignal* s : h.root()->GetSignals())
        if (s->GetAka() && std::string(s->GetAka()).find("u1/") == 0) ++withAka;
    if (const UT_DARRAY<Nlw_NlBus*>* buses = h.root()->GetSignalBuses())
        for (Nlw_NlBus* b : *buses)
            if (b->GetAka() && std::string(b->GetAka()).find("u1/") == 0) ++withAka;
    EXPECT_GT(withAka, 0);

    Nlw_ReadOptions opt;
    opt.flatten = true;
    Loaded l = Synth(kTwoLevels, "synth -top t", opt);
    if (!l.ok) return;
    EXPECT_EQ(l.view->GetNumMacros(), 1u);
    int flops = 0;
    for (Nlw_NlBlock* c : l.root()->GetChildren()) {
        ASSERT_FALSE(c->IsMacro());
        std::string name = c->GetInstanceName();
        if (name.rfind("u1/u2/", 0) == 0 &&
            std::string(c->GetTypeName()).find("DFF") != std::string::npos) {
            ++flops;
            // The flip-flop's data input is the top's own port net.
            std::string d = NetOf(c, "D");
            EXPECT_TRUE(d == "a[0]" || d == "a[1]") << d;
        }
    }
    EXPECT_EQ(flops, 2);
}

}  // namespace

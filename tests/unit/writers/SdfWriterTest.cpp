// The timing file writer: names as the netlist writes them, SDF escaping,
// hierarchy, time scale, value triples and the three ways of writing net
// delays, against one golden file.

#include "HostTestSupport.h"
#include "framework/Nlw_Timing.h"
#include "model/Nlw_NlBuilder.h"
#include "writers/Nlw_SdfWriter.h"

namespace {

using hosttest::StubNetlistWriter;

class SdfWriterTest : public ::testing::Test {
protected:
    void SetUp() override {
        Nlw_NlType* ram = b_.AddLibraryType("RAM", true, false);
        b_.AddTypePin(ram, "CLK", NLW_DIR_INPUT);
        b_.AddTypePinBus(ram, "DO", NLW_DIR_OUTPUT, 1, 0);
        Nlw_NlType* fd = b_.AddLibraryType("FD", true, false);
        b_.AddTypePin(fd, "C", NLW_DIR_INPUT);
        b_.AddTypePin(fd, "D", NLW_DIR_INPUT);
        b_.AddTypePin(fd, "Q", NLW_DIR_OUTPUT);
        root_ = b_.CreateRoot(b_.AddModuleType("top"), "top");
        // Written names as the legalizer left them: an escaped one with a
        // "." and a "$", and a flattened path with "/".
        mem_ = b_.CreateLeaf(root_, ram, "mem.0$x");
        sub_ = b_.CreateMacro(root_, b_.AddModuleType("sub"), "u1");
        reg_ = b_.CreateLeaf(sub_, fd, "a/r");

        Add(Nlw_TimingKind::IoPath, mem_->FindPin("CLK"), NLW_EDGE_POS, mem_->FindPin("DO[1]"),
            NLW_EDGE_NONE, {Triple(100, 200, 300), Triple(150, 150, 150)});
        Nlw_Rvalue partial = Triple(10, 0, 30);
        partial.present = 5;  // "(10::30)"
        Add(Nlw_TimingKind::SetupHold, reg_->FindPin("D"), NLW_EDGE_NONE, reg_->FindPin("C"),
            NLW_EDGE_POS, {partial, Nlw_Rvalue()});
        Add(Nlw_TimingKind::Interconnect, reg_->FindPin("Q"), NLW_EDGE_NONE, mem_->FindPin("CLK"),
            NLW_EDGE_NONE, {Triple(5, 6, 7)});
        nlw_.SetParams(&params_);
        nlw_.SetView(&view_);
        nlw_.SetDesign(&design_);
        nlw_.SetTiming(&timing_);
    }

    static Nlw_Rvalue Triple(double a, double b, double c) {
        Nlw_Rvalue r;
        r.v[0] = a;
        r.v[1] = b;
        r.v[2] = c;
        r.present = 7;
        return r;
    }

    void Add(Nlw_TimingKind kind, Nlw_NlPin* p1, uint8_t e1, Nlw_NlPin* p2, uint8_t e2,
             std::initializer_list<Nlw_Rvalue> values) {
        ASSERT_TRUE(p1 && p2);
        Nlw_TimingEntry e;
        e.kind = kind;
        e.pin1 = p1;
        e.pin2 = p2;
        e.edge1 = e1;
        e.edge2 = e2;
        e.firstValue = static_cast<uint32_t>(timing_.values.size());
        e.numValues = static_cast<uint8_t>(values.size());
        timing_.values.insert(timing_.values.end(), values);
        timing_.entries.push_back(e);
    }

    // The file for the view (block null) or one module block, without the
    // version line.
    std::string Write(Nlw_NlBlock* block) {
        Nlw_SdfWriter writer(&nlw_, "t.sdf", Port::Stream::Memory);
        if (block)
            writer.WriteMHBlock(block);
        else
            writer.WriteView(&view_, 0);
        std::string text = writer.GetMemoryText();
        size_t v = text.find("  (VERSION");
        if (v != std::string::npos) text.erase(v, text.find('\n', v) + 1 - v);
        return text;
    }

    Nlw_NlView view_;
    Nlw_NlBuilder b_{&view_};
    Nlw_Params params_;
    Nlw_Design design_{"demo"};
    StubNetlistWriter nlw_;
    Nlw_Timing timing_;
    Nlw_NlBlock *root_ = nullptr, *mem_ = nullptr, *sub_ = nullptr, *reg_ = nullptr;
};

TEST_F(SdfWriterTest, WritesWhatTheGoldenFileHolds) {
    std::string out;
    out += "=== the design, nets as INTERCONNECT\n" + Write(nullptr);
    out += "=== module u1, paths relative to it\n" + Write(sub_);
    out += "=== module top: its own cells and the nets it encloses\n" + Write(root_);
    params_.SetWritePsTimePrecision(false);
    out += "=== -10ps: values in units of 10 ps\n" + Write(nullptr);
    params_.SetWritePsTimePrecision(true);
    timing_.netMode = Nlw_Timing::NetMode::Port;
    out += "=== nets as PORT delays\n" + Write(nullptr);
    timing_.netMode = Nlw_Timing::NetMode::IoPath;
    out += "=== nets added to the paths from the driven pins\n" + Write(nullptr);
    timing_.nominal = true;
    out += "=== nominal delays say so\n" + Write(reg_->GetParent());

    nlwtest::ExpectGolden("sdf/writer", out);
}

TEST(SdfWriter, EscapesEveryCharacterOutsideIdentifiers) {
    for (const nlwtest::Row& c : nlwtest::Table("sdf_names"))
        EXPECT_EQ(Nlw_SdfWriter::EscapeName(c[0].c_str()), c[1]) << c[0];
}

}  // namespace

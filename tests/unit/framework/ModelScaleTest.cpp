// A large flat design: building, querying and legalizing stay linear.
#include <gtest/gtest.h>

#include <string>

#include "framework/Nlw_Nl_LU.h"
#include "model/Nlw_NlBuilder.h"

namespace {

// Accepts every name: the walk's own work (keywords, uniqueness) remains.
class PassLU : public Nlw_Nl_LU {
public:
    explicit PassLU(Nlw_NlView* view) : Nlw_Nl_LU(view, true, true, false, true) {}
    bool IsLegal(Port::String, bool) override { return true; }
    Port::String Legalize(Port::String name, bool) override { return name; }
};

TEST(ModelScale, BuildsAndLegalizesTwoHundredThousandLeaves) {
    constexpr int kLeaves = 200000;
    Nlw_NlBus::SetOutputDelimiterType(4);
    Nlw_NlView view;
    Nlw_NlBuilder b(&view);
    Nlw_NlType* lut = b.AddLibraryType("LUT4", false, true);
    b.AddTypePinBus(lut, "I", NLW_DIR_INPUT, 3, 0);
    b.AddTypePin(lut, "O", NLW_DIR_OUTPUT);
    Nlw_NlBlock* top = b.CreateRoot(b.AddModuleType("top"), "top");
    b.ReservePorts(top, 1);
    Nlw_NlSignal* clk = b.AddSignal(top, "clk");
    b.ConnectChild(b.AddPort(top, "clk", NLW_DIR_INPUT), clk);

    Nlw_NlSignal* previous = clk;
    for (int i = 0; i < kLeaves; ++i) {
        // Every thousandth instance repeats a name, to be made unique.
        const std::string name = "u" + std::to_string(i % 1000 == 999 ? i - 1 : i);
        Nlw_NlBlock* u = b.CreateLeaf(top, lut, name.c_str());
        Nlw_NlSignal* out = b.AddSignal(top, ("n" + std::to_string(i)).c_str());
        b.Connect(u->GetPinByAlias("I[0]"), previous);
        b.Connect(u->GetPinByAlias("I[3]"), clk);
        b.Connect(u->FindPin("O"), out);
        previous = out;
    }
    EXPECT_EQ(view.GetNumLeafBlocks(), size_t(kLeaves));
    EXPECT_EQ(clk->GetPinCount(), size_t(kLeaves) + 2);
    EXPECT_EQ(previous->FindDriverPin()->GetBlock(), top->GetChildren().back());

    PassLU lu(&view);
    lu.Process();
    EXPECT_STREQ(top->GetChildren()[999]->GetWritableName(), "u998_1");
    EXPECT_STREQ(top->GetChildren()[999]->GetAka(), "u998");
    EXPECT_STREQ(top->GetChildren()[kLeaves - 1]->GetWritableName(),
                 ("u" + std::to_string(kLeaves - 2) + "_1").c_str());
}

}  // namespace

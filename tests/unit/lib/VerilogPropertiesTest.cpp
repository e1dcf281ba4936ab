// Simulatable property conversion: cell properties checked against the
// simulation library's parameter definitions and turned into Verilog values.

#include <memory>

#include "ModelText.h"
#include "Nlw_Verilog.h"
#include "TestFiles.h"
#include "model/Nlw_NlBuilder.h"

namespace {

class VerilogProperties : public ::testing::Test {
protected:
    void SetUp() override {
        Nlw_NlBuilder builder(&view);
        Nlw_NlBlock* top = builder.CreateRoot(builder.AddModuleType("top"), "top");
        cell = builder.CreateLeaf(top, builder.AddLibraryType("X_CELL", true, false), "u1");
        nlw.simPropTable[Port::String("x_cell")] = &definitions;
        list.reset(Vdm_Property::NewList("params"));
    }

    // Offers one property; returns the text added under name, or "<none>".
    std::string Offer(Vdm_Property* property, const char* expectedName = nullptr) {
        std::unique_ptr<Vdm_Property> owned(property);
        const size_t before = list->GetCount();
        const unsigned char added = nlw.AddIfSimulatableProperty(cell, property, list.get());
        if (!added) {
            EXPECT_EQ(list->GetCount(), before);
            return "<none>";
        }
        EXPECT_EQ(list->GetCount(), before + 1);
        const Vdm_Property* result = list->GetElement(list->GetCount() - 1);
        EXPECT_EQ(result->GetType(), VDM_PROP_STRING);
        if (expectedName) {
            EXPECT_STREQ(result->GetName(), expectedName);
        }
        return result->GetString();
    }

    // One line per offer: what was added (or "<none>") and the messages.
    std::string OfferLine(const std::string& label, Vdm_Property* property) {
        Port_MsgCapture capture;
        std::string line = label + " -> " + Offer(property, property->GetName());
        for (const Port_Msg& m : capture.msgs)
            line += std::string(" | ") + "DSIWEX"[static_cast<int>(m.level)] + ": " + m.text;
        if (capture.msgs.empty()) line += "\n";
        return line;
    }

    Nlw_Verilog nlw;
    Nlw_NlView view;
    Nlw_NlBlock* cell = nullptr;
    std::vector<Nlw_Property> definitions;
    std::unique_ptr<Vdm_Property> list;
};

TEST_F(VerilogProperties, ConvertsByTypeCodeAndExpectedType) {
    std::string text;
    for (const nlwtest::Row& c : nlwtest::Table("sim_conversions")) {
        definitions = {Nlw_Property("P", c[2].c_str(), c[3].c_str())};
        Vdm_Property* p = nlwtest::NewProperty(c[0], "P", c[1]);
        text += OfferLine(std::string(p->GetPropertyTypeName()) + " as " + c[2], p);
    }
    nlwtest::ExpectGolden("properties/conversions", text);
}

// Vectors are sized by the default's width; widths that are no decimal
// number fall back to the value's own.
TEST_F(VerilogProperties, SizesVectorsByTheDefaultsWidth) {
    std::string text;
    for (const nlwtest::Row& c : nlwtest::Table("sim_vectors")) {
        definitions = {Nlw_Property("P", c[0].c_str(), c[1].c_str())};
        text +=
            OfferLine(c[0] + " " + c[1] + " " + c[2], Vdm_Property::NewString("P", c[2].c_str()));
    }
    nlwtest::ExpectGolden("properties/vectors", text);
}

// The table's key is "x_cell", the block's type "X_CELL".
TEST_F(VerilogProperties, MatchesTypeAndParameterNamesIgnoringCase) {
    definitions = {Nlw_Property("Other", "I", ""), Nlw_Property("Delay", "I", ""),
                   Nlw_Property("DELAY", "S", "")};
    // The first definition of the name wins.
    // Added under the model's spelling, which simulators match with case.
    EXPECT_EQ(Offer(Vdm_Property::NewInt("delay", 5), "Delay"), "5");
}

TEST_F(VerilogProperties, InitialStatePropertiesBecomeInit) {
    definitions = {Nlw_Property("INIT", "BV", "1'b0")};
    EXPECT_EQ(Offer(Vdm_Property::NewString("INITSTATE", "1"), "INIT"), "1'b1");
    EXPECT_EQ(Offer(Vdm_Property::NewString("init_bit", "0"), "INIT"), "1'b0");
    EXPECT_EQ(Offer(Vdm_Property::NewString("INIT", "1"), "INIT"), "1'b1");

    // The replaced name is the one the warnings give.
    definitions = {Nlw_Property("INIT", "I", "")};
    Port_MsgCapture capture;
    EXPECT_EQ(Offer(Vdm_Property::NewString("InitState", "1")), "<none>");
    EXPECT_EQ(capture.Texts(Port_MsgLevel::Warning),
              std::vector<std::string>{
                  "Mismatched property type detected - type I expected for property INIT:, but "
                  "type string detected, ignored.\n"});
}

TEST_F(VerilogProperties, UnknownTypesAndParametersAreSilentlyLeftOut) {
    definitions = {Nlw_Property("KNOWN", "I", "")};
    Port_MsgCapture capture;
    EXPECT_EQ(Offer(Vdm_Property::NewInt("UNKNOWN", 1)), "<none>");
    nlw.simPropTable.clear();
    EXPECT_EQ(Offer(Vdm_Property::NewInt("KNOWN", 1)), "<none>");
    // A table entry without definitions knows nothing either.
    nlw.simPropTable[Port::String("X_CELL")] = nullptr;
    EXPECT_EQ(Offer(Vdm_Property::NewInt("KNOWN", 1)), "<none>");
    EXPECT_TRUE(capture.msgs.empty());
}

}  // namespace

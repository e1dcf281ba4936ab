// Simulatable property conversion: cell properties checked against the
// simulation library's parameter definitions and turned into Verilog values.
#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "Nlw_Verilog.h"
#include "model/Nlw_NlBuilder.h"

namespace {

const char* const kW1 =
    "Mismatched property type detected - type %s expected for property %s:, but type bool "
    "detected, ignored.\n";

std::string Format(const char* format, const char* a, const char* b = nullptr) {
    return b ? vorform(format, a, b) : vorform(format, a);
}

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

    Nlw_Verilog nlw;
    Nlw_NlView view;
    Nlw_NlBlock* cell = nullptr;
    std::vector<Nlw_Property> definitions;
    std::unique_ptr<Vdm_Property> list;
};

struct ConversionCase {
    const char* label;
    std::function<Vdm_Property*()> make;  // a property named P
    const char* type;                     // the definition's expected type
    const char* dflt;
    const char* expected;  // "<none>" when nothing is added
    std::string warning;   // "" when none
};

TEST_F(VerilogProperties, ConvertsByTypeCodeAndExpectedType) {
    const std::vector<ConversionCase> cases = {
        {"bool BL", [] { return Vdm_Property::NewBool("P", false); }, "BL", "", "true", ""},
        {"bool S", [] { return Vdm_Property::NewBool("P", true); }, "S", "", "<none>",
         Format(kW1, "S", "P")},
        {"float F", [] { return Vdm_Property::NewFloat("P", 2.5); }, "F", "", "2.500000", ""},
        {"float I", [] { return Vdm_Property::NewFloat("P", 2.5); }, "I", "", "<none>",
         Format("Mismatched property type detected - type %s expected for property %s:, but "
                "type float detected, ignored.\n",
                "I", "P")},
        {"int I", [] { return Vdm_Property::NewInt("P", -12); }, "I", "", "-12", ""},
        {"int S", [] { return Vdm_Property::NewInt("P", 7); }, "s", "", "\"7\"", ""},
        {"int HV", [] { return Vdm_Property::NewInt("P", 7); }, "HV", "16'h0000", "<none>",
         Format("Mismatched property type detected - type %s expected for property %s:, but "
                "type integer detected, ignored.\n",
                "HV", "P")},
        {"string S", [] { return Vdm_Property::NewString("P", "hello"); }, "S", "", "\"hello\"",
         ""},
        {"string BL", [] { return Vdm_Property::NewString("P", "yes"); }, "BL", "", "\"YES\"", ""},
        {"string F", [] { return Vdm_Property::NewString("P", "1.5e-3"); }, "F", "", "1.5e-3", ""},
        {"string I", [] { return Vdm_Property::NewString("P", "3"); }, "I", "", "<none>",
         Format("Mismatched property type detected - type %s expected for property %s:, but "
                "type string detected, ignored.\n",
                "I", "P")},
        {"typedef", [] { return Vdm_Property::NewTypeDef("P", {"a"}); }, "S", "", "<none>",
         Format("Invalid property type detected - %s, ignored.\n", "P")},
        {"bits", [] { return Vdm_Property::NewBits("P", "01"); }, "BV", "2'b00", "<none>",
         Format("Invalid property type detected - %s, ignored.\n", "P")},
    };
    for (const ConversionCase& c : cases) {
        definitions = {Nlw_Property("P", c.type, c.dflt)};
        Port_MsgCapture capture;
        EXPECT_EQ(Offer(c.make(), "P"), c.expected) << c.label;
        const std::vector<std::string> warnings = capture.Texts(Port_MsgLevel::Warning);
        if (c.warning.empty()) {
            EXPECT_TRUE(warnings.empty()) << c.label;
        } else {
            EXPECT_EQ(warnings, std::vector<std::string>{c.warning}) << c.label;
        }
        EXPECT_EQ(capture.msgs.size(), warnings.size()) << c.label;
    }
}

struct VectorCase {
    const char* type;
    const char* dflt;
    const char* value;
    const char* expected;
    bool warns;
};

TEST_F(VerilogProperties, SizesVectorsByTheDefaultsWidth) {
    const std::vector<VectorCase> cases = {
        {"HV", "16'h0000", "ABCD", "16'hABCD", false},
        {"HV", "0000", "ABC", "12'hABC", false},
        {"HV", "", "AB", "8'hAB", false},
        {"HV", "12'h000", "AB", "12'h0AB", true},
        {"HV", "10'h000", "3FF", "10'h3FF", false},
        {"HV", "4'h0", "ABCD", "4'hD", true},
        {"BV", "4'b0000", "101", "4'b0101", true},
        {"BV", "2'b00", "1101", "2'b01", true},
        {"BV", "0", "110", "3'b110", false},
        // Widths that are no decimal number fall back to the value's own.
        {"HV", "x'h00", "ABC", "12'hABC", false},
        {"BV", "4b'0", "10", "2'b10", false},
        {"HV", "0'h0", "A", "4'hA", false},
    };
    for (const VectorCase& c : cases) {
        definitions = {Nlw_Property("P", c.type, c.dflt)};
        Port_MsgCapture capture;
        EXPECT_EQ(Offer(Vdm_Property::NewString("P", c.value), "P"), c.expected)
            << c.type << " " << c.dflt << " " << c.value;
        const std::vector<std::string> warnings = capture.Texts(Port_MsgLevel::Warning);
        if (c.warns) {
            const bool hex = c.type[0] == 'H' || c.type[0] == 'h';
            EXPECT_EQ(warnings,
                      std::vector<std::string>{hex ? "Padding or triming the value for hex "
                                                     "property P:\n"
                                                   : "Padding or triming the value for binary "
                                                     "property P:\n"})
                << c.dflt << " " << c.value;
        } else {
            EXPECT_TRUE(warnings.empty()) << c.dflt << " " << c.value;
        }
    }
}

// The table's key is "x_cell", the block's type "X_CELL".
TEST_F(VerilogProperties, MatchesTypeAndParameterNamesIgnoringCase) {
    definitions = {Nlw_Property("Other", "I", ""), Nlw_Property("Delay", "I", ""),
                   Nlw_Property("DELAY", "S", "")};
    // The first definition of the name wins; the property keeps its name.
    EXPECT_EQ(Offer(Vdm_Property::NewInt("delay", 5), "delay"), "5");
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

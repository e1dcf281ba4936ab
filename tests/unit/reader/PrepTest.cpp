// The preparation pass: value conversions, Verilog literals, external
// property lists and the installation's property table.
#include <cmath>
#include <memory>

#include "HostTestSupport.h"
#include "ReaderTestSupport.h"
#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Util.h"
#include "reader/Nlw_Prep.h"

using namespace readertest;

namespace {

std::unique_ptr<Vdm_Property> Bits(const char* v) {
    return std::unique_ptr<Vdm_Property>(Vdm_Property::NewBits("P", v));
}
std::unique_ptr<Vdm_Property> Int(int v) {
    return std::unique_ptr<Vdm_Property>(Vdm_Property::NewInt("P", v));
}
std::unique_ptr<Vdm_Property> Float(double v) {
    return std::unique_ptr<Vdm_Property>(Vdm_Property::NewFloat("P", v));
}
std::unique_ptr<Vdm_Property> Str(const char* v) {
    return std::unique_ptr<Vdm_Property>(Vdm_Property::NewString("P", v));
}

// "9:text", "3:number", "1:number" or "none".
std::string Describe(const Vdm_Property* p) {
    if (!p) return "none";
    switch (p->GetType()) {
        case VDM_PROP_STRING:
            return "9:" + std::string(p->GetString());
        case VDM_PROP_INT:
            return "3:" + std::to_string(p->GetInt32());
        case VDM_PROP_FLOAT:
            return "1:" + std::to_string(p->GetFloat());
        default:
            return std::to_string(p->GetType()) + ":?";
    }
}

TEST(PrepConvert, TurnsFileValuesIntoWhatTheDefinitionExpects) {
    struct Case {
        std::unique_ptr<Vdm_Property> value;
        const char* type;
        std::string expected;
    };
    Case cases[] = {
        {Bits("0001001000110100"), "HV", "9:1234"},
        {Bits("101"), "hv", "9:5"},   // padded to whole digits; any case
        {Bits("1x01"), "HV", "9:9"},  // unknown bits count as 0
        {Bits("10x1"), "BV", "9:10x1"},
        {Bits("101"), "I", "3:5"},
        {Bits("11111111111111111111111111111111"), "I", "3:-1"},
        {Bits("11"), "S", "3:3"},
        {Bits("10"), "F", "1:" + std::to_string(2.0)},
        {Bits("1"), "BL", "9:TRUE"},
        {Bits("0"), "BL", "9:FALSE"},
        {Bits("01"), "Q", "none"},
        {Int(255), "HV", "9:FF"},
        {Int(5), "BV", "9:101"},
        {Int(7), "I", "none"},
        {Int(7), "S", "none"},
        {Int(3), "F", "1:" + std::to_string(3.0)},
        {Int(0), "BL", "9:FALSE"},
        {Float(4.0), "I", "3:4"},
        {Float(4.5), "I", "none"},
        {Float(2.5), "F", "none"},
        {Str("12"), "I", "3:12"},
        {Str("x"), "I", "none"},
        {Str("FAST"), "S", "none"},
        {Str("ABCD"), "HV", "none"},
    };
    for (const Case& c : cases) {
        std::unique_ptr<Vdm_Property> out = Nlw_Prep::Convert(*c.value, c.type);
        EXPECT_EQ(Describe(out.get()), c.expected)
            << Describe(c.value.get()) << " " << c.value->GetType() << " as " << c.type;
        if (out) {
            EXPECT_STREQ(out->GetName(), "P");
        }
    }
    std::unique_ptr<Vdm_Property> b(Vdm_Property::NewBool("P", true));
    EXPECT_EQ(Describe(Nlw_Prep::Convert(*b, "BL").get()), "9:TRUE");
}

TEST(PrepLiteral, WritesTheFileValueAsAVerilogLiteral) {
    struct Case {
        std::unique_ptr<Vdm_Property> value;
        const char* literal;  // null: no literal
    };
    Case cases[] = {
        {Bits("1000000000000000"), "16'h8000"},
        {Bits("00001010"), "8'h0A"},
        {Bits("101"), "3'b101"},
        {Bits("10x0"), "4'b10x0"},
        {Bits("zzzz"), "4'bzzzz"},
        {Int(-7), "-7"},
        {Float(2.5), "2.5"},
        {Float(3.0), "3.0"},
        {Float(1e20), "1e+20"},
        {Float(0.1), "0.1"},
        {Str("FAST"), "\"FAST\""},
        {Str("a\"b\\c"), "\"a\\\"b\\\\c\""},
        {Str("two\nlines"), "\"two\\nlines\""},
        {Str(""), "\"\""},
        {std::unique_ptr<Vdm_Property>(Vdm_Property::NewBool("P", false)), "1'b0"},
        {std::unique_ptr<Vdm_Property>(Vdm_Property::NewList("P")), nullptr},
        {Bits(""), nullptr},
    };
    for (const Case& c : cases) {
        std::string out;
        bool ok = Nlw_Prep::VerilogLiteral(*c.value, out);
        EXPECT_EQ(ok, c.literal != nullptr) << Describe(c.value.get());
        if (c.literal) {
            EXPECT_EQ(out, c.literal) << Describe(c.value.get());
        }
    }
}

// Records what the pass offers and accepts it as the given text.
class RecordingWriter : public hosttest::StubNetlistWriter {
public:
    unsigned char AddIfSimulatableProperty(Nlw_NlBlock* block, Vdm_Property* p,
                                           Vdm_Property* list) override {
        offered.push_back(std::string(block->GetInstanceName()) + "." + p->GetName() + "=" +
                          Describe(p));
        list->CreatePropertyString(p->GetName(), "accepted");
        return 1;
    }
    std::vector<std::string> offered;
};

std::vector<std::string> ListOf(const Nlw_NlBlock* b) {
    std::vector<std::string> out;
    if (const Vdm_Property* list = b->GetExternalProperties())
        for (const Vdm_Property* e : list->GetElements())
            out.push_back(std::string(e->GetName()) + "=" + e->GetString());
    return out;
}

TEST(PrepProperties, OffersKnownCellsAndKeepsOthersAsLiterals) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(nlwtest::Data("json/prep_cells.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    RecordingWriter nlw;
    nlw.SetView(l.view.get());
    nlw.AddSimProperty("lut2", "init", "HV", "4'h0");
    Nlw_Prep::PrepareProperties(nlw);

    // The table's cell: each defined parameter converted and offered; FOO,
    // which the table does not define, is not, nor INITSTATE beside INIT,
    // which would set the same model parameter twice.
    EXPECT_EQ(nlw.offered, (std::vector<std::string>{"lut.INIT=9:6"}));
    EXPECT_EQ(ListOf(Child(l.root(), "lut")), (std::vector<std::string>{"INIT=accepted"}));
    // Another cell keeps its parameters, not its attributes.
    EXPECT_EQ(ListOf(Child(l.root(), "ff")),
              (std::vector<std::string>{"INIT=1'b1", "MODE=\"FAST\"", "N=5"}));
    // A pad has no parameters, only its package pin.
    Nlw_NlBlock* pad = Child(l.root(), "pad");
    EXPECT_EQ(pad->GetExternalProperties(), nullptr);
    EXPECT_STREQ(Nlw_Util::GetStringProp(pad, "PINNAME"), "P3");

    // A second run gives the same lists.
    nlw.offered.clear();
    Nlw_Prep::PrepareProperties(nlw);
    EXPECT_EQ(nlw.offered.size(), 1u);
    EXPECT_EQ(ListOf(Child(l.root(), "ff")).size(), 3u);
}

TEST(PrepInstallation, LoadsTheTableAndItsVectorDefinitions) {
    {
        Installation inst(DataFiles{{"simprops.dat",
                                     "V_LUT4 INIT HV 16'h0000\n"
                                     "V_FD INIT BV 1'b0\n"
                                     "V_FD XON S \"TRUE\"\n"}});
        RecordingWriter nlw;
        std::unique_ptr<Ldm_TypeLib> lib(Nlw_Prep::LoadInstallationData(nlw));
        ASSERT_NE(lib, nullptr);
        EXPECT_EQ(nlw.simPropTable.size(), 2u);
        struct Case {
            const char* type;
            const char* def;
            const char* value;
        } cases[] = {{"V_LUT4", "INIT", "16'h0000"}, {"V_FD", "INIT", "1'b0"}};
        for (const Case& c : cases) {
            Ldm_TypeBlock* b = lib->GetBlockByName(c.type);
            ASSERT_NE(b, nullptr) << c.type;
            const std::vector<Vdm_Property*>& defs = b->GetPropertyCItr("Config_General_Data");
            ASSERT_EQ(defs.size(), 1u) << c.type;  // the string XON is no vector
            EXPECT_STREQ(defs[0]->GetName(), c.def);
            EXPECT_EQ(defs[0]->GetType(), VDM_PROP_TYPEDEF);
            EXPECT_EQ(defs[0]->GetValueTexts(), (std::vector<std::string>{c.value}));
        }
    }
    Installation empty;
    RecordingWriter nlw;
    EXPECT_EQ(Nlw_Prep::LoadInstallationData(nlw), nullptr);
}

}  // namespace

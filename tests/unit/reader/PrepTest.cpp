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

std::unique_ptr<Vdm_Property> Make(const std::string& kind, const std::string& v) {
    return std::unique_ptr<Vdm_Property>(nlwtest::NewProperty(kind, "P", v));
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
    for (const nlwtest::Row& c : nlwtest::Table("prep_convert")) {
        std::unique_ptr<Vdm_Property> out = Nlw_Prep::Convert(*Make(c[0], c[1]), c[2].c_str());
        EXPECT_EQ(Describe(out.get()), c[3]) << c[0] << " " << c[1] << " as " << c[2];
        if (out) {
            EXPECT_STREQ(out->GetName(), "P");
        }
    }
}

TEST(PrepLiteral, WritesTheFileValueAsAVerilogLiteral) {
    for (const nlwtest::Row& c : nlwtest::Table("prep_literal")) {
        std::string out = "-";
        EXPECT_EQ(Nlw_Prep::VerilogLiteral(*Make(c[0], c[1]), out), c[2] != "-") << c[1];
        EXPECT_EQ(out, c[2]) << c[0] << " " << c[1];
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

// The installation's data and the timing inputs: the cell library file, the
// preparation pass with its value conversions, Verilog literals and property
// table; the timing file reader, the Liberty reader and the nominal delays.

#include <cmath>

#include "HostTestSupport.h"
#include "ReaderTestSupport.h"
#include "framework/Nlw_Timing.h"
#include "framework/Nlw_Util.h"
#include "reader/Nlw_CellLibrary.h"
#include "reader/Nlw_Liberty.h"
#include "reader/Nlw_NominalTiming.h"
#include "reader/Nlw_Prep.h"
#include "reader/Nlw_SdfReader.h"

using namespace readertest;

namespace {

TEST(CellLibrary, ReadsCellsPinsBusesAndPads) {
    Nlw_CellLibrary lib;
    std::string error;
    ASSERT_TRUE(
        lib.Parse("# comment\n"
                  "cell A timcell   # trailing comment\n"
                  "  pin X input\n"
                  "\tbus D inout 0 7\n"
                  "\n"
                  "cell P funcell pad\r\n"
                  "pin PAD output pad\r\n",
                  "cells.dat", error))
        << error;
    // Each cell as "name classes: pin dir [msb:lsb/width] [pad]...".
    auto describe = [&](const char* name) {
        const Nlw_CellDef* c = lib.Find(name);
        if (!c) return std::string("none");
        std::string d = std::string(name) + (c->timcell ? " t" : "") + (c->funcell ? " f" : "") +
                        (c->pad ? " p" : "") + ":";
        for (const Nlw_CellPinDef& pin : c->pins) {
            d += " " + pin.name + " " + std::to_string(pin.dir);
            if (pin.bus)
                d += " " + std::to_string(pin.msb) + ":" + std::to_string(pin.lsb) + "/" +
                     std::to_string(pin.Width());
            if (pin.pad) d += " pad";
        }
        return d;
    };
    EXPECT_EQ(lib.size(), 2u);
    EXPECT_EQ(describe("A"), "A t: X " + std::to_string(NLW_DIR_INPUT) + " D " +
                                 std::to_string(NLW_DIR_INOUT) + " 0:7/8");
    EXPECT_EQ(describe("P"), "P f p: PAD " + std::to_string(NLW_DIR_OUTPUT) + " pad");
    EXPECT_EQ(describe("a"), "none");  // names are case sensitive
}

TEST(CellLibrary, RefusesMalformedLinesWithTheirNumber) {
    for (const nlwtest::Row& c : nlwtest::Table("cell_library_faults")) {
        Nlw_CellLibrary lib;
        std::string error;
        EXPECT_FALSE(lib.Parse(c[0], "lib.dat", error)) << c[0];
        EXPECT_TRUE(Contains(error, "lib.dat" + c[1])) << error;
    }
}

TEST(CellLibrary, ReportsAnUnreadableFile) {
    TempDir dir;
    Nlw_CellLibrary lib;
    std::string error;
    EXPECT_FALSE(lib.Load((dir / "none.dat").c_str(), error));
    EXPECT_TRUE(Contains(error, "none.dat")) << error;
}

// ---------------------------------------------------------------------------
// The preparation pass: value conversions, Verilog literals, external
// property lists and the installation's property table.

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

// ---------------------------------------------------------------------------
// The timing file reader, the Liberty reader and the nominal delays, on a
// small design with a module instance, an escaped name and a bus.

// top: port a, clk and y; LUT2 "$g" and module instance u1 of sub, which
// holds LUT2 "l.x" and FD "r".
const std::string kDesign = nlwtest::Data("json/sdf_design.json");

const char* kHead = "(DELAYFILE (SDFVERSION \"3.0\") (DIVIDER /) (TIMESCALE 1ns)\n";

struct Read {
    bool ok;
    Nlw_Timing timing;
    std::vector<std::string> errors, warnings;
};

Read ReadSdf(Loaded& design, const std::string& text) {
    Read r;
    Port_MsgCapture capture;
    r.ok = Nlw_SdfReader::LoadText("t.sdf", text.data(), text.size(), *design.view, r.timing);
    r.errors = capture.Texts(Port_MsgLevel::Error);
    r.warnings = capture.Texts(Port_MsgLevel::Warning);
    return r;
}

TEST(SdfReader, MatchesEntriesByTheDesignsNames) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    std::string text;
    for (const nlwtest::Row& c : nlwtest::Table("sdf_entries")) {
        Nlw_ReadOptions options;
        options.flatten = c[1] == "1";
        Loaded design = LoadText(kDesign, options);
        ASSERT_TRUE(design.ok);
        Read r = ReadSdf(design, std::string(kHead) + c[2]);
        text += c[0] + ": " + (r.ok ? "ok" : "failed") + ", " +
                std::to_string(r.timing.entries.size()) + " entries\n";
        for (const std::string& e : r.errors) text += "  error: " + e;
        for (const std::string& w : r.warnings) text += "  warning: " + w;
    }
    nlwtest::ExpectGolden("reader/sdf_entries", text);
}

TEST(SdfReader, KeepsValuesEdgesAndPinsOfAnEntry) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded design = LoadText(kDesign);
    Read r = ReadSdf(design,
                     "(DELAYFILE (SDFVERSION \"OVI 2.1\") (DIVIDER .) (TIMESCALE 100 ps)"
                     " (CELL (CELLTYPE \"FD\") (INSTANCE u1.r)"
                     " (DELAY (ABSOLUTE (IOPATH C Q (1::3) ())))"
                     " (TIMINGCHECK (SETUP D (negedge C) (2)))))");
    ASSERT_TRUE(r.ok);
    ASSERT_EQ(r.timing.entries.size(), 2u);
    const Nlw_TimingEntry& path = r.timing.entries[0];
    EXPECT_STREQ(path.pin1->GetWritableName(), "C");
    EXPECT_STREQ(path.pin2->GetWritableName(), "Q");
    // The path of a clock takes the clock's edge from the cell's checks.
    EXPECT_EQ(path.edge1, NLW_EDGE_NEG);
    ASSERT_EQ(path.numValues, 2);
    const Nlw_Rvalue& v = r.timing.values[path.firstValue];
    EXPECT_EQ(v.present, 5);
    EXPECT_DOUBLE_EQ(v.v[0], 100.0);
    EXPECT_DOUBLE_EQ(v.v[2], 300.0);
    EXPECT_EQ(r.timing.values[path.firstValue + 1].present, 0);
    // A path's own edge stays, whatever edge the checks give the clock.
    r = ReadSdf(design,
                std::string(kHead) +
                    "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r) (DELAY (ABSOLUTE"
                    " (IOPATH (posedge C) Q (1)))) (TIMINGCHECK (SETUP D (negedge C) (2)))))");
    ASSERT_EQ(r.timing.entries.size(), 2u);
    EXPECT_EQ(r.timing.entries[0].edge1, NLW_EDGE_POS);
}

TEST(NominalTiming, GivesEveryCellItsLibraryArcsAndEveryNetAZeroDelay) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded design = LoadText(kDesign);
    Nlw_Liberty lib;
    ASSERT_TRUE(lib.LoadText("t.lib", nlwtest::Data("timing/nominal.lib")));
    Nlw_Timing timing;
    EXPECT_EQ(Nlw_NominalTiming::Make(lib, *design.view, timing), 3u);
    std::string kinds;
    for (const Nlw_TimingEntry& e : timing.entries)
        kinds += Nlw_Timing::Keyword(e.kind) + std::string(" ");
    // $g and l.x: two paths each; r: a path and a check. Nets: a to both
    // inputs of $g, $g through port d to both inputs of l.x, l.x to r/D,
    // clk through port c to r/C, r/Q through port q to y.
    EXPECT_EQ(kinds,
              "IOPATH IOPATH IOPATH IOPATH IOPATH SETUPHOLD INTERCONNECT INTERCONNECT "
              "INTERCONNECT INTERCONNECT INTERCONNECT INTERCONNECT INTERCONNECT ");
    EXPECT_TRUE(timing.nominal);

    Nlw_Liberty bad;
    Port_MsgCapture capture;
    EXPECT_FALSE(
        bad.LoadText("bad.lib", "library (t) {\n cell (X) { pin (A) { direction input; } }\n}"));
    ASSERT_EQ(capture.Texts(Port_MsgLevel::Error).size(), 1u);
    EXPECT_NE(capture.Texts(Port_MsgLevel::Error)[0].find("bad.lib:2:"), std::string::npos);
}

}  // namespace

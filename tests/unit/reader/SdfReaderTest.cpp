// The timing file reader, the Liberty reader and the nominal delays, on a
// small design with a module instance, an escaped name and a bus.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ReaderTestSupport.h"
#include "framework/Nlw_Timing.h"
#include "reader/Nlw_Liberty.h"
#include "reader/Nlw_NominalTiming.h"
#include "reader/Nlw_SdfReader.h"

namespace {

using readertest::DataFiles;
using readertest::Installation;
using readertest::Loaded;
using readertest::LoadText;
using readertest::TestCells;

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
    const struct {
        const char* what;
        bool flatten;
        const char* text;  // after the head
        size_t entries;
        bool error;           // a malformed file: one error
        const char* message;  // the error, or the first warning ("" for none)
    } cases[] = {
        {"cell path and check, ns to ps", false,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r) (DELAY (ABSOLUTE (IOPATH C Q (0.1:0.2:0.3))))"
         " (TIMINGCHECK (SETUPHOLD (posedge D) (posedge C) (0.05) (0.01)))))",
         2, false, ""},
        {"the same in a flattened design", true,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r) (DELAY (ABSOLUTE (IOPATH C Q (1))))))", 1, false,
         ""},
        {"escaped divider character in a name", false,
         "(CELL (CELLTYPE \"LUT2\") (INSTANCE u1/l\\.x) (DELAY (ABSOLUTE (IOPATH I0 O (1))))))", 1,
         false, ""},
        {"interconnect across the hierarchy", false,
         "(CELL (CELLTYPE \"top\") (INSTANCE) (DELAY (ABSOLUTE"
         " (INTERCONNECT \\$g/O u1/l\\.x/I1 (1:2:3) (4:5:6))))))",
         1, false, ""},
        {"unknown instance", false,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/nope) (DELAY (ABSOLUTE (IOPATH C Q (1))))))", 0,
         false, "t.sdf:2: no instance 'u1/nope' in the design"},
        {"pin the cell lacks", false,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r) (DELAY (ABSOLUTE (IOPATH CE Q (1))))))", 0, false,
         "has no pin 'CE'"},
        {"CELLTYPE of another type", false,
         "(CELL (CELLTYPE \"LUT2\") (INSTANCE u1/r) (DELAY (ABSOLUTE (IOPATH C Q (1))))))", 0,
         false, "is of type 'FD', not 'LUT2'"},
        {"conditional path", false,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r) (DELAY (ABSOLUTE (COND D (IOPATH C Q (1)))))))",
         0, false, "COND entries are not supported"},
        {"delay that is not a number", false,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r)\n(DELAY (ABSOLUTE (IOPATH C Q (1:x:3))))))", 0,
         true, "t.sdf:3: delay value 'x' is not a number"},
        {"truncated file", false,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r) (DELAY (ABSOLUTE (IOPATH C Q (1", 0, true,
         "t.sdf:2: expected ')', found the end of the file"},
        {"two values of a triple", false,
         "(CELL (CELLTYPE \"FD\") (INSTANCE u1/r) (DELAY (ABSOLUTE (IOPATH C Q (1:2))))))", 0, true,
         "'1:2' is neither one value nor three"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        Nlw_ReadOptions options;
        options.flatten = c.flatten;
        Loaded design = LoadText(kDesign, options);
        ASSERT_TRUE(design.ok);
        Read r = ReadSdf(design, std::string(kHead) + c.text);
        const bool wantError = c.error;
        EXPECT_EQ(r.ok, !wantError);
        EXPECT_EQ(r.timing.entries.size(), c.entries);
        const std::vector<std::string>& got = wantError ? r.errors : r.warnings;
        if (*c.message == '\0') {
            EXPECT_TRUE(r.warnings.empty() && r.errors.empty());
        } else {
            ASSERT_FALSE(got.empty());
            EXPECT_NE(got[0].find(c.message), std::string::npos) << got[0];
            EXPECT_EQ(got.size(), wantError ? 1u : 2u);  // the warning and the count
        }
    }
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

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

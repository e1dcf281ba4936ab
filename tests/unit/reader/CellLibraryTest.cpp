// The installation's cell library file.
#include "ReaderTestSupport.h"
#include "model/Nlw_Nl.h"
#include "reader/Nlw_CellLibrary.h"

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

TEST(CellLibrary, ReadsTheInstallationLibrary) {
    Nlw_CellLibrary lib;
    std::string error;
    ASSERT_TRUE(lib.Load(NLW_TEST_DATA_DIR "/../../share/data/cells.dat", error)) << error;
    const Nlw_CellDef* lut = lib.Find("V_LUT4");
    const Nlw_CellDef* fd = lib.Find("V_FD");
    ASSERT_TRUE(lut && fd);
    EXPECT_EQ(lut->pins.size(), 5u);
    std::string pins = " ";
    for (const Nlw_CellPinDef& p : fd->pins) pins += p.name + " ";
    for (const char* pin : {" C ", " D ", " Q "}) EXPECT_TRUE(Contains(pins, pin)) << pins;
}

}  // namespace

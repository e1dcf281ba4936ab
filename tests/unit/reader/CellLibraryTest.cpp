// The installation's cell library file.
#include "Nlw_CellLibrary.h"
#include "Nlw_Nl.h"
#include "ReaderTestSupport.h"

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
    ASSERT_EQ(lib.size(), 2u);
    const Nlw_CellDef* a = lib.Find("A");
    ASSERT_NE(a, nullptr);
    EXPECT_TRUE(a->timcell);
    EXPECT_FALSE(a->funcell);
    EXPECT_FALSE(a->pad);
    ASSERT_EQ(a->pins.size(), 2u);
    EXPECT_EQ(a->pins[0].name, "X");
    EXPECT_EQ(a->pins[0].dir, NLW_DIR_INPUT);
    EXPECT_FALSE(a->pins[0].bus);
    EXPECT_TRUE(a->pins[1].bus);
    EXPECT_EQ(a->pins[1].dir, NLW_DIR_INOUT);
    EXPECT_EQ(a->pins[1].msb, 0);
    EXPECT_EQ(a->pins[1].lsb, 7);
    EXPECT_EQ(a->pins[1].Width(), 8);
    const Nlw_CellDef* p = lib.Find("P");
    ASSERT_NE(p, nullptr);
    EXPECT_TRUE(p->funcell);
    EXPECT_TRUE(p->pad);
    EXPECT_TRUE(p->pins[0].pad);
    EXPECT_EQ(lib.Find("a"), nullptr);  // names are case sensitive
}

TEST(CellLibrary, RefusesMalformedLinesWithTheirNumber) {
    struct Case {
        const char* text;
        const char* part;
    } cases[] = {
        {"pin X input\n", ":1: 'pin' before the first 'cell'"},
        {"cell A slowcell\n", ":1: unknown cell class 'slowcell'"},
        {"cell A timcell\npin X sideways\n", ":2: unknown direction 'sideways'"},
        {"cell A timcell\nbus D input 7\n", ":2: expected 'bus NAME DIR MSB LSB'"},
        {"cell A timcell\nbus D input 7 x\n", ":2: bad bus range"},
        {"cell A timcell\nbus D input 99999999999 0\n", ":2: bad bus range"},
        {"cell A timcell\npin X input\npin X output\n", ":3: pin 'X' of cell 'A' is given twice"},
        {"cell A timcell\ncell A timcell\n", ":2: cell 'A' is defined twice"},
        {"cell A timcell extra\n", ":1: unexpected 'extra'"},
        {"cells A timcell\n", ":1: unknown keyword 'cells'"},
    };
    for (const Case& c : cases) {
        Nlw_CellLibrary lib;
        std::string error;
        EXPECT_FALSE(lib.Parse(c.text, "lib.dat", error)) << c.text;
        EXPECT_TRUE(Contains(error, std::string("lib.dat") + c.part)) << error;
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
    ASSERT_NE(lut, nullptr);
    EXPECT_EQ(lut->pins.size(), 5u);
    const Nlw_CellDef* fd = lib.Find("V_FD");
    ASSERT_NE(fd, nullptr);
    for (const char* pin : {"C", "D", "Q"}) {
        bool found = false;
        for (const Nlw_CellPinDef& p : fd->pins) found = found || p.name == pin;
        EXPECT_TRUE(found) << pin;
    }
}

}  // namespace

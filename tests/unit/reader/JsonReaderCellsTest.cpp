// Cells read from netlist JSON: parameter values, library types and their
// pins, pads, global signals and the device.
#include "ReaderTestSupport.h"

using namespace readertest;

namespace {

class JsonReaderCells : public ::testing::Test {
protected:
    Installation inst_{DataFiles{{"cells.dat", TestCells()}}};
};

// Each value form in file order: bits, strings (a marking blank goes, a
// string of more than bits and blanks is kept), numbers wider than 32 bits
// as bits, floats and booleans.
TEST_F(JsonReaderCells, KeepsEachParameterFormInFileOrder) {
    Loaded l = LoadText(nlwtest::Data("json/parameter_forms.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/parameter_forms", Text(l));
    EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*Child(l.root(), "c")), 10u);
}

// Attributes stay off the block but TYPE; LOC names a package pin only on a
// pad.
TEST_F(JsonReaderCells, KeepsAttributesOffTheBlockButPinnameAndType) {
    Loaded l = LoadText(nlwtest::Data("json/attributes.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/attributes", Text(l));
    EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*Child(l.root(), "c")), 1u);
    EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*Child(l.root(), "d")), 1u);
}

// Pins from the library (A[3:0], DO[0:7] whose bit 0 is DO[7]), from a
// blackbox module and, for an unknown type, the union of all instances'
// pins, with directions where any instance gives one, each as wide as
// connected; one warning for the type, not one per instance.
TEST_F(JsonReaderCells, TakesPinsFromLibraryBlackboxAndConnections) {
    Loaded l = LoadText(nlwtest::Data("json/cell_types.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/cell_types", Text(l));
}

TEST_F(JsonReaderCells, RefusesAConnectionWiderThanTheLibraryPin) {
    Loaded l = LoadText(R"({"modules": {"t": {"ports": {},
        "cells": { "g": { "type": "LUT2", "connections": { "I0": [ 2, 3 ] } } },
        "netnames": {}}}})");
    EXPECT_FALSE(l.ok);
    ASSERT_EQ(l.errors.size(), 1u);
    EXPECT_TRUE(Contains(l.errors[0], "cell 'g' connection 'I0'")) << l.errors[0];
}

// Package pins from the cell or from its top-level port's net, also through
// the port of a module instance; set/reset and tristate nets with their
// connection and floating values; the part and device.
TEST_F(JsonReaderCells, PadsGlobalsAndDevice) {
    Loaded l = LoadText(nlwtest::Data("json/pads.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/pads", Text(l));
    for (const Nlw_NlBlock* pad :
         {Child(l.root(), "ipad"), Child(l.root(), "opad"), Child(Child(l.root(), "sub"), "pad")})
        EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*pad), 0u);
}

}  // namespace

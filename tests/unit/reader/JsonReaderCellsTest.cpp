// Cells read from netlist JSON: parameter values, library types and their
// pins, pads, global signals and the device.
#include <iterator>

#include "ReaderTestSupport.h"
#include "framework/Nlw_Util.h"

using namespace readertest;

namespace {

TEST(JsonReaderParams, KeepsEachValueFormInFileOrder) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(R"({"modules": {"t": {
        "ports": {},
        "cells": { "c": { "type": "FD", "parameters": {
            "P_BITS": "01x1",
            "P_STR": "FAST",
            "P_STRBITS": "0101 ",
            "P_BLANK": " ",
            "P_MIXED": "01 0 ",
            "P_INT": 5,
            "P_NEG": -3,
            "P_BIG": 4294967296,
            "P_FLOAT": 2.5,
            "P_BOOL": true
        }, "connections": {} } },
        "netnames": {}}}})");
    ASSERT_TRUE(l.ok) << l.errors[0];
    Nlw_NlBlock* c = Child(l.root(), "c");
    ASSERT_NE(c, nullptr);
    struct Case {
        const char* name;
        int type;
        const char* text;  // for bits and strings
        double number;     // for the others
    } cases[] = {
        {"P_BITS", VDM_PROP_BITS, "01x1", 0},
        {"P_STR", VDM_PROP_STRING, "FAST", 0},
        {"P_STRBITS", VDM_PROP_STRING, "0101", 0},  // the marking blank goes
        {"P_BLANK", VDM_PROP_STRING, "", 0},
        {"P_MIXED", VDM_PROP_STRING, "01 0 ", 0},  // not only bits and blanks: kept
        {"P_INT", VDM_PROP_INT, nullptr, 5},
        {"P_NEG", VDM_PROP_INT, nullptr, -3},
        {"P_BIG", VDM_PROP_BITS, "100000000000000000000000000000000", 0},
        {"P_FLOAT", VDM_PROP_FLOAT, nullptr, 2.5},
        {"P_BOOL", VDM_PROP_BOOL, nullptr, 1},
    };
    const std::vector<Vdm_Property*>* props = c->GetProperties();
    ASSERT_NE(props, nullptr);
    ASSERT_EQ(props->size(), std::size(cases));
    EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*c), std::size(cases));
    for (size_t k = 0; k < std::size(cases); ++k) {
        const Case& e = cases[k];
        const Vdm_Property* p = (*props)[k];
        EXPECT_STREQ(p->GetName(), e.name);
        EXPECT_EQ(p->GetType(), e.type) << e.name;
        if (e.text) {
            EXPECT_STREQ(p->GetString(), e.text) << e.name;
        } else if (e.type == VDM_PROP_FLOAT) {
            EXPECT_DOUBLE_EQ(p->GetFloat(), e.number) << e.name;
        } else {
            EXPECT_EQ(p->GetInt32(), static_cast<int32_t>(e.number)) << e.name;
        }
    }
}

TEST(JsonReaderParams, KeepsAttributesOffTheBlockButPinnameAndType) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(R"({"modules": {"t": {
        "ports": {},
        "cells": {
          "c": { "type": "FD", "parameters": { "INIT": "1" },
                 "attributes": { "src": "x.v:1", "TYPE": "fast", "keep": "1", "LOC": "P1" },
                 "connections": {} },
          "d": { "type": "FD", "parameters": { "INIT": "0" },
                 "attributes": { "src": "x.v:2" }, "connections": {} } },
        "netnames": {}}}})");
    ASSERT_TRUE(l.ok) << l.errors[0];
    Nlw_NlBlock* c = Child(l.root(), "c");
    std::vector<std::string> names;
    for (const Vdm_Property* p : *c->GetProperties()) names.push_back(p->GetName());
    // LOC names a package pin only on a pad.
    EXPECT_EQ(names, (std::vector<std::string>{"INIT", "TYPE", "NLW_PARAM_COUNT"}));
    EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*c), 1u);
    Nlw_NlBlock* d = Child(l.root(), "d");
    EXPECT_EQ(d->GetProperties()->size(), 1u);
    EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*d), 1u);
}

TEST(JsonReaderTypes, TakesPinsFromLibraryBlackboxAndConnections) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(R"({"modules": {
      "BB": { "attributes": { "blackbox": "00000000000000000000000000000001" },
              "ports": { "X": { "direction": "input", "bits": [ 2, 3 ] },
                         "Y": { "direction": "output", "bits": [ 4 ] } },
              "cells": {}, "netnames": {} },
      "t": {
        "ports": { "d": { "direction": "input", "bits": [ 2, 3, 4, 5, 6, 7, 8, 9 ] } },
        "cells": {
          "r": { "type": "RAM", "connections": { "A": [ 2, 3, 4, 5 ],
                                                 "DO": [ 2, 3, 4, 5, 6, 7, 8, 9 ] } },
          "b": { "type": "BB", "connections": { "X": [ 6, 7 ], "Y": [ 8 ] } },
          "m1": { "type": "MYST", "port_directions": { "A": "input", "K": "output" },
                  "connections": { "A": [ 2 ], "B": [ 3 ], "K": [ 4 ] } },
          "m2": { "type": "MYST", "port_directions": { "A": "input" },
                  "connections": { "K": [ 5, 6, 7 ], "B": [ 8 ] } } },
        "netnames": {}}}})");
    ASSERT_TRUE(l.ok) << l.errors[0];
    Nlw_NlBlock* r = Child(l.root(), "r");
    // A[3:0]: bit 0 is A[0]. DO[0:7]: bit 0 is the least significant, DO[7].
    EXPECT_EQ(NetOf(r, "A[0]"), "d[0]");
    EXPECT_EQ(NetOf(r, "A[3]"), "d[3]");
    EXPECT_EQ(NetOf(r, "DO[7]"), "d[0]");
    EXPECT_EQ(NetOf(r, "DO[0]"), "d[7]");
    EXPECT_TRUE(r->IsFuncell());
    EXPECT_FALSE(r->IsTimcell());

    Nlw_NlBlock* b = Child(l.root(), "b");
    ASSERT_NE(b, nullptr);
    EXPECT_FALSE(b->IsMacro());
    EXPECT_EQ(NetOf(b, "X[1]"), "d[5]");
    EXPECT_EQ(b->GetPinByAlias("Y")->GetDirection(), NLW_DIR_OUTPUT);

    // MYST: the union of both instances' pins, directions where any
    // instance gives one, each pin as wide as the instance connects it.
    Nlw_NlBlock* m1 = Child(l.root(), "m1");
    Nlw_NlBlock* m2 = Child(l.root(), "m2");
    ASSERT_NE(m1->GetPinByAlias("K"), nullptr);
    EXPECT_FALSE(m1->GetPinByAlias("K")->IsBused());
    EXPECT_EQ(NetOf(m1, "K"), "d[2]");
    EXPECT_STREQ(m1->GetTypeName(), m2->GetTypeName());
    struct Case {
        const char* pin;
        int dir;
        const char* net;
    } cases[] = {{"A", NLW_DIR_INPUT, ""},
                 {"B", NLW_DIR_UNTYPED, "d[6]"},
                 {"K[0]", NLW_DIR_OUTPUT, "d[3]"},
                 {"K[2]", NLW_DIR_OUTPUT, "d[5]"}};
    for (const Case& c : cases) {
        Nlw_NlPin* p = m2->GetPinByAlias(c.pin);
        ASSERT_NE(p, nullptr) << c.pin;
        EXPECT_EQ(p->GetDirection(), c.dir) << c.pin;
        EXPECT_EQ(NetOf(m2, c.pin), c.net) << c.pin;
    }
    // One warning for the type, not one per instance.
    ASSERT_EQ(l.warnings.size(), 1u);
    EXPECT_TRUE(Contains(l.warnings[0], "'MYST'")) << l.warnings[0];
}

TEST(JsonReaderTypes, RefusesAConnectionWiderThanTheLibraryPin) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(R"({"modules": {"t": {"ports": {},
        "cells": { "g": { "type": "LUT2", "connections": { "I0": [ 2, 3 ] } } },
        "netnames": {}}}})");
    EXPECT_FALSE(l.ok);
    ASSERT_EQ(l.errors.size(), 1u);
    EXPECT_TRUE(Contains(l.errors[0], "cell 'g' connection 'I0'")) << l.errors[0];
}

const char* kPadJson = R"({"modules": {
  "iob": {
    "ports": { "p": { "direction": "output", "bits": [ 2 ] } },
    "cells": { "pad": { "type": "OPAD", "connections": { "PAD": [ 2 ] } } },
    "netnames": {} },
  "t": {
    "attributes": { "PART": "vx100-fg256-5" },
    "ports": {
      "i": { "direction": "input", "bits": [ 2 ] },
      "o": { "direction": "output", "bits": [ 3 ] },
      "o2": { "direction": "output", "bits": [ 4 ] },
      "gsr": { "direction": "input", "bits": [ 5 ] } },
    "cells": {
      "ipad": { "type": "IPAD", "attributes": { "LOC": "P5" }, "connections": { "PAD": [ 2 ] } },
      "opad": { "type": "OPAD", "connections": { "PAD": [ 3 ] } },
      "sub": { "type": "iob", "connections": { "p": [ 4 ] } } },
    "netnames": {
      "gsr": { "hide_name": 0, "bits": [ 5 ], "attributes": {
        "NLW_GLOBAL": "SETRESET", "NLW_SETRESET_CONN": "00000000000000000000000000000010",
        "VL_FLOATVAL": "11111111111111111111111111111111" } },
      "gts": { "hide_name": 0, "bits": [ 6 ], "attributes": { "NLW_GLOBAL": "TRISTATE" } },
      "o": { "hide_name": 0, "bits": [ 3 ], "attributes": { "PINNAME": "P7" } },
      "o2": { "hide_name": 0, "bits": [ 4 ], "attributes": { "LOC": "P9" } } }}}})";

TEST(JsonReaderPads, NamesPackagePinsFromTheCellOrItsTopLevelPort) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(kPadJson);
    ASSERT_TRUE(l.ok) << l.errors[0];
    Nlw_NlBlock* sub = Child(l.root(), "sub");
    ASSERT_NE(sub, nullptr);
    struct Case {
        Nlw_NlBlock* block;
        const char* pinName;
    } cases[] = {{Child(l.root(), "ipad"), "P5"},
                 {Child(l.root(), "opad"), "P7"},
                 {Child(sub, "pad"), "P9"}};  // through the port of a module instance
    for (const Case& c : cases) {
        ASSERT_NE(c.block, nullptr);
        EXPECT_EQ(c.block->GetPrimType(), NLW_PRIM_PAD);
        const char* v = Nlw_Util::GetStringProp(c.block, "PINNAME");
        ASSERT_NE(v, nullptr) << c.block->GetInstanceName();
        EXPECT_STREQ(v, c.pinName);
        EXPECT_EQ(Nlw_JsonReader::GetParameterCount(*c.block), 0u);
        EXPECT_EQ(c.block->GetPinByAlias("PAD")->GetPinType(), NLW_PINTYPE_PAD);
    }
}

TEST(JsonReaderGlobals, MarksSetResetTristateAndDevice) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(kPadJson);
    ASSERT_TRUE(l.ok) << l.errors[0];
    Nlw_NlSignal* gsr = l.view->GetSetReset();
    ASSERT_NE(gsr, nullptr);
    EXPECT_STREQ(gsr->GetWritableName(), "gsr");
    EXPECT_EQ(Nlw_Util::GetInt32Prop(gsr, "NLW_SETRESET_CONN", -9), 2);
    ASSERT_NE(gsr->GetNetwork(), nullptr);
    EXPECT_EQ(Nlw_Util::GetInt32Prop(gsr->GetNetwork(), "VL_FLOATVAL", -9), -1);
    ASSERT_NE(gsr->GetRefPin(), nullptr);
    EXPECT_STREQ(gsr->GetRefPin()->GetWritableName(), "gsr");

    Nlw_NlSignal* gts = l.view->GetTristate();
    ASSERT_NE(gts, nullptr);
    EXPECT_STREQ(gts->GetWritableName(), "gts");
    EXPECT_EQ(Nlw_Util::GetInt32Prop(gts, "NLW_TRISTATE_CONN", -9), 3);
    EXPECT_EQ(Nlw_Util::GetInt32Prop(gts->GetNetwork(), "VL_FLOATVAL", -9), 0);
    EXPECT_EQ(gts->GetRefPin(), nullptr);

    ASSERT_NE(l.view->GetPartName(), nullptr);
    EXPECT_STREQ(l.view->GetPartName(), "vx100-fg256-5");
    EXPECT_STREQ(l.view->GetDeviceInfo(), "vx100");
}

}  // namespace

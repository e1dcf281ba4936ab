// Nets, ports, buses and constants of a module read from netlist JSON.
#include "ReaderTestSupport.h"
#include "framework/Nlw_Util.h"

using namespace readertest;

namespace {

// Port a[3:0], port b[4:5] (upto), y on a[0], k tied to 1, q; named nets of
// every rank; one bit that nothing names.
const char* kNetsJson = R"({
  "modules": {
    "t": {
      "attributes": { "top": "00000000000000000000000000000001" },
      "ports": {
        "a": { "direction": "input", "bits": [ 2, 3, 4, 5 ] },
        "b": { "direction": "input", "offset": 4, "upto": 1, "bits": [ 6, 7 ] },
        "y": { "direction": "output", "bits": [ 2 ] },
        "k": { "direction": "output", "bits": [ "1" ] },
        "q": { "direction": "output", "bits": [ 8 ] }
      },
      "cells": {
        "u0": { "hide_name": 0, "type": "LUT2", "parameters": {}, "attributes": {},
                "connections": { "I0": [ 2 ], "I1": [ 11 ], "O": [ 9 ] } },
        "u1": { "hide_name": 0, "type": "LUT2",
                "connections": { "I0": [ "x" ], "I1": [ "0" ], "O": [ 10 ] } },
        "u2": { "hide_name": 0, "type": "FD",
                "connections": { "C": [ 6 ], "D": [ "1" ], "Q": [ 8 ] } }
      },
      "netnames": {
        "$int": { "hide_name": 1, "bits": [ 9, 10 ], "attributes": {} },
        "a": { "hide_name": 0, "bits": [ 2, 3, 4, 5 ], "attributes": {} },
        "b": { "hide_name": 0, "offset": 4, "upto": 1, "bits": [ 6, 7 ], "attributes": {} },
        "k": { "hide_name": 0, "bits": [ "1" ], "attributes": {} },
        "pub": { "hide_name": 0, "bits": [ 10 ], "attributes": { "hdlname": "sub pub" } },
        "q": { "hide_name": 0, "bits": [ 8 ], "attributes": {} },
        "w": { "hide_name": 0, "bits": [ 8, 9 ], "attributes": { "hdlname": "w" } },
        "y": { "hide_name": 0, "bits": [ 2 ], "attributes": {} }
      }
    }
  }
})";

class JsonReaderNets : public ::testing::Test {
protected:
    void SetUp() override {
        loaded_ = LoadText(kNetsJson);
        ASSERT_TRUE(loaded_.ok) << (loaded_.errors.empty() ? "" : loaded_.errors[0]);
        root_ = loaded_.root();
    }
    Installation inst_{DataFiles{{"cells.dat", TestCells()}}};
    Loaded loaded_;
    Nlw_NlBlock* root_ = nullptr;
};

TEST_F(JsonReaderNets, NamesEachNetByPortThenPublicThenInternalName) {
    struct Case {
        const char* cell;
        const char* pin;
        const char* net;
    } cases[] = {
        {"u0", "I0", "a[0]"},       // the port a wins over the port y (port order)
        {"u0", "O", "w[1]"},        // public w wins over the earlier internal $int
        {"u1", "O", "pub"},         // public pub wins over internal $int
        {"u2", "Q", "q"},           // a port name
        {"u2", "C", "b[5]"},        // bit 0 of an upto bus at offset 4
        {"u0", "I1", "nlw_net_0"},  // nothing names it
    };
    for (const Case& c : cases) {
        Nlw_NlBlock* cell = Child(root_, c.cell);
        ASSERT_NE(cell, nullptr) << c.cell;
        EXPECT_EQ(NetOf(cell, c.pin), c.net) << c.cell << "." << c.pin;
    }
    // A bus that names none of its bits is not made.
    EXPECT_EQ(SignalBus(root_, "$int"), nullptr);
    EXPECT_NE(SignalBus(root_, "w"), nullptr);
    EXPECT_EQ(loaded_.design->GetName(), std::string("t"));
}

TEST_F(JsonReaderNets, DeclaresBusesWithTheFileIndexes) {
    struct Case {
        const char* name;
        int msb, lsb;
    } cases[] = {{"a", 3, 0}, {"b", 4, 5}};
    for (const Case& c : cases) {
        Nlw_NlPinBus* pb = PinBus(root_, c.name);
        ASSERT_NE(pb, nullptr) << c.name;
        EXPECT_EQ(pb->GetMSB(0), c.msb) << c.name;
        EXPECT_EQ(pb->GetLSB(0), c.lsb) << c.name;
        EXPECT_EQ(pb->GetDirection(), NLW_DIR_INPUT);
        Nlw_NlBus* sb = SignalBus(root_, c.name);
        ASSERT_NE(sb, nullptr) << c.name;
        EXPECT_EQ(sb->GetMSB(0), c.msb) << c.name;
        EXPECT_EQ(sb->GetLSB(0), c.lsb) << c.name;
    }
    // Ports in port order, bus members from msb to lsb.
    std::vector<std::string> pins;
    for (Nlw_NlPin& p : root_->GetPins()) pins.push_back(p.GetWritableName());
    EXPECT_EQ(pins, (std::vector<std::string>{"a[3]", "a[2]", "a[1]", "a[0]", "b[4]", "b[5]", "y",
                                              "k", "q"}));
    EXPECT_EQ(InsideOf(root_, "a[2]"), "a[2]");
    EXPECT_EQ(InsideOf(root_, "b[4]"), "b[4]");
}

// Ports on one net share it; constant ports get hidden global signals;
// constant cell pins are tied and unknown bits left open.
TEST_F(JsonReaderNets, ConnectsPortsAndTiesConstants) {
    EXPECT_EQ(InsideOf(root_, "y"), "a[0]");
    Nlw_NlSignal* k = root_->GetPinByAlias("k")->GetChildSignal();
    ASSERT_NE(k, nullptr);
    EXPECT_STREQ(k->GetWritableName(), "1'b1");
    EXPECT_FALSE(k->IsVisible());
    EXPECT_EQ(Nlw_Util::GetInt32Prop(k, "NLW_GLOBAL_SIGNAL", -9), 1);
    struct Case {
        const char* cell;
        const char* pin;
        int tie;
    } cases[] = {{"u1", "I1", 0}, {"u2", "D", 1}, {"u1", "I0", -1}};
    for (const Case& c : cases) {
        Nlw_NlBlock* cell = Child(root_, c.cell);
        EXPECT_EQ(TieOf(cell, c.pin), c.tie) << c.cell << "." << c.pin;
        if (c.cell[1] == '1') {
            EXPECT_EQ(NetOf(cell, c.pin), "") << c.pin;
        }
    }
}

TEST_F(JsonReaderNets, TakesAlsoKnownAsNamesFromHdlname) {
    const Nlw_NlSignal* pub = Signal(root_, "pub");
    const Nlw_NlBus* w = SignalBus(root_, "w");
    ASSERT_TRUE(pub && w && pub->GetAka() && w->GetAka());
    EXPECT_STREQ(pub->GetAka(), "sub/pub");
    EXPECT_STREQ(w->GetAka(), "w");
}

TEST(JsonReaderNetsScattered, MapsLargeAndScatteredBitNumbers) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    Loaded l = LoadText(R"({"modules": {"t": {
        "ports": { "a": { "direction": "input", "bits": [ 2000000000 ] },
                   "y": { "direction": "output", "bits": [ 7 ] } },
        "cells": { "g": { "type": "LUT2",
                          "connections": { "I0": [ 2000000000 ], "I1": [ 2000000000 ],
                                           "O": [ 7 ] } } },
        "netnames": {}}}})");
    ASSERT_TRUE(l.ok) << l.errors[0];
    Nlw_NlBlock* g = Child(l.root(), "g");
    EXPECT_EQ(NetOf(g, "I0"), "a");
    EXPECT_EQ(NetOf(g, "I1"), "a");
    EXPECT_EQ(NetOf(g, "O"), "y");
    EXPECT_EQ(l.root()->GetSignals().size(), 2u);
}

}  // namespace

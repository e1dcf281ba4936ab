// The module hierarchy: unfolding, flattening, the choice of the top module
// and very deep nesting.
#include "ReaderTestSupport.h"

using namespace readertest;

namespace {

const char* kHierJson = R"({"modules": {
  "leafm": {
    "ports": { "clk": { "direction": "input", "bits": [ 2 ] },
               "d": { "direction": "input", "bits": [ 3, 4 ] },
               "q": { "direction": "output", "bits": [ 5, 6 ] } },
    "cells": {
      "r0": { "type": "FD", "attributes": { "hdlname": "x r0" },
              "connections": { "C": [ 2 ], "D": [ 3 ], "Q": [ 5 ] } },
      "r1": { "type": "FD", "connections": { "C": [ 2 ], "D": [ 4 ], "Q": [ 6 ] } } },
    "netnames": { "$tmp": { "hide_name": 1, "bits": [ 5 ] } } },
  "mid": {
    "ports": { "clk": { "direction": "input", "bits": [ 2 ] },
               "i": { "direction": "input", "bits": [ 3, 4 ] },
               "o": { "direction": "output", "bits": [ 5, 6 ] },
               "z": { "direction": "output", "bits": [ "0" ] } },
    "cells": {
      "u2": { "type": "leafm", "connections": { "clk": [ 2 ], "d": [ 3, 4 ], "q": [ 7, 8 ] } },
      "g": { "type": "LUT2", "connections": { "I0": [ 7 ], "I1": [ 8 ], "O": [ 5 ] } } },
    "netnames": { "inner": { "hide_name": 0, "bits": [ 7, 8 ] },
                  "o": { "hide_name": 0, "bits": [ 5, 6 ] } } },
  "top": {
    "ports": { "clk": { "direction": "input", "bits": [ 2 ] },
               "a": { "direction": "input", "bits": [ 3, 4 ] },
               "y": { "direction": "output", "bits": [ 5, 6 ] },
               "c": { "direction": "output", "bits": [ 7 ] } },
    "cells": {
      "u1": { "type": "mid", "connections": { "clk": [ 2 ], "i": [ 3, 4 ], "o": [ 5, 6 ],
                                               "z": [ 7 ] } },
      "u3": { "type": "mid", "connections": { "clk": [ 2 ], "i": [ "1", 3 ], "o": [ 8, 9 ] } } },
    "netnames": { "a": { "hide_name": 0, "bits": [ 3, 4 ] },
                  "w": { "hide_name": 0, "bits": [ 8, 9 ] } } }
}})";

class JsonReaderHierarchy : public ::testing::Test {
protected:
    Installation inst_{DataFiles{{"cells.dat", TestCells()}}};
};

TEST_F(JsonReaderHierarchy, UnfoldsEveryInstanceDepthFirst) {
    Loaded l = LoadText(kHierJson);
    ASSERT_TRUE(l.ok) << l.errors[0];
    std::vector<std::string> macros;
    for (Nlw_NlBlock* m : l.view->GetMacros())
        macros.push_back(std::string(m->GetTypeName()) + ":" + m->GetInstanceName());
    EXPECT_EQ(macros,
              (std::vector<std::string>{"top:top", "mid:u1", "leafm:u2", "mid:u3", "leafm:u2"}));
    Nlw_NlBlock* u1 = Child(l.root(), "u1");
    Nlw_NlBlock* u3 = Child(l.root(), "u3");
    ASSERT_TRUE(u1 && u3);
    EXPECT_EQ(u1->GetType(), u3->GetType());
    EXPECT_EQ(NetOf(u1, "i[0]"), "a[0]");
    EXPECT_EQ(InsideOf(u1, "i[0]"), "i[0]");
    EXPECT_EQ(NetOf(u1, "z"), "c");
    EXPECT_EQ(InsideOf(u1, "z"), "1'b0");
    EXPECT_EQ(TieOf(u3, "i[0]"), 1);
    EXPECT_EQ(NetOf(u3, "o[1]"), "w[1]");
    Nlw_NlBlock* u2 = Child(u1, "u2");
    ASSERT_NE(u2, nullptr);
    EXPECT_EQ(NetOf(u2, "q[1]"), "inner[1]");
    Nlw_NlBlock* r0 = Child(u2, "r0");
    ASSERT_NE(r0, nullptr);
    EXPECT_EQ(NetOf(r0, "Q"), "q[0]");
    ASSERT_NE(r0->GetAka(), nullptr);
    EXPECT_STREQ(r0->GetAka(), "x/r0");
}

TEST_F(JsonReaderHierarchy, FlattensIntoLeavesOfTheTopNamedByPath) {
    Nlw_ReadOptions opt;
    opt.flatten = true;
    Loaded l = LoadText(kHierJson, opt);
    ASSERT_TRUE(l.ok) << l.errors[0];
    EXPECT_EQ(l.view->GetNumMacros(), 1u);
    std::vector<std::string> leaves;
    for (Nlw_NlBlock* c : l.root()->GetChildren()) {
        EXPECT_FALSE(c->IsMacro());
        leaves.push_back(c->GetInstanceName());
    }
    EXPECT_EQ(leaves, (std::vector<std::string>{"u1/g", "u1/u2/r0", "u1/u2/r1", "u3/g", "u3/u2/r0",
                                                "u3/u2/r1"}));
    struct Case {
        const char* cell;
        const char* pin;
        const char* net;  // "" with tie >= 0 for a tied pin
        int tie;
    } cases[] = {
        {"u1/u2/r0", "D", "a[0]", -1},         // merged up to the top's port net
        {"u1/u2/r0", "C", "clk", -1},          //
        {"u1/g", "O", "y[0]", -1},             // mid's o[0] is the top's y[0]
        {"u1/g", "I0", "u1/inner[0]", -1},     // mid's name wins over leafm's q
        {"u3/u2/r0", "D", "", 1},              // a constant passed down two levels
        {"u3/u2/r1", "D", "a[0]", -1},         //
        {"u3/g", "O", "w[0]", -1},             //
        {"u1/u2/r1", "Q", "u1/inner[1]", -1},  //
    };
    for (const Case& c : cases) {
        Nlw_NlBlock* b = Child(l.root(), c.cell);
        ASSERT_NE(b, nullptr) << c.cell;
        EXPECT_EQ(NetOf(b, c.pin), c.net) << c.cell << "." << c.pin;
        EXPECT_EQ(TieOf(b, c.pin), c.tie) << c.cell << "." << c.pin;
    }
    // A sub-module output tied to a constant ties the top's port.
    EXPECT_EQ(InsideOf(l.root(), "c"), "1'b0");
    Nlw_NlBlock* r0 = Child(l.root(), "u1/u2/r0");
    ASSERT_NE(r0->GetAka(), nullptr);
    EXPECT_STREQ(r0->GetAka(), "x/r0");
    // Each merged net is one signal.
    EXPECT_EQ(Signal(l.root(), "u1/i[0]"), nullptr);
    EXPECT_EQ(SignalBus(l.root(), "u1/u2/q"), nullptr);
}

TEST_F(JsonReaderHierarchy, ChoosesTheTopModule) {
    const std::string twoFree = R"({"modules": {
        "a": { "ports": {}, "cells": {}, "netnames": {} },
        "b": { "attributes": { "top": "00000000000000000000000000000001" },
               "ports": {}, "cells": {}, "netnames": {} }}})";
    const std::string parentChild = R"({"modules": {
        "c": { "ports": {}, "cells": {}, "netnames": {} },
        "p": { "ports": {}, "cells": { "i": { "type": "c", "connections": {} } },
               "netnames": {} }}})";
    struct Case {
        const std::string& json;
        const char* top;  // the option
        const char* chosen;
    } cases[] = {
        {twoFree, nullptr, "b"},      // the "top" attribute
        {twoFree, "a", "a"},          // the option wins
        {parentChild, nullptr, "p"},  // the one module nothing instantiates
        {parentChild, "c", "c"},
    };
    for (const Case& c : cases) {
        Nlw_ReadOptions opt;
        opt.top = c.top;
        Loaded l = LoadText(c.json, opt);
        ASSERT_TRUE(l.ok) << l.errors[0];
        EXPECT_STREQ(l.root()->GetTypeName(), c.chosen);
        EXPECT_STREQ(l.design->GetName(), c.chosen);
    }
}

// A chain of nested modules, each passing one net down to the next; the
// last holds a flip-flop.
std::string Chain(int depth) {
    std::string j = "{\"modules\": {";
    for (int k = 0; k < depth; ++k) {
        j += "\"m" + std::to_string(k) + "\": {\"ports\": {\"a\": {\"direction\": \"input\", " +
             "\"bits\": [2]}}, \"cells\": {";
        if (k + 1 < depth)
            j += "\"c\": {\"type\": \"m" + std::to_string(k + 1) +
                 "\", \"connections\": {\"a\": [2]}}";
        else
            j += "\"r\": {\"type\": \"FD\", \"connections\": {\"D\": [2]}}";
        j += "}, \"netnames\": {}},";
    }
    j.back() = '}';
    return j + "}";
}

TEST_F(JsonReaderHierarchy, UnfoldsAndFlattensVeryDeepNesting) {
    const int depth = 100000;
    Loaded l = LoadText(Chain(depth));
    ASSERT_TRUE(l.ok) << l.errors[0];
    EXPECT_EQ(l.view->GetNumMacros(), static_cast<size_t>(depth));

    // Flattening walks the same way; a shorter chain keeps the test quick.
    const int flatDepth = 10000;
    Nlw_ReadOptions opt;
    opt.flatten = true;
    Loaded f = LoadText(Chain(flatDepth), opt);
    ASSERT_TRUE(f.ok) << f.errors[0];
    ASSERT_EQ(f.root()->GetChildren().size(), 1u);
    Nlw_NlBlock* r = f.root()->GetChildren()[0];
    EXPECT_EQ(std::string(r->GetInstanceName()).size(), 2u * (flatDepth - 1) + 1);
    EXPECT_EQ(NetOf(r, "D"), "a");
}

}  // namespace

// The design reader on netlist JSON: nets, ports, buses and constants;
// cells, their parameters, pins, pads and globals; the module hierarchy;
// layouts of the text; faulty and corrupted input.

#include <random>

#include "ReaderTestSupport.h"

using namespace readertest;

namespace {

// The test's own installation with the small test cell library.
class WithTestCells : public ::testing::Test {
protected:
    Installation inst_{DataFiles{{"cells.dat", TestCells()}}};
};
using JsonReaderNets = WithTestCells;
using JsonReaderLayout = WithTestCells;
using JsonReaderBadInput = WithTestCells;

// Port a[3:0], port b[4:5] (upto), y on a[0], k tied to 1, q; named nets of
// every rank; one bit that nothing names.
const std::string kNetsJson = nlwtest::Data("json/nets.json");

// Nets named by port, then public, then internal name, else nlw_net_<n>; a
// bus that names none of its bits is not made; buses with the file's
// indexes; ports on one net share it; constant ports get hidden global
// signals; constant cell pins are tied, x on an input to x (2); akas
// from hdlname.
TEST_F(JsonReaderNets, NamesConnectsAndTies) {
    Loaded l = LoadText(kNetsJson);
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/nets", Text(l));
    EXPECT_EQ(l.design->GetName(), std::string("t"));
    l = LoadText(nlwtest::Data("json/scattered_bits.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/scattered_bits", Text(l));
}

// ---------------------------------------------------------------------------
// Cells read from netlist JSON: parameter values, library types and their
// pins, pads, global signals and the device.

using JsonReaderCells = WithTestCells;

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

// A module of the file that takes a library cell's name is that module
// (its ports, not the library's pins), one defined later in the file too; a
// black box of a library cell's name has the library's pins.
TEST_F(JsonReaderCells, ModulesNamedLikeLibraryCells) {
    Loaded l = LoadText(nlwtest::Data("json/library_named_modules.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/library_named_modules", Text(l));
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

// ---------------------------------------------------------------------------
// The module hierarchy: unfolding, flattening, the choice of the top module
// and very deep nesting.

const std::string kHierJson = nlwtest::Data("json/hierarchy.json");

using JsonReaderHierarchy = WithTestCells;

// Every instance unfolded depth first, ports with their inside nets,
// constants tied, akas kept.
TEST_F(JsonReaderHierarchy, UnfoldsEveryInstanceDepthFirst) {
    Loaded l = LoadText(kHierJson);
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/hierarchy_unfolded", Text(l));
    EXPECT_EQ(Child(l.root(), "u1")->GetType(), Child(l.root(), "u3")->GetType());
}

// Leaves of the top named by path; nets merged up to the top's port nets,
// the upper module's name winning; constants passed down two levels; a
// sub-module output tied to a constant ties the top's port.
TEST_F(JsonReaderHierarchy, FlattensIntoLeavesOfTheTopNamedByPath) {
    Nlw_ReadOptions opt;
    opt.flatten = true;
    Loaded l = LoadText(kHierJson, opt);
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/hierarchy_flattened", Text(l));
    // Nets joined through a module that passes its input straight out take
    // the port's name, whichever of the top's nets comes first.
    l = LoadText(nlwtest::Data("json/feedthrough.json"), opt);
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/feedthrough_flattened", Text(l));
}

TEST_F(JsonReaderHierarchy, ChoosesTheTopModule) {
    for (const nlwtest::Row& c : nlwtest::Table("top_module")) {
        Nlw_ReadOptions opt;
        opt.top = nlwtest::Opt(c[1]);
        Loaded l = LoadText(nlwtest::Data("json/" + c[0]), opt);
        ASSERT_TRUE(l.ok) << l.errors[0];
        EXPECT_EQ(l.root()->GetTypeName(), c[2]);
        EXPECT_EQ(l.design->GetName(), c[2]);
    }
}

// A chain of nested modules, each passing one net down to the copies of the
// next (and with tied, an output tied to 0); the last holds a flip-flop.
std::string Chain(int depth, int copies = 1, bool tied = false) {
    const std::string z = tied ? ", \"z\": {\"direction\": \"output\", \"bits\": [\"0\"]}" : "";
    std::string j = "{\"modules\": {";
    for (int k = 0; k < depth; ++k) {
        j += "\"m" + std::to_string(k) + "\": {\"ports\": {\"a\": {\"direction\": \"input\", " +
             "\"bits\": [2]}" + z + "}, \"cells\": {";
        for (int c = 0; c < copies && k + 1 < depth; ++c)
            j += std::string(c ? ", \"" : "\"") + char('c' + c) + "\": {\"type\": \"m" +
                 std::to_string(k + 1) + "\", \"connections\": {\"a\": [2]}}";
        if (k + 1 == depth) j += "\"r\": {\"type\": \"FD\", \"connections\": {\"D\": [2]}}";
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

// A hierarchy that multiplies out to more instances than a model can hold
// is refused before it is built, with its size; the estimate of the memory
// it needs counts the pins of the module instances too.
TEST_F(JsonReaderHierarchy, RefusesAHierarchyTooBigToUnfold) {
    auto gib = [](const Loaded& l) {
        const size_t at = l.errors.empty() ? std::string::npos : l.errors[0].find("need about ");
        return at == std::string::npos ? 0.0 : std::stod(l.errors[0].substr(at + 11));
    };
    Loaded one = LoadText(Chain(34, 2)), two = LoadText(Chain(34, 2, true));
    ASSERT_EQ(one.errors.size(), 1u);
    EXPECT_FALSE(one.ok);
    EXPECT_NE(one.errors[0].find("the hierarchy unfolds to 2.577e+10 instances"), std::string::npos)
        << one.errors[0];
    EXPECT_GT(gib(two), gib(one));  // one more pin on every instance
}

// ---------------------------------------------------------------------------
// The reader finds each module's place in the text by its layout and lets
// the parser settle it: every layout of one design must load the same model,
// and the layouts that mislead the first judgement must not change it.

using nlwtest::Replaced;

TEST_F(JsonReaderLayout, EveryLayoutLoadsTheSameModel) {
    const std::string base = nlwtest::Data("json/hierarchy.json");
    // One line; modules on lines of their own, closed by a line of the key's
    // indentation as yosys writes them; and an inner object closed by such a
    // line, which ends no module.
    const std::string layouts[] = {
        Replaced(base, "\n", " "),
        Replaced(Replaced(base, "\n  \"", "\n    \""), " } },\n", " }\n    },\n"),
        Replaced(base, "\"bits\": [ 5, 6 ] } },", "\"bits\": [ 5, 6 ] }\n  },"),
    };
    Loaded want = LoadText(base);
    ASSERT_TRUE(want.ok) << want.errors[0];
    for (const std::string& text : layouts) {
        Loaded got = LoadText(text);
        ASSERT_TRUE(got.ok) << text;
        EXPECT_EQ(Text(got), Text(want)) << text;
    }
    // A fault of the text inside a later module is still placed in the file.
    Loaded bad = LoadText(Replaced(base, "\"mid\": {", "\"mid\": {,"));
    ASSERT_EQ(bad.errors.size(), 1u);
    EXPECT_NE(bad.errors[0].find("malformed JSON at byte offset"), std::string::npos)
        << bad.errors[0];
}

// Quotes escaped in the strings between the modules and in a module's name
// do not end the string for the scan that finds the modules.
TEST_F(JsonReaderLayout, EscapedQuotesAtTheTopLevel) {
    Loaded l = LoadText(nlwtest::Data("json/escaped_quotes.json"));
    ASSERT_TRUE(l.ok) << l.errors[0];
    nlwtest::ExpectGolden("reader/escaped_quotes", Text(l));
}

// A large file is read in two halves at once: the modules after the middle
// must arrive whole. Blanks before them put them in the second half.
TEST_F(JsonReaderLayout, LargeFileReadInHalvesLoadsWhole) {
    const std::string base = nlwtest::Data("json/hierarchy.json");
    const size_t open = base.find('{');
    std::string big = base.substr(0, open + 1);
    big += "\"creator\": \"blanks\",";
    big.append(70u << 20, ' ');
    big += base.substr(open + 1);
    nlwtest::TempDir dir;
    const std::string path = dir.File("big.json", big);
    Loaded got = LoadFile(path);
    ASSERT_TRUE(got.ok) << (got.errors.empty() ? "" : got.errors[0]);
    EXPECT_EQ(Text(got), Text(LoadText(base)));
}

// ---------------------------------------------------------------------------
// Faulty input: every fault gives exactly one error that names the file and
// the fault, and the load reports failure.

const std::string kBad = std::string(NLW_TEST_DATA_DIR) + "/bad/";

void ExpectOneError(const Loaded& l, const std::string& file,
                    const std::vector<std::string>& parts) {
    EXPECT_FALSE(l.ok) << file;
    EXPECT_EQ(l.root(), nullptr) << file;  // found before anything was made
    EXPECT_EQ(l.view->GetTypes().size(), 0u) << file;
    ASSERT_EQ(l.errors.size(), 1u) << file;
    const std::string& e = l.errors[0];
    EXPECT_EQ(e.rfind(file, 0), 0u) << e;
    for (const std::string& part : parts) EXPECT_TRUE(Contains(e, part)) << e;
}

// Each file's one error, whole, in a golden file: module, port, cell and
// connection names, the cycle, the byte offset and line of malformed JSON.
TEST_F(JsonReaderBadInput, ReportsEachFaultOnce) {
    std::string errors;
    for (const nlwtest::Row& c : nlwtest::Table("bad_designs")) {
        Nlw_ReadOptions opt;
        opt.top = nlwtest::Opt(c[1]);
        const std::string path = kBad + c[0];
        Loaded l = LoadFile(path, opt);
        ExpectOneError(l, path, {});
        if (!l.errors.empty()) errors += nlwtest::Replaced(l.errors[0], kBad, "<bad>/");
    }
    nlwtest::ExpectGolden("reader/bad_input", errors);
}

TEST_F(JsonReaderBadInput, ReportsTheSystemReasonForAnUnreadableFile) {
    TempDir dir;
    struct Case {
        std::string path;
        const char* reason;
    } cases[] = {{dir / "missing.json", "No such file or directory"},
                 {dir.Path(), "Is a directory"}};
    for (const Case& c : cases) ExpectOneError(LoadFile(c.path), c.path, {"cannot read", c.reason});
}

TEST_F(JsonReaderBadInput, SurvivesDeepNestingAndOddDocuments) {
    std::vector<nlwtest::Row> cases = nlwtest::Table("odd_documents");
    // Deeper than the parser goes, and never closed.
    cases.push_back({std::string(100000, '[') + std::string(100000, ']'), "malformed JSON"});
    cases.push_back({std::string(100000, '['), "malformed JSON at byte offset 100000"});
    for (const nlwtest::Row& c : cases)
        ExpectOneError(LoadText(c[0], {}, "odd.json"), "odd.json", {c[1]});
}

// ---------------------------------------------------------------------------
// Netlists yosys 0.23 wrote from small designs (tests/data/verilog, each
// script in tests/data/yosys/README), compared whole: buses of both
// directions and ranges, constant ports inside and out, a port on another
// port's net, lookup tables of every width with their input buses, a
// blackbox module as a cell type with its parameters, and a two-level design
// flattened by yosys (hdlname akas) or by the reader.
TEST_F(WithTestCells, ReadsWhatYosysWrites) {
    for (const char* name : {"bus_design", "luts", "blackbox", "two_levels_flat", "two_levels"}) {
        Loaded l = LoadFile(std::string(NLW_TEST_DATA_DIR) + "/yosys/" + name + ".json");
        ASSERT_TRUE(l.ok) << name;
        nlwtest::ExpectGolden(std::string("yosys/") + name, Text(l));
    }
    Nlw_ReadOptions flatten;
    flatten.flatten = true;
    Loaded l = LoadFile(NLW_TEST_DATA_DIR "/yosys/two_levels.json", flatten);
    nlwtest::ExpectGolden("yosys/two_levels_flattened", Text(l));
}

// ---------------------------------------------------------------------------
// Corrupted design files: every mutation of a valid file either loads or is
// refused with exactly one error; none crashes, hangs or half-fills the view.

// A small hierarchical design in the layout yosys writes: buses with offset
// and upto, constants, parameters of every form, a blackbox cell type.
const std::string kDesign = nlwtest::Data("json/mutation_base.json");

TEST(JsonReaderMutation, CorruptedFilesLoadOrGiveOneError) {
    ASSERT_TRUE(LoadText(kDesign).ok);
    const std::string original = kDesign;
    const std::string alphabet = "{}[]\":,0123456789-xz \\abcdefghijklmnopqrstuvwxyz$.e+";
    std::mt19937 random(20261206);
    // Fifteen hundred refusals need not reach the console.
    Port_MsgManager::Instance().SetConsole(false);
    for (int round = 0; round < 1500; ++round) {
        std::string text = original;
        const int edits = 1 + static_cast<int>(random() % 4);
        for (int e = 0; e < edits; ++e) {
            const size_t pos = random() % text.size();
            switch (random() % 3) {
                case 0:  // replace a character
                    text[pos] = alphabet[random() % alphabet.size()];
                    break;
                case 1:  // delete a run
                    text.erase(pos, 1 + random() % 8);
                    break;
                default:  // duplicate a run
                    text.insert(pos, text.substr(pos, 1 + random() % 24));
                    break;
            }
        }
        const readertest::Loaded loaded = LoadText(text);
        if (loaded.ok) {
            EXPECT_TRUE(loaded.errors.empty()) << text;
            EXPECT_NE(loaded.view->GetRootMacro(), nullptr) << text;
        } else {
            EXPECT_EQ(loaded.errors.size(), 1u) << text;
            EXPECT_EQ(loaded.view->GetRootMacro(), nullptr) << text;
        }
    }
    Port_MsgManager::Instance().SetConsole(true);
}

}  // namespace

// The module hierarchy: unfolding, flattening, the choice of the top module
// and very deep nesting.
#include "ReaderTestSupport.h"

using namespace readertest;

namespace {

const std::string kHierJson = nlwtest::Data("json/hierarchy.json");

class JsonReaderHierarchy : public ::testing::Test {
protected:
    Installation inst_{DataFiles{{"cells.dat", TestCells()}}};
};

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
    const std::string twoFree = nlwtest::Data("json/two_free_modules.json");
    const std::string parentChild = nlwtest::Data("json/parent_child.json");
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

// The reader finds each module's place in the text by its layout and lets
// the parser settle it: every layout of one design must load the same model,
// and the layouts that mislead the first judgement must not change it.
#include "ReaderTestSupport.h"

using namespace readertest;

namespace {

std::string Replaced(std::string s, const std::string& from, const std::string& to) {
    for (size_t at = s.find(from); at != std::string::npos; at = s.find(from, at + to.size()))
        s.replace(at, from.size(), to);
    return s;
}

TEST(JsonReaderLayout, EveryLayoutLoadsTheSameModel) {
    Installation inst{DataFiles{{"cells.dat", TestCells()}}};
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

// A large file is read in two halves at once: the modules after the middle
// must arrive whole. Blanks before them put them in the second half.
TEST(JsonReaderLayout, LargeFileReadInHalvesLoadsWhole) {
    Installation inst{DataFiles{{"cells.dat", TestCells()}}};
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

}  // namespace

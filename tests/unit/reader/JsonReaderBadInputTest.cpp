// Faulty input: every fault gives exactly one error that names the file and
// the fault, and the load reports failure.
#include "ReaderTestSupport.h"

using namespace readertest;

namespace {

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
TEST(JsonReaderBadInput, ReportsEachFaultOnce) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
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

TEST(JsonReaderBadInput, ReportsTheSystemReasonForAnUnreadableFile) {
    TempDir dir;
    struct Case {
        std::string path;
        const char* reason;
    } cases[] = {{dir / "missing.json", "No such file or directory"},
                 {dir.path(), "Is a directory"}};
    for (const Case& c : cases) ExpectOneError(LoadFile(c.path), c.path, {"cannot read", c.reason});
}

TEST(JsonReaderBadInput, SurvivesDeepNestingAndOddDocuments) {
    std::vector<nlwtest::Row> cases = nlwtest::Table("odd_documents");
    // Deeper than the parser goes, and never closed.
    cases.push_back({std::string(100000, '[') + std::string(100000, ']'), "malformed JSON"});
    cases.push_back({std::string(100000, '['), "malformed JSON at byte offset 100000"});
    for (const nlwtest::Row& c : cases)
        ExpectOneError(LoadText(c[0], {}, "odd.json"), "odd.json", {c[1]});
}

}  // namespace

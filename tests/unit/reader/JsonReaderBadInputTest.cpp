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
    const std::pair<const char*, const char*> cases[] = {
        {"wrong_type.json", nullptr},
        {"bad_bit.json", nullptr},
        {"no_modules.json", nullptr},
        {"not_an_object.json", nullptr},
        {"no_top.json", nullptr},
        {"two_tops.json", nullptr},
        {"self_cycle.json", nullptr},
        {"two_cycle.json", nullptr},
        {"port_without_bits.json", nullptr},
        {"unknown_port.json", nullptr},
        {"malformed.json", nullptr},
        {"two_tops.json", "nothere"},  // a missing top
    };
    std::string errors;
    for (const auto& [file, top] : cases) {
        Nlw_ReadOptions opt;
        opt.top = top;
        const std::string path = kBad + file;
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
    const std::string deep = std::string(100000, '[') + std::string(100000, ']');
    struct Case {
        std::string text;
        std::string part;
    } cases[] = {
        {deep, "malformed JSON"},  // deeper than the parser goes
        {std::string(100000, '['), "malformed JSON at byte offset 100000"},
        {"", "malformed JSON"},
        {"{\"modules\": {\"m\": {\"ports\": {}}}} x", "at byte offset 34"},
        {"{\"modules\": {\"m\": {\"ports\": {\"p\": {\"bits\": [2], \"direction\": 5}}}}}",
         "\"direction\" must be a string"},
        {"{\"modules\": {\"m\": {\"ports\": {}, \"cells\": {\"c\": {\"type\": \"X\", "
         "\"parameters\": {\"P\": [1]}}}}}}",
         "cell 'c' parameter 'P': expected a string or a number"},
        {"{\"modules\": {\"m\": {\"ports\": {\"p\": {\"direction\": \"input\", \"bits\": [-4]}}}}}",
         "bad bit value -4"},
    };
    for (const Case& c : cases) {
        Loaded l = LoadText(c.text, {}, "odd.json");
        ExpectOneError(l, "odd.json", {c.part});
    }
}

}  // namespace

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

TEST(JsonReaderBadInput, ReportsEachFaultOnce) {
    Installation inst(DataFiles{{"cells.dat", TestCells()}});
    struct Case {
        const char* file;
        std::vector<std::string> parts;
    } cases[] = {
        {"wrong_type.json", {"module 'm' cell 'c' connection 'A': expected an array of bits"}},
        {"bad_bit.json", {"module 'm' port 'a'", "bad bit value \"q\""}},
        {"no_modules.json", {"no modules"}},
        {"not_an_object.json", {"expected a JSON object"}},
        {"no_top.json", {"no top module candidate"}},
        {"two_tops.json", {"several top module candidates: alpha, beta"}},
        {"self_cycle.json", {"instantiation cycle: rec -> rec"}},
        {"two_cycle.json", {"instantiation cycle: ping -> pong -> ping"}},
        {"port_without_bits.json", {"module 'm' port 'clk': missing \"bits\""}},
        {"unknown_port.json", {"cell 'u' connection 'b'", "module 'sub' has no port 'b'"}},
    };
    for (const Case& c : cases) {
        std::string path = kBad + c.file;
        ExpectOneError(LoadFile(path), path, c.parts);
    }
}

TEST(JsonReaderBadInput, GivesTheByteOffsetOfMalformedJson) {
    std::string path = kBad + "malformed.json";
    std::string text = ReadFile(path);
    size_t at = text.find(", ]");
    ASSERT_NE(at, std::string::npos);
    ExpectOneError(LoadFile(path), path,
                   {"malformed JSON at byte offset " + std::to_string(at + 2), "line 3"});
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

TEST(JsonReaderBadInput, NamesTheMissingTopModule) {
    Nlw_ReadOptions opt;
    opt.top = "nothere";
    std::string path = kBad + "two_tops.json";
    ExpectOneError(LoadFile(path, opt), path, {"top module 'nothere' not found"});
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

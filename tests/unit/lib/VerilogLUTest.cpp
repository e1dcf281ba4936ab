// The Verilog name legalizer: which names are legal and what the others
// become, with and without escaping at write time.
#include <gtest/gtest.h>

#include <string>

#include "Nlw_Verilog.h"
#include "Nlw_VerilogLU.h"

namespace {

// A name is legal exactly when Legalize leaves it alone, and a legalized name
// keeps its length.
TEST(VerilogLU, LegalizesWhatTheOutputStyleCannotWrite) {
    struct Case {
        bool escaping;
        std::string name;
        bool isBused;
        std::string expected;
    };
    const std::string dashes(3000, '-');
    const Case cases[] = {
        // With escaping only spaces are replaced.
        {true, "a b", false, "a_b"},
        {true, "a-b", false, "a-b"},
        {true, "1abc", false, "1abc"},
        {true, "a b[3]", true, "a_b[3]"},
        {true, "\\a b ", false, "\\a b "},
        {true, "caf\xc3\xa9", false, "caf\xc3\xa9"},
        {true, "", false, ""},
        {true, "module", false, "module"},
        // Without it every illegal character is rewritten.
        {false, "a-b", false, "a_b"},
        {false, "1abc", false, "_abc"},
        {false, "$x", false, "_x"},
        {false, "9", false, "_"},
        {false, "a$1", false, "a$1"},
        {false, "a-b[3]", true, "a_b[3]"},
        {false, "a-b[3]", false, "a_b_3_"},
        {false, "data[7]", true, "data[7]"},
        {false, "\xc3\xa9\xff", false, "___"},
        {false, "", false, ""},
        {false, "module", false, "module"},
        {false, dashes + "[5]", true, std::string(3000, '_') + "[5]"},  // long bus bit
    };
    Nlw_NlBus::SetInputDelimiterType(4);
    Nlw_Verilog nlw;
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name.substr(0, 20) + (c.isBused ? " bused" : "") +
                     (c.escaping ? " escaping" : ""));
        Nlw_VerilogLU lu(&nlw, nullptr, true, c.escaping, true, true, false);
        const Port::String name(c.name.c_str());
        EXPECT_EQ(lu.IsLegal(name, c.isBused), c.name == c.expected);
        const Port::String result = lu.Legalize(name, c.isBused);
        EXPECT_EQ(result.str(), c.expected);
        EXPECT_EQ(result.length(), c.name.size());
    }
}

// Marks its own escaped form and index text: the legalizer must ask through
// the writer's virtual operations.
class MarkedVerilog : public Nlw_Verilog {
public:
    unsigned char IsEscaped(const char* name) override {
        return std::string(name) == "keep me" || Nlw_Verilog::IsEscaped(name);
    }
    const char* GetIndexesString(DARRAY_Util_INT32*) override { return "<i>"; }
};

TEST(VerilogLU, AsksTheWriterThroughItsVirtualOperations) {
    MarkedVerilog marked;
    Nlw_VerilogLU lu(&marked, nullptr, true, true, true, true, false);
    EXPECT_TRUE(lu.IsLegal(Port::String("keep me"), false));
    EXPECT_EQ(lu.Legalize(Port::String("keep me"), false).str(), "keep me");
    EXPECT_EQ(lu.Legalize(Port::String("a b[2]"), true).str(), "a_b<i>");
}

}  // namespace

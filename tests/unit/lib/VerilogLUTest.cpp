// The Verilog name legalizer: which names are legal and what the others
// become, with and without escaping at write time.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Nlw_Verilog.h"
#include "Nlw_VerilogLU.h"

namespace {

struct Case {
    const char* name;
    bool isBused;
    const char* expected;  // equal to name when the name is legal
};

class VerilogLU : public ::testing::Test {
protected:
    void SetUp() override { Nlw_NlBus::SetInputDelimiterType(4); }

    // A name is legal exactly when Legalize leaves it alone, and a legalized
    // name keeps its length.
    void Check(bool writeEscapedNames, const std::vector<Case>& cases) {
        Nlw_VerilogLU lu(&nlw, nullptr, true, writeEscapedNames, true, true, false);
        for (const Case& c : cases) {
            const std::string name = c.name;
            EXPECT_EQ(lu.IsLegal(Port::String(c.name), c.isBused), name == c.expected) << name;
            const Port::String result = lu.Legalize(Port::String(c.name), c.isBused);
            EXPECT_EQ(result.str(), c.expected) << name << " " << c.isBused;
            EXPECT_EQ(result.length(), name.size()) << name;
        }
    }

    Nlw_Verilog nlw;
};

TEST_F(VerilogLU, WithEscapingReplacesOnlySpaces) {
    Check(true, {
                    {"a b", false, "a_b"},
                    {"a-b", false, "a-b"},
                    {"1abc", false, "1abc"},
                    {"a b[3]", true, "a_b[3]"},
                    {"\\a b ", false, "\\a b "},
                    {"caf\xc3\xa9", false, "caf\xc3\xa9"},
                    {"", false, ""},
                    {"module", false, "module"},
                });
}

TEST_F(VerilogLU, WithoutEscapingRewritesEveryIllegalCharacter) {
    Check(false, {
                     {"a-b", false, "a_b"},
                     {"1abc", false, "_abc"},
                     {"$x", false, "_x"},
                     {"9", false, "_"},
                     {"a$1", false, "a$1"},
                     {"a-b[3]", true, "a_b[3]"},
                     {"a-b[3]", false, "a_b_3_"},
                     {"data[7]", true, "data[7]"},
                     {"\xc3\xa9\xff", false, "___"},
                     {"", false, ""},
                     {"module", false, "module"},
                 });
}

TEST_F(VerilogLU, LongBusBitNamesKeepTheirIndex) {
    Nlw_VerilogLU lu(&nlw, nullptr, true, false, true, true, false);
    const Port::String name((std::string(3000, '-') + "[5]").c_str());
    EXPECT_FALSE(lu.IsLegal(name, true));
    EXPECT_EQ(lu.Legalize(name, true).str(), std::string(3000, '_') + "[5]");
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

TEST_F(VerilogLU, AsksTheWriterThroughItsVirtualOperations) {
    MarkedVerilog marked;
    Nlw_VerilogLU lu(&marked, nullptr, true, true, true, true, false);
    EXPECT_TRUE(lu.IsLegal(Port::String("keep me"), false));
    EXPECT_EQ(lu.Legalize(Port::String("keep me"), false).str(), "keep me");
    EXPECT_EQ(lu.Legalize(Port::String("a b[2]"), true).str(), "a_b<i>");
}

// Exposes the host part's state.
class OpenLU : public Nlw_VerilogLU {
public:
    using Nlw_VerilogLU::Nlw_VerilogLU;
    std::vector<bool> HostFlags() const { return {types_, names_, cellPins_, bridge_}; }
    bool Escapes() const { return UsesEscapedNames(); }
    Nlw_NlView* View() const { return view_; }
};

TEST(VerilogLUConstruction, PassesTheFlagsToTheHostInItsOrder) {
    Nlw_Verilog nlw;
    Nlw_NlView view;
    // Host part (view, third, fourth, fifth, first); writeEscapedNames second.
    OpenLU lu(&nlw, &view, false, true, true, false, true);
    EXPECT_EQ(lu.HostFlags(), (std::vector<bool>{true, false, true, false}));
    EXPECT_TRUE(lu.writeEscapedNames);
    EXPECT_TRUE(lu.Escapes());
    EXPECT_EQ(lu.nlw, &nlw);

    OpenLU other(nullptr, nullptr, true, false, false, true, false);
    EXPECT_EQ(other.HostFlags(), (std::vector<bool>{false, true, false, true}));
    EXPECT_FALSE(other.Escapes());

    OpenLU copy(lu);
    other = lu;
    for (const OpenLU* c : {&copy, &other}) {
        EXPECT_EQ(c->HostFlags(), lu.HostFlags());
        EXPECT_EQ(c->View(), &view);
        EXPECT_TRUE(c->writeEscapedNames);
        EXPECT_EQ(c->nlw, &nlw);
    }
}

}  // namespace

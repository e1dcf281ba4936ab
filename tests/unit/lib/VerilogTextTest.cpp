// Identifier escaping, bus range and index text, reserved words.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Nlw_Verilog.h"
#include "TestFiles.h"
#include "model/Nlw_NlBuilder.h"

namespace {

// Names are split by the output style while a design is written.
class VerilogText : public ::testing::Test {
protected:
    void SetUp() override { Nlw_NlBus::SetInputDelimiterType(4); }
    Nlw_Verilog nlw;
};

TEST_F(VerilogText, EscapesExactlyTheNamesThatAreNoSimpleIdentifiers) {
    for (const nlwtest::Row& c : nlwtest::Table("escapes"))
        EXPECT_EQ(nlw.Escape(c[0].c_str(), c[1] == "1"), c[2]) << c[0] << " " << c[1];
    // Long names survive whole.
    const std::string longName(5000, 'n'), longStem(4000, 'c');
    EXPECT_EQ(nlw.Escape(longName.c_str(), 0), longName);
    EXPECT_EQ(nlw.Escape((longStem + "-[12]").c_str(), 1), "\\" + longStem + "- [12]");
}

// Results share one buffer; a name that is escaped already comes back as the
// caller's pointer, yet the call still takes the buffer over like any other.
TEST_F(VerilogText, EscapedNamesComeBackAsTheCallersPointer) {
    const char* first = nlw.Escape("a-b", 0);
    EXPECT_EQ(nlw.Escape("c-d", 0), first);
    EXPECT_STREQ(first, "\\c-d ");
    for (const unsigned char isBused : {0, 1}) {
        for (const char* name : {"\\a-b ", "\\x y [2]"}) {
            EXPECT_EQ(nlw.Escape(name, isBused), name);
            EXPECT_STREQ(first, name) << int(isBused);
        }
    }
    EXPECT_STREQ(nlw.Escape(nlw.Escape("x y", 0), 0), "\\x y ");
}

TEST_F(VerilogText, RecognisesEscapedForms) {
    for (const char* name : {"\\a-b ", "\\a b [3]", "\\ ", "\\a [3] "})
        EXPECT_TRUE(nlw.IsEscaped(name)) << name;
    for (const char* name : {"a-b", "\\a-b", "a b ", "", "\\a[3]", "\\a b [3"})
        EXPECT_FALSE(nlw.IsEscaped(name)) << name;
}

// Marks its own escaped form and index text: Escape must ask through the
// virtual operations.
class MarkedVerilog : public Nlw_Verilog {
public:
    unsigned char IsEscaped(const char* name) override {
        return std::string(name) == "keep me" || Nlw_Verilog::IsEscaped(name);
    }
    const char* GetIndexesString(DARRAY_Util_INT32*) override { return "<i>"; }
};

TEST_F(VerilogText, EscapeAsksThroughTheVirtualOperations) {
    MarkedVerilog marked;
    const char* keep = "keep me";
    EXPECT_EQ(marked.Escape(keep, 0), keep);
    EXPECT_STREQ(marked.Escape("a-b[3]", 1), "\\a-b <i>");
    EXPECT_STREQ(marked.Escape("ab[3]", 1), "ab<i>");
}

TEST_F(VerilogText, WritesBusRangesInTheBusOrder) {
    Nlw_NlView view;
    Nlw_NlBuilder builder(&view);
    Nlw_NlBlock* top = builder.CreateRoot(builder.AddModuleType("top"), "top");
    Nlw_NlBus* bus = builder.AddSignalBus(top, "d", 7, 0);
    const char* first = nlw.GetRangeString(bus);
    EXPECT_STREQ(first, "[7 : 0]");
    for (int order : {1, 5}) {
        bus->SetOrder(0, order);
        EXPECT_STREQ(nlw.GetRangeString(bus), "[0 : 7]");
    }
    EXPECT_EQ(nlw.GetRangeString(builder.AddSignalBus(top, "s", 3, -2)), first);
    EXPECT_STREQ(first, "[3 : -2]");
}

TEST_F(VerilogText, WritesBusIndexes) {
    DARRAY_Util_INT32 indexes;
    indexes.Add(-1);
    const char* first = nlw.GetIndexesString(&indexes);
    EXPECT_STREQ(first, "[-1]");
    indexes[0] = 3;
    EXPECT_STREQ(nlw.GetIndexesString(&indexes), "[3]");
    // An empty array leaves the previous text.
    DARRAY_Util_INT32 empty;
    EXPECT_EQ(nlw.GetIndexesString(&empty), first);
    EXPECT_STREQ(first, "[3]");
}

TEST(VerilogReservedWords, ListsTheKeywordsInOrder) {
    Nlw_Verilog nlw;
    std::vector<std::string> all;
    for (const char** w = nlw.GetReservedWords(); *w != nullptr; ++w) all.push_back(*w);
    ASSERT_EQ(all.size(), 103u);
    EXPECT_EQ(all[0], "always");
    EXPECT_EQ(all[44], "module");
    EXPECT_EQ(all[102], "xor");
    // The table is in alphabetical order; a swapped or misspelt word shows.
    for (size_t i = 1; i < all.size(); ++i) EXPECT_LT(all[i - 1], all[i]) << all[i];
}

}  // namespace

// Formatted text and the host string.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Port.h"

namespace {

using Port::String;

std::vector<std::string> Pieces(const char* text, const char* seps, bool skipEmpty,
                                const char* open, const char* close) {
    std::vector<std::string> out;
    for (const String& s : String::Split(text, seps, skipEmpty, open, close))
        out.push_back(s.str());
    return out;
}

TEST(Vorform, FormatsLikePrintf) {
    EXPECT_STREQ(vorform("%s/%s.v", "out", "top"), "out/top.v");
    EXPECT_STREQ(vorform("%d'h%s", 16, "ABCD"), "16'hABCD");
    EXPECT_STREQ(vorform("%-6s|", "ab"), "ab    |");
    EXPECT_STREQ(vorform("%s", ""), "");
}

TEST(Vorform, NeverTruncatesLongText) {
    // Far beyond any buffer a fixed-size implementation would have.
    for (size_t len : {255u, 256u, 1023u, 1024u, 4097u, 100000u, 2000000u}) {
        std::string big(len, 'x');
        big.back() = 'y';
        const char* out = vorform("<%s>", big.c_str());
        ASSERT_EQ(std::string(out).size(), len + 2) << len;
        EXPECT_EQ(std::string(out), "<" + big + ">");
    }
}

TEST(Vorform, ResultsSurviveSevenFurtherCalls) {
    const char* first = vorform("first %d", 1);
    std::vector<const char*> later;
    for (int i = 0; i < 7; ++i)
        later.push_back(vorform("later %d %s", i, std::string(5000, 'z').c_str()));
    EXPECT_STREQ(first, "first 1");
    for (int i = 0; i < 7; ++i)
        EXPECT_EQ(std::string(later[i]).substr(0, 8), "later " + std::to_string(i) + " ");
}

TEST(Vorform, NestedCallsCombine) {
    const char* inner = vorform("%s[%d]", "bus", 3);
    EXPECT_STREQ(vorform("wire %s;", vorform("\\%s ", inner)), "wire \\bus[3] ;");
    // A result used as the argument of a much longer text.
    std::string tail(3000, 't');
    const char* a = vorform("%s", "abc");
    EXPECT_EQ(std::string(vorform("%s%s%s", a, tail.c_str(), a)), "abc" + tail + "abc");
}

TEST(Vorform, AppendFormatAppends) {
    std::string out = "head:";
    Port_AppendFormat(out, "%s=%d;", "a", 1);
    Port_AppendFormat(out, "%s", std::string(70000, 'q').c_str());
    Port_AppendFormat(out, "%s", "");
    EXPECT_EQ(out, "head:a=1;" + std::string(70000, 'q'));
}

TEST(HostString, CompareKinds) {
    String s("Clk_Buf");
    EXPECT_EQ(s.Compare("Clk_Buf"), 0);
    EXPECT_NE(s.Compare("clk_buf"), 0);
    EXPECT_EQ(s.Compare("clk_buf", String::IgnoreCase), 0);
    EXPECT_EQ(s.Compare("CLK_BUF", 1), 0);
    EXPECT_LT(s.Compare("Clk_Bug"), 0);
    EXPECT_GT(s.Compare("Clk_Bu"), 0);
    EXPECT_LT(s.Compare("clk_bufx", String::IgnoreCase), 0);
    EXPECT_GT(s.Compare(nullptr), 0);
    EXPECT_EQ(String().Compare(nullptr), 0);
}

TEST(HostString, MakeUpperAndLower) {
    String s("yes_No-9");
    s.MakeUpper();
    EXPECT_STREQ(s.c_str(), "YES_NO-9");
    s.MakeLower();
    EXPECT_STREQ(s.c_str(), "yes_no-9");
    s.SetChar(0, 'Y');
    s.SetChar(100, 'Z');  // out of range: ignored
    EXPECT_STREQ(s.c_str(), "Yes_no-9");
}

TEST(HostString, GetUINT32ReadsWholeDecimalText) {
    struct Case {
        const char* text;
        uint32_t value;
        bool ok;
    };
    const Case cases[] = {
        {"0", 0, true},
        {"16", 16, true},
        {"007", 7, true},
        {"4294967295", 4294967295u, true},
        {"4294967296", 0, false},
        {"", 0, false},
        {"12a", 0, false},
        {" 12", 0, false},
        {"-1", 0, false},
        {"+3", 0, false},
        {"99999999999999999999", 0, false},
    };
    for (const Case& c : cases) {
        bool ok = !c.ok;
        EXPECT_EQ(String(c.text).GetUINT32(&ok), c.value) << c.text;
        EXPECT_EQ(ok, c.ok) << c.text;
    }
    EXPECT_EQ(String("42").GetUINT32(), 42u);
}

TEST(HostString, SplitAtSeparators) {
    using V = std::vector<std::string>;
    EXPECT_EQ(Pieces("16'h0000", "'", true, "", ""), (V{"16", "h0000"}));
    EXPECT_EQ(Pieces("h0000", "'", true, "", ""), (V{"h0000"}));
    EXPECT_EQ(Pieces("a::b:", ":", true, nullptr, nullptr), (V{"a", "b"}));
    EXPECT_EQ(Pieces("a::b:", ":", false, nullptr, nullptr), (V{"a", "", "b", ""}));
    EXPECT_EQ(Pieces("a b,c", " ,", true, "", ""), (V{"a", "b", "c"}));
    EXPECT_EQ(Pieces("", ":", true, "", ""), V{});
    EXPECT_EQ(Pieces("", ":", false, "", ""), (V{""}));
    EXPECT_EQ(Pieces("abc", "", true, "", ""), (V{"abc"}));
    EXPECT_TRUE(String::Split(nullptr, ":", true, "", "").empty());
}

TEST(HostString, SplitKeepsQuotedSeparators) {
    using V = std::vector<std::string>;
    // The item syntax of the inclusion maps: key:name:name with ' quotes.
    EXPECT_EQ(Pieces("RAMB16:'A:B':C", ":", true, "'", "'"), (V{"RAMB16", "A:B", "C"}));
    EXPECT_EQ(Pieces("'x:y'", ":", true, "'", "'"), (V{"x:y"}));
    // Text after the closing quote stays in the piece.
    EXPECT_EQ(Pieces("'a:b'c:d", ":", true, "'", "'"), (V{"a:bc", "d"}));
    // A quote inside a piece is ordinary text.
    EXPECT_EQ(Pieces("a'b:c'", ":", true, "'", "'"), (V{"a'b", "c'"}));
    // An unclosed quote runs to the end.
    EXPECT_EQ(Pieces("k:'open:rest", ":", true, "'", "'"), (V{"k", "open:rest"}));
    // An explicitly quoted empty piece is kept.
    EXPECT_EQ(Pieces("a:'':b", ":", true, "'", "'"), (V{"a", "", "b"}));
    // Open and close quotes pair by position.
    EXPECT_EQ(Pieces("[a b] (c d) e", " ", true, "[(", "])"), (V{"a b", "c d", "e"}));
}

}  // namespace

// C-string helpers, wildcard matching, path helpers and the name cache.
#include <gtest/gtest.h>

#include <string>

#include "port/Port.h"
#include "port/UT.h"

namespace {

TEST(UtStr, ComparisonsIgnoringCase) {
    EXPECT_NE(UT_STR::Compare("a", "A"), 0);
    EXPECT_EQ(UT_STR::ICompare("QDB", "qdb"), 0);
    EXPECT_EQ(UT_STR::_ICompare("qda", "QDA"), 0);
    EXPECT_LT(UT_STR::ICompare("abc", "ABD"), 0);
    EXPECT_GT(UT_STR::ICompare("abcd", "ABC"), 0);
    EXPECT_EQ(UT_STR::ICompare(nullptr, ""), 0);
    EXPECT_NE(UT_STR::ICompare(nullptr, "x"), 0);
    EXPECT_EQ(UT_STR::INCompare("DCM_ADV_x", "dcm_adv", 7), 0);
    EXPECT_NE(UT_STR::INCompare("DCM_ADV_x", "dcm_adx", 7), 0);
    EXPECT_EQ(UT_STR::INCompare("ab", "AB", 10), 0);  // both end before n
    EXPECT_NE(UT_STR::INCompare("ab", "ABC", 10), 0);
}

TEST(UtStr, IMatchPatterns) {
    struct Case {
        const char* text;
        const char* pattern;
        bool match;
    };
    const Case cases[] = {
        {"\\abc ", "\\* ", true},        // an escaped name
        {"\\abc [3]", "\\* [*]", true},  // an escaped bus bit
        {"\\abc[3]", "\\* [*]", false},
        {"abc", "\\* ", false},
        {"Init_00", "INIT_*", true},
        {"INIT", "init_*", false},
        {"xINIT_00", "INIT_*", false},
        {"", "*", true},
        {"", "", true},
        {"a", "", false},
        {"", "a", false},
        {"ac", "a*c", true},
        {"abcbc", "a*bc", true},
        {"abcbd", "a*bc", false},
        {"aaa", "a**a", true},
        {"ab", "*c*", false},
        {"a?c", "a?c", true},
        {"abc", "a?c", false},  // only the star is special
    };
    for (const Case& c : cases)
        EXPECT_EQ(UT_STR::IMatch(c.text, c.pattern) != 0, c.match) << c.text << " ~ " << c.pattern;
    EXPECT_EQ(UT_STR::IMatch(nullptr, "*"), 1);
}

TEST(UtStr, IMatchStaysFastOnHostileStars) {
    // Exponential backtracking would never finish on this.
    std::string text(20000, 'a');
    std::string pattern;
    for (int i = 0; i < 40; ++i) pattern += "*a";
    pattern += "*b";
    EXPECT_EQ(UT_STR::IMatch(text.c_str(), pattern.c_str()), 0);
    text.back() = 'b';
    EXPECT_EQ(UT_STR::IMatch(text.c_str(), pattern.c_str()), 1);
}

TEST(UtStr, FindStringAndGetToken) {
    const char* text = "lib/cells/x.v";
    EXPECT_EQ(UT_STR::FindString(text, "cells"), text + 4);
    EXPECT_EQ(UT_STR::FindString(text, "none"), nullptr);
    EXPECT_EQ(UT_STR::FindString(nullptr, "a"), nullptr);
    struct Case {
        const char *text, *seps;
        char sep;
        const char* token;
    };
    const Case cases[] = {
        {"key=value", "=:", '=', "key"},
        {"a:b=c", "=:", ':', "a"},
        {"plain", "=:", '\0', "plain"},
        {"=x", "=", '=', ""},
    };
    for (const Case& c : cases) {
        std::string token = "stale";
        EXPECT_EQ(UT_STR::GetToken(c.text, token, c.seps), c.sep) << c.text;
        EXPECT_EQ(token, c.token) << c.text;
    }
}

TEST(UtPath, BaseRootAndDirectory) {
    struct Case {
        const char *path, *base, *root, *dir;
    };
    const Case cases[] = {
        {"a/b/top.v", "top", "a/b/top", "a/b/"},
        {"top", "top", "top", ""},
        {"/top.v", "top", "/top", "/"},
        {"./x", "x", "./x", "./"},
        {"top.tar.gz", "top.tar", "top.tar", ""},
        {"dir.d/top", "top", "dir.d/top", "dir.d/"},  // a dot in a directory is no extension
        {"/abs/design.ver", "design", "/abs/design", "/abs/"},
        {".hidden", ".hidden", ".hidden", ""},  // a leading dot starts no extension
        {"dir/.hidden.v", ".hidden", "dir/.hidden", "dir/"},
        {"top.", "top", "top", ""},
        {"dir/", "", "dir/", "dir/"},
        {"", "", "", ""},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(UT_PATH::GetBase(c.path), c.base) << c.path;
        EXPECT_EQ(UT_PATH::GetRoot(c.path), c.root) << c.path;
        EXPECT_STREQ(Port::FileName(c.path).GetPath(), c.dir) << c.path;
    }
    EXPECT_EQ(UT_PATH::GetRoot(nullptr), "");
    EXPECT_STREQ(Port::FileName(nullptr).GetPath(), "");
    EXPECT_EQ(UT_PATH::InternalPath("c:\\work\\top.v"), "c:/work/top.v");
    EXPECT_EQ(UT_PATH::ExternalPath("a/b/c.v"), "a/b/c.v");
}

TEST(NameCache, CountsEachNameAndKeepsEntriesInPlace) {
    UT_NCH_CACHE cache;
    EXPECT_EQ(cache.find("a"), nullptr);
    UT_NCH_NAME* a = cache.add("a", 1);
    EXPECT_EQ(a->GetCount(), 1);
    EXPECT_EQ(cache.add("a", 1)->GetCount(), 2);
    EXPECT_EQ(cache.add("A", 1)->GetCount(), 1);  // exact comparison
    EXPECT_EQ(cache.add("", 1)->GetCount(), 1);
    EXPECT_EQ(cache.size(), 3u);
    // Enough names to make the table grow several times.
    for (int i = 0; i < 5000; ++i) cache.add(vorform("name%d", i), 1);
    EXPECT_EQ(cache.find("a"), a);
    EXPECT_EQ(cache.add("a", 1)->GetCount(), 3);
    EXPECT_STREQ(a->GetName(), "a");
}

}  // namespace

// C-string helpers, wildcard matching, path helpers and the name cache.
#include <gtest/gtest.h>

#include <string>

#include "Port.h"
#include "UT.h"

namespace {

TEST(UtStr, ComparisonsIgnoringCase) {
    EXPECT_EQ(UT_STR::Compare("a", "a"), 0);
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
    EXPECT_EQ(UT_STR::INCompare("x", "y", 0), 0);
}

TEST(UtStr, IMatchPatterns) {
    struct Case {
        const char* text;
        const char* pattern;
        int match;
    };
    const Case cases[] = {
        {"\\abc ", "\\* ", 1},        // an escaped name
        {"\\abc [3]", "\\* [*]", 1},  // an escaped bus bit
        {"\\abc[3]", "\\* [*]", 0},
        {"abc", "\\* ", 0},
        {"INIT_00", "init_*", 1},
        {"INIT", "init_*", 0},
        {"xINIT_00", "INIT_*", 0},
        {"anything", "*", 1},
        {"", "*", 1},
        {"", "", 1},
        {"a", "", 0},
        {"", "a", 0},
        {"abc", "a*c", 1},
        {"ac", "a*c", 1},
        {"abcbc", "a*bc", 1},
        {"abcbd", "a*bc", 0},
        {"MixedCase", "mIXEDcASE", 1},
        {"aaa", "a**a", 1},
        {"ab", "*b*", 1},
        {"ab", "*c*", 0},
        {"a?c", "a?c", 1},  // only the star is special
        {"abc", "a?c", 0},
    };
    for (const Case& c : cases)
        EXPECT_EQ(UT_STR::IMatch(c.text, c.pattern) != 0, c.match != 0)
            << c.text << " ~ " << c.pattern;
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

    std::string token;
    EXPECT_EQ(UT_STR::GetToken("key=value", token, "=:"), '=');
    EXPECT_EQ(token, "key");
    EXPECT_EQ(UT_STR::GetToken("a:b=c", token, "=:"), ':');
    EXPECT_EQ(token, "a");
    EXPECT_EQ(UT_STR::GetToken("plain", token, "=:"), '\0');
    EXPECT_EQ(token, "plain");
    EXPECT_EQ(UT_STR::GetToken("=x", token, "="), '=');
    EXPECT_EQ(token, "");
}

TEST(UtPath, BaseAndRoot) {
    struct Case {
        const char* path;
        const char* base;
        const char* root;
    };
    const Case cases[] = {
        {"a/b/top.v", "top", "a/b/top"},
        {"out/top.v", "top", "out/top"},
        {"top.v", "top", "top"},
        {"top", "top", "top"},
        {"top.tar.gz", "top.tar", "top.tar"},
        {"dir.d/top", "top", "dir.d/top"},  // a dot in a directory is no extension
        {"dir.d/top.v", "top", "dir.d/top"},
        {"/abs/path/design.ver", "design", "/abs/path/design"},
        {".hidden", ".hidden", ".hidden"},  // a leading dot starts no extension
        {"dir/.hidden", ".hidden", "dir/.hidden"},
        {"dir/.hidden.v", ".hidden", "dir/.hidden"},
        {"top.", "top", "top"},
        {"dir/", "", "dir/"},
        {"", "", ""},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(UT_PATH::GetBase(c.path), c.base) << c.path;
        EXPECT_EQ(UT_PATH::GetRoot(c.path), c.root) << c.path;
    }
    EXPECT_EQ(UT_PATH::GetRoot(nullptr), "");
}

TEST(UtPath, InternalAndExternalForms) {
    EXPECT_EQ(UT_PATH::InternalPath("c:\\work\\top.v"), "c:/work/top.v");
    EXPECT_EQ(UT_PATH::InternalPath("a/b"), "a/b");
    EXPECT_EQ(UT_PATH::ExternalPath("a/b/c.v"), "a/b/c.v");
    EXPECT_EQ(UT_PATH::GetBase(UT_PATH::InternalPath("d\\e\\f.v").c_str()), "f");
}

TEST(PortFileName, DirectoryPart) {
    struct Case {
        const char* path;
        const char* dir;
    };
    const Case cases[] = {
        {"a/b/top.v", "a/b/"}, {"top.v", ""}, {"/top.v", "/"},
        {"a/b/", "a/b/"},      {"", ""},      {"./x", "./"},
    };
    for (const Case& c : cases) {
        Port::FileName f(c.path);
        EXPECT_STREQ(f.GetPath(), c.dir) << c.path;
    }
    EXPECT_STREQ(Port::FileName(nullptr).GetPath(), "");
    EXPECT_STREQ(Port::FileName::GetPathSeparator(), "/");
}

TEST(NameCache, CountsEachName) {
    UT_NCH_CACHE cache;
    EXPECT_EQ(cache.find("a"), nullptr);
    UT_NCH_NAME* a = cache.add("a", 1);
    EXPECT_EQ(a->GetCount(), 1);
    EXPECT_STREQ(a->GetName(), "a");
    EXPECT_EQ(cache.add("b", 1)->GetCount(), 1);
    EXPECT_EQ(cache.add("a", 1)->GetCount(), 2);
    EXPECT_EQ(cache.add("A", 1)->GetCount(), 1);  // exact comparison
    EXPECT_EQ(cache.find("a"), a);
    EXPECT_EQ(cache.size(), 3u);
    EXPECT_EQ(cache.add("", 1)->GetCount(), 1);
}

TEST(NameCache, EntriesStayInPlace) {
    UT_NCH_CACHE cache;
    UT_NCH_NAME* first = cache.add("first", 1);
    // Enough names to make the table grow several times.
    for (int i = 0; i < 5000; ++i) cache.add(vorform("name%d", i), 1);
    EXPECT_EQ(cache.add("first", 1), first);
    EXPECT_EQ(first->GetCount(), 2);
    EXPECT_STREQ(first->GetName(), "first");
}

}  // namespace

// Scratch directories, whole-file reads and writes and golden files, shared
// by the tests.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/stat.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "port/Port.h"

namespace nlwtest {

// A fresh directory below /tmp, removed with everything in it when the
// object goes.
class TempDir {
public:
    TempDir() {
        char tmpl[] = "/tmp/nlw_test_XXXXXX";
        const char* made = ::mkdtemp(tmpl);
        EXPECT_NE(made, nullptr);
        path_ = made ? made : "/tmp";
    }
    ~TempDir() { std::system(("rm -rf '" + path_ + "'").c_str()); }
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;
    const std::string& Path() const { return path_; }
    std::string operator/(const std::string& name) const { return path_ + "/" + name; }
    // Writes a file below the directory, creating its parents.
    std::string File(const std::string& rel, const std::string& content) const {
        std::filesystem::create_directories(std::filesystem::path(*this / rel).parent_path());
        std::ofstream(*this / rel, std::ios::binary) << content;
        return *this / rel;
    }
    std::string Dir(const std::string& rel) const {
        std::filesystem::create_directories(*this / rel);
        return *this / rel;
    }

private:
    std::string path_;
};

// Sets (or, with null, unsets) an environment variable while it lives; the
// installation roots are read again on both ends.
class ScopedEnv {
public:
    ScopedEnv(const char* name, const char* value) : name_(name) {
        if (const char* old = ::getenv(name)) had_ = true, old_ = old;
        Set(value);
    }
    ~ScopedEnv() { Set(had_ ? old_.c_str() : nullptr); }
    ScopedEnv(const ScopedEnv&) = delete;
    ScopedEnv& operator=(const ScopedEnv&) = delete;
    void Set(const char* value) {
        if (value)
            ::setenv(name_.c_str(), value, 1);
        else
            ::unsetenv(name_.c_str());
        Port::VornixPath::Reset();
    }

private:
    std::string name_, old_;
    bool had_ = false;
};

inline void WriteFile(const std::string& path, const std::string& text) {
    std::ofstream out(path, std::ios::binary);
    out << text;
}

inline std::string ReadFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::stringstream s;
    s << in.rdbuf();
    return s.str();
}

inline bool Exists(const std::string& path) {
    struct stat st;
    return ::stat(path.c_str(), &st) == 0;
}

// A data file's text, by its path below tests/data.
inline std::string Data(const std::string& rel) {
    return ReadFile(std::string(NLW_TEST_DATA_DIR) + "/" + rel);
}

// The cases of a table tests/data/tables/<name>.txt, one a line: fields
// split at '|', blanks around them dropped; '#' lines and empty lines are
// skipped. In a field \n, \r, \t, \s (a blank), \| and \\ stand for those
// characters; Opt() reads a lone "-" as no value.
using Row = std::vector<std::string>;
inline std::vector<Row> Table(const std::string& name) {
    std::vector<Row> rows;
    std::istringstream in(Data("tables/" + name + ".txt"));
    for (std::string line; std::getline(in, line);) {
        if (line.empty() || line[0] == '#') continue;
        Row row;
        std::string field;
        size_t blanks = 0;  // trailing blanks of the field so far
        auto end = [&] {
            field.resize(field.size() - blanks);
            row.push_back(field);
            field.clear();
            blanks = 0;
        };
        for (size_t i = 0; i < line.size(); ++i) {
            const char c = line[i];
            if (c == '|') {
                end();
            } else if (c == ' ') {
                if (!field.empty()) field += c, ++blanks;
            } else if (c == '\\' && i + 1 < line.size()) {
                const char e = line[++i];
                field += e == 'n' ? '\n' : e == 'r' ? '\r' : e == 't' ? '\t' : e == 's' ? ' ' : e;
                blanks = 0;
            } else {
                field += c, blanks = 0;
            }
        }
        end();
        rows.push_back(row);
    }
    EXPECT_FALSE(rows.empty()) << "no cases in table " << name;
    return rows;
}
inline const char* Opt(const std::string& field) {
    return field == "-" ? nullptr : field.c_str();
}

// text with every from replaced by to: keeps run-dependent parts (versions,
// temporary paths) out of golden files.
inline std::string Replaced(std::string text, const std::string& from, const std::string& to) {
    for (size_t pos = text.find(from); pos != std::string::npos; pos = text.find(from, pos))
        text.replace(pos, from.size(), to), pos += to.size();
    return text;
}

// Lines (messages, records) as one text, each followed by a newline of its
// own, so that a message's own line end shows as an empty line.
inline std::string Joined(const std::vector<std::string>& lines) {
    std::string text;
    for (const std::string& line : lines) text += line + "\n";
    return text;
}

// Items as one text, each in <>, so that empty items and an empty list show.
inline std::string Bracketed(const std::vector<std::string>& items) {
    std::string text;
    for (const std::string& item : items) text += "<" + item + ">";
    return text;
}

// The items of a Bracketed text.
inline std::vector<std::string> Unbracketed(const std::string& text) {
    std::vector<std::string> items;
    for (size_t open = text.find('<'); open != std::string::npos; open = text.find('<', open)) {
        const size_t close = text.find('>', open);
        items.push_back(text.substr(open + 1, close - open - 1));
        open = close;
    }
    return items;
}

// Compares text with the golden file tests/data/golden/<name>.txt. With
// NLW_BLESS=1 in the environment the file is (re)written instead, so that a
// deliberate change of output is one run plus a review of `git diff`.
inline void ExpectGolden(const std::string& name, const std::string& text) {
    const std::string path = std::string(NLW_TEST_DATA_DIR) + "/golden/" + name + ".txt";
    const char* bless = std::getenv("NLW_BLESS");
    if (bless && std::string(bless) == "1") {
        std::filesystem::create_directories(std::filesystem::path(path).parent_path());
        WriteFile(path, text);
        return;
    }
    ASSERT_TRUE(Exists(path)) << "no golden file " << path << "; write it with NLW_BLESS=1";
    EXPECT_EQ(text, ReadFile(path)) << "differs from " << path;
}

}  // namespace nlwtest

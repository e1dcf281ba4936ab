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
    const std::string& path() const { return path_; }
    std::string operator/(const std::string& name) const { return path_ + "/" + name; }

private:
    std::string path_;
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

// C-string helpers, path helpers and the counting name cache.
#include "port/UT.h"

#include <cctype>
#include <cstring>

namespace {

// ASCII case folding: names compare the same whatever the locale, and
// this runs on hot lookup paths.
inline int Lower(char c) {
    const unsigned char u = static_cast<unsigned char>(c);
    return u >= 'A' && u <= 'Z' ? u + ('a' - 'A') : u;
}

// Start of the file name part of a path.
size_t NameStart(const std::string& path) {
    size_t slash = path.rfind('/');
    return slash == std::string::npos ? 0 : slash + 1;
}

// Position of the dot that starts the extension of the file name part, or
// npos. A dot that begins the name (".hidden") starts no extension.
size_t ExtensionDot(const std::string& path) {
    size_t start = NameStart(path);
    size_t dot = path.rfind('.');
    if (dot == std::string::npos || dot <= start) return std::string::npos;
    return dot;
}

}  // namespace

char* UT_STR::Copy(char* dst, const char* src) {
    return std::strcpy(dst, UT_STR::OrEmpty(src));
}

char* UT_STR::Cat(char* dst, const char* src) {
    return std::strcat(dst, UT_STR::OrEmpty(src));
}

char* UT_STR::Dup(const char* src) {
    if (!src) return nullptr;
    size_t n = std::strlen(src);
    char* copy = new char[n + 1];
    std::memcpy(copy, src, n + 1);
    return copy;
}

size_t UT_STR::Len(const char* s) {
    return s ? std::strlen(s) : 0;
}

int UT_STR::Compare(const char* a, const char* b) {
    return std::strcmp(UT_STR::OrEmpty(a), UT_STR::OrEmpty(b));
}

int UT_STR::ICompare(const char* a, const char* b) {
    a = UT_STR::OrEmpty(a);
    b = UT_STR::OrEmpty(b);
    // Names compared so mostly agree byte for byte; case is looked at only
    // where they do not.
    for (;; ++a, ++b) {
        if (*a == *b) {
            if (*a == '\0') return 0;
            continue;
        }
        int ca = Lower(*a), cb = Lower(*b);
        if (ca != cb) return ca < cb ? -1 : 1;
    }
}

int UT_STR::INCompare(const char* a, const char* b, size_t n) {
    a = UT_STR::OrEmpty(a);
    b = UT_STR::OrEmpty(b);
    for (size_t i = 0; i < n; ++i) {
        int ca = Lower(a[i]), cb = Lower(b[i]);
        if (ca != cb) return ca < cb ? -1 : 1;
        if (ca == 0) return 0;
    }
    return 0;
}

int UT_STR::IMatch(const char* text, const char* pattern) {
    // Greedy matching that remembers only the last star: on a mismatch the
    // star takes one more character. Time is bounded by the product of the
    // two lengths, whatever the number of stars.
    const char* t = UT_STR::OrEmpty(text);
    const char* p = UT_STR::OrEmpty(pattern);
    const char* star = nullptr;
    const char* resume = nullptr;
    while (*t) {
        if (*p == '*') {
            star = p++;
            resume = t;
        } else if (*p && Lower(*p) == Lower(*t)) {
            ++p;
            ++t;
        } else if (star) {
            p = star + 1;
            t = ++resume;
        } else {
            return 0;
        }
    }
    while (*p == '*') ++p;
    return *p == '\0' ? 1 : 0;
}

const char* UT_STR::FindString(const char* text, const char* what) {
    if (!text || !what) return nullptr;
    return std::strstr(text, what);
}

char UT_STR::GetToken(const char* text, std::string& token, const char* separators) {
    token.clear();
    text = UT_STR::OrEmpty(text);
    size_t n = std::strcspn(text, UT_STR::OrEmpty(separators));
    token.assign(text, n);
    return text[n];
}

std::string UT_PATH::GetBase(const char* path) {
    std::string p(UT_STR::OrEmpty(path));
    size_t start = NameStart(p);
    size_t dot = ExtensionDot(p);
    return p.substr(start, dot == std::string::npos ? std::string::npos : dot - start);
}

std::string UT_PATH::GetRoot(const char* path) {
    std::string p(UT_STR::OrEmpty(path));
    size_t dot = ExtensionDot(p);
    return dot == std::string::npos ? p : p.substr(0, dot);
}

std::string UT_PATH::ExternalPath(const char* path) {
    return std::string(UT_STR::OrEmpty(path));
}

std::string UT_PATH::InternalPath(const char* path) {
    std::string p(UT_STR::OrEmpty(path));
    for (char& c : p)
        if (c == '\\') c = '/';
    return p;
}

UT_NCH_NAME* UT_NCH_CACHE::add(const char* name, int count) {
    auto it = map_.try_emplace(UT_STR::OrEmpty(name)).first;
    UT_NCH_NAME& entry = it->second;
    if (entry.name_.empty() && !it->first.empty()) entry.name_ = it->first;
    entry.count_ += count;
    return &entry;
}

UT_NCH_NAME* UT_NCH_CACHE::find(const char* name) {
    auto it = map_.find(UT_STR::OrEmpty(name));
    return it == map_.end() ? nullptr : &it->second;
}

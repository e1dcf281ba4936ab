// Utility services: C-string helpers, path helpers, arrays and the counting
// name cache.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

class UT_STR {
public:
    // The text, or "" for null.
    static const char* OrEmpty(const char* s) { return s ? s : ""; }
    static char* Copy(char* dst, const char* src);
    static char* Cat(char* dst, const char* src);
    // A heap copy (delete[] to release); null for null.
    static char* Dup(const char* src);
    static size_t Len(const char* s);
    static int Compare(const char* a, const char* b);
    // 0 when equal ignoring ASCII case; null counts as "".
    static int ICompare(const char* a, const char* b);
    static int _ICompare(const char* a, const char* b) { return ICompare(a, b); }
    // 0 when the first n characters are equal ignoring case.
    static int INCompare(const char* a, const char* b, size_t n);
    // Non-zero when the whole text matches the pattern ignoring case; "*"
    // stands for any run of characters, every other character for itself.
    static int IMatch(const char* text, const char* pattern);
    // Pointer to the first occurrence of what in text, or null.
    static const char* FindString(const char* text, const char* what);
    // Copies into token the text before the first separator character.
    // Returns the separator found, or 0 when the text ended.
    static char GetToken(const char* text, std::string& token, const char* separators);
};

class UT_PATH {
public:
    // File name without directory and extension. The extension starts at the
    // last dot of the file name, unless that dot begins the name.
    static std::string GetBase(const char* path);
    // The path without the extension of its file name, directory kept.
    static std::string GetRoot(const char* path);
    // The internal form uses "/" only; the external form is the platform's,
    // which on this host is the same.
    static std::string ExternalPath(const char* path);
    static std::string InternalPath(const char* path);
};

// An indexed array of values.
template <typename T>
class UT_DARRAY {
public:
    size_t GetCount() const { return v_.size(); }
    size_t size() const { return v_.size(); }
    T& operator[](size_t i) { return v_[i]; }
    const T& operator[](size_t i) const { return v_[i]; }
    T Get(size_t i) const { return v_[i]; }
    void Add(const T& x) { v_.push_back(x); }
    void Clear() { v_.clear(); }
    void Reserve(size_t n) { v_.reserve(n); }
    typename std::vector<T>::iterator begin() { return v_.begin(); }
    typename std::vector<T>::iterator end() { return v_.end(); }
    typename std::vector<T>::const_iterator begin() const { return v_.begin(); }
    typename std::vector<T>::const_iterator end() const { return v_.end(); }

private:
    std::vector<T> v_;
};

using DARRAY_Util_INT32 = UT_DARRAY<int32_t>;

// An entry of the name cache: the name and how often it was added.
class UT_NCH_NAME {
public:
    const char* GetName() const { return name_.c_str(); }
    int GetCount() const { return count_; }

private:
    friend class UT_NCH_CACHE;
    std::string name_;
    int count_ = 0;
};

// A counting string cache: add(name, n) adds n to the name's count and
// returns its entry, so with n = 1 a count of 1 means the name is new.
// Comparison is exact; entries stay where they are while the cache lives.
class UT_NCH_CACHE {
public:
    explicit UT_NCH_CACHE(bool flag = false) { (void)flag; }
    UT_NCH_NAME* add(const char* name, int count);
    UT_NCH_NAME* find(const char* name);
    size_t size() const { return map_.size(); }

private:
    std::unordered_map<std::string, UT_NCH_NAME> map_;
};

// Formatted text and the host string.
#include <algorithm>
#include <cctype>
#include <cstring>
#include <string>

#include "port/Port.h"

namespace {

// Callers keep a handful of vorform results alive at once (a format whose
// arguments are themselves vorform results), so results rotate through a
// small ring instead of sharing one buffer.
constexpr int kRingSize = 8;

// Formats into out, replacing its content; the buffer grows to whatever the
// text needs.
void FormatInto(std::string& out, const char* format, va_list args) {
    if (!format) {
        out.clear();
        return;
    }
    va_list probe;
    va_copy(probe, args);
    // Try the capacity the buffer already has first: most texts are short
    // and the ring's strings keep their capacity between calls.
    if (out.capacity() < 256) out.reserve(256);
    out.resize(out.capacity());
    int n = std::vsnprintf(&out[0], out.size() + 1, format, probe);
    va_end(probe);
    if (n < 0) {
        out.clear();
        return;
    }
    if (static_cast<size_t>(n) > out.size()) {
        out.resize(static_cast<size_t>(n));
        std::vsnprintf(&out[0], out.size() + 1, format, args);
    } else {
        out.resize(static_cast<size_t>(n));
    }
}

// ASCII case folding: names compare the same whatever the locale, and
// this runs on hot lookup paths.
inline int Lower(int c) {
    const unsigned char u = static_cast<unsigned char>(c);
    return u >= 'A' && u <= 'Z' ? u + ('a' - 'A') : u;
}

}  // namespace

const char* vvorform(const char* format, va_list args) {
    thread_local std::string ring[kRingSize];
    thread_local int next = 0;
    std::string& out = ring[next];
    next = (next + 1) % kRingSize;
    // The arguments may point into the slot being reused only if they come
    // from eight calls back, which the contract rules out.
    FormatInto(out, format, args);
    return out.c_str();
}

const char* vorform(const char* format, ...) {
    va_list args;
    va_start(args, format);
    const char* result = vvorform(format, args);
    va_end(args);
    return result;
}

void Port_AppendFormatV(std::string& out, const char* format, va_list args) {
    if (!format) return;
    va_list probe;
    va_copy(probe, args);
    int n = std::vsnprintf(nullptr, 0, format, probe);
    va_end(probe);
    if (n > 0) {
        size_t old = out.size();
        out.resize(old + static_cast<size_t>(n));
        std::vsnprintf(&out[old], static_cast<size_t>(n) + 1, format, args);
    }
}

void Port_AppendFormat(std::string& out, const char* format, ...) {
    va_list args;
    va_start(args, format);
    Port_AppendFormatV(out, format, args);
    va_end(args);
}

namespace Port {

namespace {

template <typename C>
size_t TextLen(const C* s) {
    return std::char_traits<C>::length(s);
}

template <typename C>
const C* FindChar(const C* set, C c) {
    for (; *set; ++set)
        if (*set == c) return set;
    return nullptr;
}

}  // namespace

template <typename C>
int StringBase<C>::Compare(const C* other, int kind) const {
    static const C kEmpty[1] = {C()};
    const C* a = s_.c_str();
    const C* b = other ? other : kEmpty;
    for (;; ++a, ++b) {
        int ca = static_cast<int>(*a), cb = static_cast<int>(*b);
        if (kind == IgnoreCase) {
            ca = Lower(ca);
            cb = Lower(cb);
        }
        if (ca != cb) return ca < cb ? -1 : 1;
        if (ca == 0) return 0;
    }
}

template <typename C>
void StringBase<C>::MakeUpper() {
    for (C& c : s_)
        if (c >= 'a' && c <= 'z') c = static_cast<C>(c - 'a' + 'A');
}

template <typename C>
void StringBase<C>::MakeLower() {
    for (C& c : s_)
        if (c >= 'A' && c <= 'Z') c = static_cast<C>(c - 'A' + 'a');
}

template <typename C>
uint32_t StringBase<C>::GetUINT32(bool* ok) const {
    uint64_t value = 0;
    bool good = !s_.empty();
    for (C c : s_) {
        if (c < '0' || c > '9') {
            good = false;
            break;
        }
        value = value * 10 + static_cast<uint64_t>(c - '0');
        if (value > UINT32_MAX) {
            good = false;
            break;
        }
    }
    if (ok) *ok = good;
    return good ? static_cast<uint32_t>(value) : 0;
}

template <typename C>
std::vector<StringBase<C>> StringBase<C>::Split(const C* text, const C* separators, bool skipEmpty,
                                                const C* openQuotes, const C* closeQuotes) {
    static const C kEmpty[1] = {C()};
    std::vector<StringBase<C>> pieces;
    if (!text) return pieces;
    const C* seps = separators ? separators : kEmpty;
    const C* opens = openQuotes ? openQuotes : kEmpty;
    const C* closes = closeQuotes ? closeQuotes : kEmpty;
    // Open and close quotes pair up by position.
    const size_t numQuotes = std::min(TextLen(opens), TextLen(closes));

    const C* p = text;
    for (;;) {
        std::basic_string<C> piece;
        bool quoted = false;
        // A quote counts only where a piece begins; it protects separators up
        // to its closing partner, and text after the closing quote still
        // belongs to the piece.
        const C* q = *p ? FindChar(opens, *p) : nullptr;
        if (q && static_cast<size_t>(q - opens) < numQuotes) {
            const C close = closes[q - opens];
            quoted = true;
            ++p;
            while (*p && *p != close) piece += *p++;
            if (*p == close) ++p;
        }
        while (*p && !FindChar(seps, *p)) piece += *p++;
        // An explicitly quoted piece is kept even when empty.
        if (!piece.empty() || quoted || !skipEmpty) pieces.emplace_back(piece);
        if (!*p) break;
        ++p;  // the separator
    }
    return pieces;
}

template class StringBase<char>;

}  // namespace Port

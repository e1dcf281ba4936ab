// The document is parsed one module at a time. A netlist JSON file is one
// object whose "modules" member holds every module; parsed whole, its tape
// and strings take about twice the file's size, while no module is more
// than a small part of it. So a scan of the top level finds where each
// module's object lies in the text, and each is handed to the parser on
// its own when it is read, reusing the parser's buffers.
//
// The scan only steps over the text between the modules; the parser checks
// every byte of it. A fault anywhere is reported as a parse of the whole
// document reports it, with the byte offset and position in the file.
#include <cstring>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

bool IsSpace(char c) {
    return c == ' ' || c == '\t' || c == '\n' || c == '\r';
}

class TopScan {
public:
    TopScan(const char* text, size_t len) : t_(text), n_(len) {}

    size_t SkipSpace(size_t i) const {
        while (i < n_ && IsSpace(t_[i])) ++i;
        return i;
    }

    // The end of the string that opens at i, or npos.
    size_t StringEnd(size_t i) const {
        for (++i; i < n_; ++i) {
            const void* hit = std::memchr(t_ + i, '"', n_ - i);
            if (!hit) return npos;
            size_t q = static_cast<const char*>(hit) - t_;
            size_t slashes = 0;
            while (q - slashes > i && t_[q - slashes - 1] == '\\') ++slashes;
            if (slashes % 2 == 0) return q + 1;
            i = q;
        }
        return npos;
    }

    // The end of the value that begins at i, or npos. Strings are stepped
    // over whole, so brackets inside them do not count.
    size_t ValueEnd(size_t i) const {
        if (i >= n_) return npos;
        if (t_[i] == '"') return StringEnd(i);
        if (t_[i] != '{' && t_[i] != '[') {
            while (i < n_ && !IsSpace(t_[i]) && t_[i] != ',' && t_[i] != '}' && t_[i] != ']') ++i;
            return i;
        }
        size_t depth = 0;
        for (; i < n_; ++i) {
            const char c = t_[i];
            if (c == '"') {
                i = StringEnd(i);
                if (i == npos) return npos;
                --i;
            } else if (c == '{' || c == '[') {
                ++depth;
            } else if (c == '}' || c == ']') {
                if (--depth == 0) return i + 1;
            }
        }
        return npos;
    }

    // Where the object that opens at i most likely ends, judged by the
    // layout: an object whose key begins a line ends where a line of the
    // same indentation begins with "}". A raw line break cannot lie inside
    // a string, so the guess is never inside one; whether it is the
    // object's end is settled by parsing the range, which succeeds only
    // when it holds exactly one object. npos when the text has no such line.
    size_t GuessObjectEnd(size_t keyBegin, size_t i) const {
        size_t indent = 0;
        while (indent < keyBegin && t_[keyBegin - indent - 1] == ' ') ++indent;
        if (indent >= keyBegin || t_[keyBegin - indent - 1] != '\n' || indent > 64) return npos;
        char close[66];
        close[0] = '\n';
        std::memset(close + 1, ' ', indent);
        close[indent + 1] = '}';
        const size_t hit = Find(i, close, indent + 2);
        return hit == npos ? npos : hit + indent + 2;
    }

    static constexpr size_t npos = std::string::npos;

private:
    // The first place at or after i where needle (at least 2 bytes) begins.
    // Blocks of 16 places are tested at once on the needle's first and last
    // bytes, and only the places where both agree are compared whole.
    size_t Find(size_t i, const char* needle, size_t len) const {
#if defined(__SSE2__)
        const __m128i first = _mm_set1_epi8(needle[0]);
        const __m128i last = _mm_set1_epi8(needle[len - 1]);
        for (; i + len - 1 + 16 <= n_; i += 16) {
            const __m128i a = _mm_loadu_si128(reinterpret_cast<const __m128i*>(t_ + i));
            const __m128i b = _mm_loadu_si128(reinterpret_cast<const __m128i*>(t_ + i + len - 1));
            unsigned mask = static_cast<unsigned>(_mm_movemask_epi8(
                _mm_and_si128(_mm_cmpeq_epi8(a, first), _mm_cmpeq_epi8(b, last))));
            while (mask) {
                const unsigned bit = static_cast<unsigned>(__builtin_ctz(mask));
                if (std::memcmp(t_ + i + bit + 1, needle + 1, len - 2) == 0) return i + bit;
                mask &= mask - 1;
            }
        }
#endif
        for (; i + len <= n_; ++i)
            if (t_[i] == needle[0] && std::memcmp(t_ + i, needle, len) == 0) return i;
        return npos;
    }

    const char* t_;
    size_t n_;
};

// Stops the load with the message a parse of the whole document gives.
// While the places of the modules are judged by the layout, a fault may be
// the judgement's: the list is then made again, exactly, and a fault of the
// text shows there.
[[noreturn]] void FailWhole(Design& d, const char* what) {
    if (!d.exactSplit) throw GuessFailed{};
    ParseWhole(d);
    Fail(what);
}

// A key as the parser reads it: the text between the quotes, or, when it
// holds an escape, its decoded form in the pool.
std::string_view KeyText(Design& d, const char* text, size_t begin, size_t end) {
    std::string_view raw(text + begin + 1, end - begin - 2);
    if (raw.find('\\') == std::string_view::npos) return raw;
    std::string_view decoded;
    simdjson::dom::element e;
    if (d.parser.parse(reinterpret_cast<const uint8_t*>(text + begin), end - begin, false).get(e) ||
        e.get_string().get(decoded))
        FailWhole(d, "malformed JSON: a bad key");
    return d.pool.Keep(decoded);
}

// Checks a value outside the modules by parsing it on its own.
void CheckValue(Design& d, size_t begin, size_t end) {
    simdjson::dom::element e;
    if (d.parser.parse(reinterpret_cast<const uint8_t*>(d.text + begin), end - begin, false).get(e))
        FailWhole(d, "malformed JSON");
}

// Steps over the members of the object that opens at i, calling
// member(keyBegin, keyEnd, value) for each, which returns the end of the
// value. Returns the place after the object.
template <typename Member>
size_t ForEachMember(Design& d, const TopScan& s, size_t i, Member member) {
    i = s.SkipSpace(i + 1);
    if (i < d.textLen && d.text[i] == '}') return i + 1;
    for (;;) {
        if (i >= d.textLen || d.text[i] != '"') FailWhole(d, "malformed JSON");
        const size_t keyBegin = i;
        const size_t keyEnd = s.StringEnd(i);
        if (keyEnd == TopScan::npos) FailWhole(d, "malformed JSON");
        i = s.SkipSpace(keyEnd);
        if (i >= d.textLen || d.text[i] != ':') FailWhole(d, "malformed JSON");
        i = s.SkipSpace(member(keyBegin, keyEnd, s.SkipSpace(i + 1)));
        if (i < d.textLen && d.text[i] == ',') {
            i = s.SkipSpace(i + 1);
            continue;
        }
        if (i < d.textLen && d.text[i] == '}') return i + 1;
        FailWhole(d, "malformed JSON");
    }
}

// Lists the modules of the "modules" object that opens at i; returns the
// place after its end.
size_t ScanModules(Design& d, const TopScan& s, size_t i) {
    return ForEachMember(d, s, i, [&](size_t keyBegin, size_t keyEnd, size_t at) {
        size_t end =
            d.exactSplit || d.text[at] != '{' ? TopScan::npos : s.GuessObjectEnd(keyBegin, at);
        if (end == TopScan::npos) end = s.ValueEnd(at);
        if (end == TopScan::npos) FailWhole(d, "malformed JSON");
        Module m;
        m.nameText = d.pool.Keep(PublicName(KeyText(d, d.text, keyBegin, keyEnd)));
        m.name = m.nameText;
        m.textBegin = at;
        m.textEnd = end;
        d.modules.push_back(std::move(m));
        return end;
    });
}

}  // namespace

void ParseWhole(Design& d) {
    simdjson::dom::parser whole;
    simdjson::dom::element root;
    simdjson::error_code err =
        whole.parse(reinterpret_cast<const uint8_t*>(d.text), d.textLen, false).get(root);
    if (err) FailParse(d, err);
}

void SplitModules(Design& d) {
    TopScan s(d.text, d.textLen);
    size_t i = s.SkipSpace(0);
    if (i >= d.textLen || d.text[i] != '{') FailWhole(d, "expected a JSON object at the top level");
    bool found = false, scanned = false;
    i = ForEachMember(d, s, i, [&](size_t keyBegin, size_t keyEnd, size_t at) {
        const bool isModules = KeyText(d, d.text, keyBegin, keyEnd) == "modules";
        // The first "modules" member is the one read, as a lookup by key
        // finds it; the rest of the top level is only checked.
        size_t end;
        if (isModules && !found && d.text[at] == '{') {
            end = ScanModules(d, s, at);
            scanned = true;
        } else {
            end = s.ValueEnd(at);
            if (end == TopScan::npos) FailWhole(d, "malformed JSON");
            CheckValue(d, at, end);
        }
        found = found || isModules;
        return end;
    });
    if (s.SkipSpace(i) != d.textLen) FailWhole(d, "malformed JSON");
    if (!scanned) {
        // A "modules" member that is not an object may still hide a fault
        // of the text elsewhere; those are reported first.
        ParseWhole(d);
        Fail("no modules (expected an object \"modules\")");
    }
}

void OpenFailed(Design& d) {
    FailWhole(d, "malformed JSON");
}

}  // namespace nlw_json

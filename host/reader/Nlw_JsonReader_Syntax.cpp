// Finds where a JSON text goes wrong. The parser says what is wrong but
// not where; this check runs only after a failed parse to point the user at
// the byte. It keeps its nesting on the heap, so any depth is fine.
#include <cctype>
#include <cstring>
#include <string>
#include <vector>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

class SyntaxCheck {
public:
    SyntaxCheck(const char* text, size_t len) : s_(text), n_(len) {}

    size_t Run() {
        SkipBlank();
        if (p_ >= n_) return p_;
        if (!Value()) return p_;
        SkipBlank();
        return p_ < n_ ? p_ : std::string::npos;
    }

private:
    // What follows inside the innermost open container.
    enum State : char { kArrayFirst, kArrayNext, kObjectFirst, kObjectNext };

    void SkipBlank() {
        while (p_ < n_ && (s_[p_] == ' ' || s_[p_] == '\t' || s_[p_] == '\n' || s_[p_] == '\r'))
            ++p_;
    }

    // One whole value, containers walked with an explicit stack.
    bool Value() {
        std::vector<State> stack;
        for (;;) {
            SkipBlank();
            if (p_ >= n_) return false;
            char c = s_[p_];
            if (c == '[') {
                ++p_;
                SkipBlank();
                if (p_ < n_ && s_[p_] == ']') {
                    ++p_;
                } else {
                    stack.push_back(kArrayNext);
                    continue;
                }
            } else if (c == '{') {
                ++p_;
                SkipBlank();
                if (p_ < n_ && s_[p_] == '}') {
                    ++p_;
                } else {
                    stack.push_back(kObjectNext);
                    if (!Member()) return false;
                    continue;
                }
            } else if (!Scalar()) {
                return false;
            }
            // A value ended: close containers or move to the next element.
            for (;;) {
                if (stack.empty()) return true;
                SkipBlank();
                if (p_ >= n_) return false;
                char e = s_[p_];
                if (e == ',') {
                    ++p_;
                    if (stack.back() == kObjectNext && !Member()) return false;
                    break;
                }
                if ((e == ']' && stack.back() == kArrayNext) ||
                    (e == '}' && stack.back() == kObjectNext)) {
                    ++p_;
                    stack.pop_back();
                    continue;
                }
                return false;
            }
        }
    }

    // A key and its colon.
    bool Member() {
        SkipBlank();
        if (p_ >= n_ || s_[p_] != '"' || !String()) return false;
        SkipBlank();
        if (p_ >= n_ || s_[p_] != ':') return false;
        ++p_;
        return true;
    }

    bool Scalar() {
        char c = s_[p_];
        if (c == '"') return String();
        if (c == '-' || (c >= '0' && c <= '9')) return Number();
        for (const char* word : {"true", "false", "null"}) {
            size_t len = std::strlen(word);
            if (n_ - p_ >= len && std::memcmp(s_ + p_, word, len) == 0) {
                p_ += len;
                return true;
            }
        }
        return false;
    }

    bool String() {
        ++p_;  // the opening quote
        while (p_ < n_) {
            unsigned char c = static_cast<unsigned char>(s_[p_]);
            if (c == '"') {
                ++p_;
                return true;
            }
            if (c < 0x20) return false;
            if (c == '\\') {
                ++p_;
                if (p_ >= n_) return false;
                char e = s_[p_];
                if (e == 'u') {
                    for (int k = 1; k <= 4; ++k)
                        if (p_ + k >= n_ ||
                            !std::isxdigit(static_cast<unsigned char>(s_[p_ + k]))) {
                            p_ += k;
                            return false;
                        }
                    p_ += 4;
                } else if (!std::strchr("\"\\/bfnrt", e) || e == '\0') {
                    return false;
                }
            }
            ++p_;
        }
        return false;
    }

    bool Digits() {
        size_t b = p_;
        while (p_ < n_ && s_[p_] >= '0' && s_[p_] <= '9') ++p_;
        return p_ > b;
    }

    bool Number() {
        if (s_[p_] == '-') ++p_;
        if (p_ < n_ && s_[p_] == '0') {
            ++p_;
        } else if (!Digits()) {
            return false;
        }
        if (p_ < n_ && s_[p_] == '.') {
            ++p_;
            if (!Digits()) return false;
        }
        if (p_ < n_ && (s_[p_] == 'e' || s_[p_] == 'E')) {
            ++p_;
            if (p_ < n_ && (s_[p_] == '+' || s_[p_] == '-')) ++p_;
            if (!Digits()) return false;
        }
        return true;
    }

    const char* s_;
    size_t n_;
    size_t p_ = 0;
};

}  // namespace

size_t FindSyntaxError(const char* text, size_t len) {
    return SyntaxCheck(text, len).Run();
}

}  // namespace nlw_json

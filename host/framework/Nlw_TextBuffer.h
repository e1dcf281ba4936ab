// A block of text built from many small pieces. Appending is inline: a
// capacity check and a copy, which for a literal the compiler does with a
// few stores. std::string's append is a call for every piece, and writers
// that format several pieces per name and number spend most of their time
// there.
#pragma once

#include <cstddef>
#include <cstring>
#include <string>

class Nlw_TextBuffer {
public:
    void Append(const char* text, size_t len) {
        if (len_ + len > buf_.size()) Grow(len);
        std::memcpy(&buf_[len_], text, len);
        len_ += len;
    }
    Nlw_TextBuffer& operator+=(const char* text) {
        Append(text, std::strlen(text));
        return *this;
    }
    Nlw_TextBuffer& operator+=(const std::string& text) {
        Append(text.data(), text.size());
        return *this;
    }
    Nlw_TextBuffer& operator+=(const Nlw_TextBuffer& text) {
        Append(text.data(), text.size());
        return *this;
    }
    Nlw_TextBuffer& operator+=(char c) {
        if (len_ == buf_.size()) Grow(1);
        buf_[len_++] = c;
        return *this;
    }
    void Append(size_t count, char c) {
        if (len_ + count > buf_.size()) Grow(count);
        std::memset(&buf_[len_], c, count);
        len_ += count;
    }
    // Room for up to n more characters, written by the caller, then
    // Commit of how many were.
    char* Reserve(size_t n) {
        if (len_ + n > buf_.size()) Grow(n);
        return &buf_[len_];
    }
    void Commit(size_t n) { len_ += n; }

    const char* data() const { return buf_.data(); }
    size_t size() const { return len_; }
    bool empty() const { return len_ == 0; }
    void clear() { len_ = 0; }
    // Lets the storage go too.
    void Release() {
        std::string().swap(buf_);
        len_ = 0;
    }
    std::string str() const { return std::string(data(), size()); }
    void swap(Nlw_TextBuffer& other) {
        buf_.swap(other.buf_);
        std::swap(len_, other.len_);
    }

private:
    void Grow(size_t need) {
        size_t size = buf_.size() * 2;
        if (size < len_ + need) size = len_ + need;
        if (size < 256) size = 256;
        buf_.resize(size);
    }

    std::string buf_;  // its size is the capacity; len_ of it are the text
    size_t len_ = 0;
};

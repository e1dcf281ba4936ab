// Portability services: strings, files, streams, environment, installation
// roots, messages and formatted text.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

// printf-style formatting into a host buffer. The result stays valid until
// eight further calls have been made, so a few results may be combined in one
// expression (vorform("%s", vorform(...)) is safe). Never truncates.
const char* vorform(const char* format, ...)
#if defined(__GNUC__)
    __attribute__((format(printf, 1, 2)))
#endif
    ;
const char* vvorform(const char* format, va_list args);

// Appends printf-style text to a std::string.
void Port_AppendFormat(std::string& out, const char* format, ...)
#if defined(__GNUC__)
    __attribute__((format(printf, 2, 3)))
#endif
    ;
void Port_AppendFormatV(std::string& out, const char* format, va_list args);

namespace Port {

// The host string: a value type used where names pass by value.
template <typename C>
class StringBase {
public:
    enum CompareKind { CaseSensitive = 0, IgnoreCase = 1 };

    StringBase() = default;
    StringBase(const C* text) : s_(text ? text : "") {}
    StringBase(const std::basic_string<C>& text) : s_(text) {}
    StringBase(const C* text, size_t len) : s_(text, len) {}

    StringBase& operator=(const C* text) {
        s_ = text ? text : "";
        return *this;
    }
    StringBase& operator+=(const C* text) {
        if (text) s_ += text;
        return *this;
    }
    StringBase& operator+=(const StringBase& other) {
        s_ += other.s_;
        return *this;
    }
    StringBase& operator+=(C c) {
        s_ += c;
        return *this;
    }
    friend StringBase operator+(StringBase a, const StringBase& b) {
        a += b;
        return a;
    }
    bool operator==(const StringBase& o) const { return s_ == o.s_; }
    bool operator!=(const StringBase& o) const { return s_ != o.s_; }
    bool operator<(const StringBase& o) const { return s_ < o.s_; }

    const C* c_str() const { return s_.c_str(); }
    operator const C*() const { return s_.c_str(); }
    size_t length() const { return s_.size(); }
    size_t Length() const { return s_.size(); }
    bool empty() const { return s_.empty(); }
    C operator[](size_t i) const { return s_[i]; }
    const std::basic_string<C>& str() const { return s_; }
    std::basic_string<C>& str() { return s_; }

    // 0 when equal; kind IgnoreCase compares ignoring ASCII case.
    int Compare(const C* other, int kind = CaseSensitive) const;
    void MakeUpper();
    void MakeLower();
    void SetChar(size_t pos, C c) {
        if (pos < s_.size()) s_[pos] = c;
    }
    // The whole text read as an unsigned decimal number; 0 (and *ok false)
    // when it is not one or does not fit in 32 bits.
    uint32_t GetUINT32(bool* ok = nullptr) const;

    // Splits text at any of the separator characters. With skipEmpty, empty
    // pieces are dropped. A piece that begins with an open-quote character
    // runs to the close-quote character at the same position in closeQuotes,
    // separators included; the quotes are removed, text after the closing
    // quote up to the next separator still belongs to the piece, and a
    // quoted piece is kept even when empty. An unclosed quote runs to the end.
    static std::vector<StringBase> Split(const C* text, const C* separators, bool skipEmpty,
                                         const C* openQuotes, const C* closeQuotes);

private:
    std::basic_string<C> s_;
};

using String = StringBase<char>;

class Stream;

// An ordered list of directories.
class PathList {
public:
    size_t size() const { return dirs_.size(); }
    const char* operator[](size_t i) const { return dirs_[i].c_str(); }
    void push_back(const std::string& d) { dirs_.push_back(d); }

private:
    std::vector<std::string> dirs_;
};

// The installation roots. VORNIX, when set, lists them separated by ':'
// (an empty value gives an empty list). When it is unset the list is the
// default installation: the share directory beside the running program
// (../share relative to its directory) or, failing that, the share directory
// of the source tree the program was built from.
class VornixPath {
public:
    static const PathList& GetInstance();
    // Forgets the cached list so that the next GetInstance reads VORNIX again.
    static void Reset();

    // The installation lookups below try root/<relative> for each root that
    // exists and is a directory, in the list's order; the other roots are
    // passed over.
    // The first such path that is a directory; "" when no root holds one.
    static std::string FindDirectory(const char* relative);
    // Opens for reading the first such path that is a file and can be
    // opened. Returns false when none can.
    static bool OpenFile(const char* relative, Stream& stream);
};

class Stream {
public:
    enum Access {
        Read = 1,
        Create = 2,   // a new file; an existing file is an error and is kept
        Replace = 3,  // a new file or a replacement of an existing one
        Memory = 4,   // no file: text is collected in memory (tests)
    };

    explicit Stream(int access = Read, size_t bufferSize = 4096);
    ~Stream();
    Stream(const Stream&) = delete;
    Stream& operator=(const Stream&) = delete;

    bool isOpen() const { return fp_ != nullptr; }
    // Reads the next line without its line end ("\n" or "\r\n") into buffer
    // (at most size-1 characters; the rest of a longer line is returned by
    // the next calls). Returns 0 at the end of the file, and when size is
    // below 2, 1 otherwise.
    int readline(char* buffer, int size);
    // Reads the next whole line without its line end. Returns false at the
    // end, and for a line longer than File::kMaxLine, which is reported as
    // an error naming the file and line and ends the reading.
    bool readline(std::string& line);
    void close();

private:
    friend class File;
    // The next character of the file, or EOF; Peek looks without consuming
    // (up to one character beyond the next).
    int Get();
    int Peek(size_t ahead = 0);
    bool Fill();

    FILE* fp_ = nullptr;
    std::vector<char> buf_;
    size_t pos_ = 0;
    size_t len_ = 0;
    std::string path_;  // for messages
    size_t lineNo_ = 0;
};

class File {
public:
    static bool exist(const char* path);
    static bool isdir(const char* path);
    // Opens a file for reading into stream. Returns false when it cannot
    // (a directory cannot be opened). Installation data is read through
    // here: only a regular file of at most kMaxDataSize bytes is opened
    // (never waiting on a fifo); any other is reported as an error naming
    // it, so that a link to /dev/zero cannot make a run grow without end.
    static bool open(const char* path, Stream& stream, int flag = 0);
    // Reads a whole file, with the same limits. Returns false (and sets
    // error) when it cannot.
    static bool readAll(const char* path, std::string& content, std::string* error = nullptr);

    static constexpr size_t kMaxDataSize = size_t(64) << 20;
    static constexpr size_t kMaxLine = size_t(1) << 20;
};

class FileName {
public:
    explicit FileName(const char* path) : path_(path ? path : "") {}
    // The directory part including its final separator, or "".
    const char* GetPath();
    static const char* GetPathSeparator() { return "/"; }

private:
    std::string path_;
    std::string dir_;
};

}  // namespace Port

class Port_Env {
public:
    // The value, or null when the variable is not set.
    static const char* GetEnv(const char* name);
    // The path of a shipped data file: the first installation root holding
    // data/<name>. Null when none does.
    static const char* GetDataFileName(const char* name, int flag);
    static bool IsNt() { return false; }
};

// Message levels, in the order of their severity.
enum class Port_MsgLevel { Debug, Status, Info, Warning, Error, Internal };

// The tag of a level in message lines: "WARNING", "INTERNAL_ERROR", ...
const char* Port_MsgLevelName(Port_MsgLevel level);

// One message as issued: level, domain and the formatted text.
struct Port_Msg {
    Port_MsgLevel level;
    std::string domain;
    std::string text;
};

// Receives every message the manager lets through.
class Port_MsgSink {
public:
    virtual ~Port_MsgSink() = default;
    virtual void Receive(const Port_Msg& msg) = 0;
};

// The process-wide message manager: counts messages per level and hands them
// to its sinks (console, log file, test capture).
class Port_MsgManager {
public:
    static Port_MsgManager& Instance();

    void Issue(Port_MsgLevel level, const char* domain, const std::string& text);
    int GetCount(Port_MsgLevel level) const { return counts_[static_cast<int>(level)]; }
    void ResetCounts();

    // Console presentation: status lines are dropped when quiet; debug lines
    // are shown only when debug is on.
    void SetQuiet(bool quiet) { quiet_ = quiet; }
    void SetDebug(bool debug) { debug_ = debug; }
    bool GetDebug() const { return debug_; }
    void SetConsole(bool on) { console_ = on; }
    // Copies every message to a log file. Returns false when it cannot be opened.
    bool OpenLog(const char* path);
    void CloseLog();

    void AddSink(Port_MsgSink* sink);
    void RemoveSink(Port_MsgSink* sink);
    // Flushes the console streams and the log file.
    void Flush();

private:
    void ShowOnConsole(Port_MsgLevel level, const char* domain, const std::string& text);
    void WriteToLog(Port_MsgLevel level, const char* domain, const std::string& text);

    int counts_[6] = {0, 0, 0, 0, 0, 0};
    bool quiet_ = false;
    bool debug_ = false;
    bool console_ = true;
    FILE* log_ = nullptr;
    std::vector<Port_MsgSink*> sinks_;
};

// Collects messages while it lives (tests).
class Port_MsgCapture : public Port_MsgSink {
public:
    Port_MsgCapture();
    ~Port_MsgCapture() override;
    void Receive(const Port_Msg& msg) override { msgs.push_back(msg); }
    // The texts of the messages of one level, in order.
    std::vector<std::string> Texts(Port_MsgLevel level) const;
    std::vector<Port_Msg> msgs;
};

// Keeps the messages one thread issues, in order, instead of issuing them:
// work done on a second thread reports through one, and Replay issues its
// messages where the same work done in order would have put them.
class Port_MsgDeferral {
public:
    Port_MsgDeferral() = default;
    ~Port_MsgDeferral();
    Port_MsgDeferral(const Port_MsgDeferral&) = delete;
    Port_MsgDeferral& operator=(const Port_MsgDeferral&) = delete;
    // Keep the calling thread's messages from now on, until Stop.
    void Keep();
    void Stop();
    // Issues the kept messages (once the keeping thread has stopped).
    void Replay();

private:
    friend class Port_MsgManager;
    std::vector<Port_Msg> kept_;
    Port_MsgDeferral* outer_ = nullptr;
    bool keeping_ = false;
};

// A message source: created for a domain, then issues printf-style messages.
class Port_MsgManData {
public:
    static Port_MsgManData createObject(const char* domain, const char* source = "", int line = 0,
                                        const char* revision = "");
    void issueStatus(const char* format, ...);
    void issueInfo(const char* format, ...);
    void issueWarning(const char* format, ...);
    void issueError(const char* format, ...);
    void issueInternal(const char* format, ...);
    // A trace on the debug channel.
    static void debugStub(const char* format, ...);

private:
    explicit Port_MsgManData(const char* domain) : domain_(domain ? domain : "") {}
    std::string domain_;
};

// Shorthand used by the writers: a message source of the writers' domain.
#define NLW_MSG() Port_MsgManData::createObject("NetListWriters", __FILE__, __LINE__, "")

class Port_MsgDispatcher {
public:
    // Ends the program with the exit code after flushing the message sinks.
    [[noreturn]] static void exit(int code);
};

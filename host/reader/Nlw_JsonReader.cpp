// Loading a netlist JSON file: reading, parsing, and the steps that turn
// the document into a view. Every fault of the input ends the load with one
// error message that names the file.
#include "reader/Nlw_JsonReader.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <new>

#include "port/Port.h"
#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

void Fail(std::string text) {
    throw ReadError{std::move(text)};
}

const char* ConstName(int32_t ref) {
    switch (ref) {
        case kConst0:
            return "1'b0";
        case kConst1:
            return "1'b1";
        case kConstX:
            return "1'bx";
        default:
            return "1'bz";
    }
}

Text TextPool::Keep(std::string_view s) {
    // Texts are kept NUL-terminated: a NUL inside would cut the name, and
    // two names could merge.
    if (const void* nul = std::memchr(s.data(), '\0', s.size()))
        Fail("the name or text \"" +
             std::string(s.substr(0, static_cast<const char*>(nul) - s.data())) +
             "\\u0000...\" holds a NUL character");
    const size_t need = s.size() + 1;
    if (need > left_) {
        const size_t size = std::max<size_t>(need, size_t(1) << 20);
        chunks_.emplace_back(new char[size]);
        cur_ = chunks_.back().get();
        left_ = size;
    }
    char* out = cur_;
    std::memcpy(out, s.data(), s.size());
    out[s.size()] = '\0';
    cur_ += need;
    left_ -= need;
    return out;
}

void Design::ReleaseDocument() {
    for (Module& m : modules) {
        m.name = m.nameText;
        m.json = simdjson::dom::object();
        std::unordered_map<std::string_view, uint32_t>().swap(m.portIndex);
    }
    for (LibType& lt : types) std::unordered_map<std::string_view, uint32_t>().swap(lt.pinIndex);
    std::unordered_map<std::string_view, uint32_t>().swap(moduleIndex);
    std::unordered_map<std::string_view, uint32_t>().swap(typeIndex);
    root = simdjson::dom::element();
    parser = simdjson::dom::parser();
    scratch = NameScratch();
}

namespace {

// The text of a file followed by the padding the parser may read past its
// end. A regular file is mapped rather than copied: the pages come straight
// from the file cache, which saves a copy and fresh memory of the file's
// size.
class Input {
public:
    Input() = default;
    Input(const Input&) = delete;
    Input& operator=(const Input&) = delete;
    ~Input() { Release(); }

    bool ReadFile(const char* fileName, std::string& reason) {
        int fd = ::open(fileName, O_RDONLY | O_CLOEXEC);
        if (fd < 0) {
            reason = std::strerror(errno);
            return false;
        }
        struct stat st;
        bool ok;
        if (::fstat(fd, &st) != 0) {
            reason = std::strerror(errno);
            ok = false;
        } else if (S_ISDIR(st.st_mode)) {
            reason = std::strerror(EISDIR);
            ok = false;
        } else {
            ok = (S_ISREG(st.st_mode) && st.st_size > 0 && Map(fd, size_t(st.st_size))) ||
                 ReadAll(fd, reason);
        }
        ::close(fd);
        return ok;
    }

    void Copy(const std::string& text) { copy_ = simdjson::padded_string(text); }

    const char* data() const { return map_ ? static_cast<const char*>(map_) : copy_.data(); }
    size_t size() const { return map_ ? size_ : copy_.size(); }

    void Release() {
        if (map_) ::munmap(map_, mapLength_);
        map_ = nullptr;
        copy_ = simdjson::padded_string();
    }

private:
    bool Map(int fd, size_t size) {
        const size_t page = static_cast<size_t>(::sysconf(_SC_PAGESIZE));
        const size_t length = (size + simdjson::SIMDJSON_PADDING + page - 1) / page * page;
        // Zero pages over the whole length first, then the file over its
        // start: the padding after the file reads as zeros.
        void* base = ::mmap(nullptr, length, PROT_READ, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
        if (base == MAP_FAILED) return false;
        void* file = ::mmap(base, size, PROT_READ, MAP_PRIVATE | MAP_FIXED | MAP_POPULATE, fd, 0);
        if (file == MAP_FAILED) {
            ::munmap(base, length);
            return false;
        }
        map_ = base;
        mapLength_ = length;
        size_ = size;
        return true;
    }

    bool ReadAll(int fd, std::string& reason) {
        std::string text;
        char buf[1 << 16];
        for (;;) {
            ssize_t n = ::read(fd, buf, sizeof buf);
            if (n == 0) break;
            if (n < 0) {
                if (errno == EINTR) continue;
                reason = std::strerror(errno);
                return false;
            }
            text.append(buf, static_cast<size_t>(n));
        }
        Copy(text);
        return true;
    }

    void* map_ = nullptr;
    size_t mapLength_ = 0;
    size_t size_ = 0;
    simdjson::padded_string copy_;
};

// "line L, column C" of a byte offset, for the reader of the message.
std::string Position(const char* text, size_t len, size_t offset) {
    size_t line = 1, col = 1;
    for (size_t i = 0; i < offset && i < len; ++i) {
        if (text[i] == '\n') {
            ++line;
            col = 1;
        } else {
            ++col;
        }
    }
    return "line " + std::to_string(line) + ", column " + std::to_string(col);
}

void Parse(Design& d, const Input& text) {
    simdjson::error_code err =
        d.parser.parse(reinterpret_cast<const uint8_t*>(text.data()), text.size(), false)
            .get(d.root);
    if (!err) return;
    std::string what = simdjson::error_message(err);
    size_t at = FindSyntaxError(text.data(), text.size());
    if (at != std::string::npos)
        Fail("malformed JSON at byte offset " + std::to_string(at) + " (" +
             Position(text.data(), text.size(), at) + "): " + what);
    Fail("malformed JSON: " + what);
}

bool Run(Design& d, Input& text, Nlw_NlView& view, std::unique_ptr<Nlw_Design>& design) {
    try {
        Parse(d, text);
        // The document holds its own copy of every string; the text can go.
        text.Release();
        ReadModuleList(d);
        ResolveHierarchy(d);
        d.ReleaseDocument();
        if (d.options.flatten)
            BuildFlat(d, view);
        else
            BuildUnfolded(d, view);
        ConnectOpenOutputs(view);
        design = std::make_unique<Nlw_Design>(d.modules[d.top].nameText);
        return true;
    } catch (const ReadError& e) {
        NLW_MSG().issueError("%s: %s\n", d.File(), e.text.c_str());
    } catch (const std::bad_alloc&) {
        NLW_MSG().issueError("%s: not enough memory to load the design\n", d.File());
    }
    return false;
}

}  // namespace

}  // namespace nlw_json

bool Nlw_JsonReader::Load(const char* fileName, const Nlw_ReadOptions& options, Nlw_NlView& view,
                          std::unique_ptr<Nlw_Design>& design) {
    auto d = std::make_unique<nlw_json::Design>();
    d->fileName = fileName ? fileName : "";
    d->options = options;
    nlw_json::Input text;
    std::string reason;
    if (!text.ReadFile(d->File(), reason)) {
        NLW_MSG().issueError("%s: cannot read the file: %s\n", d->File(), reason.c_str());
        return false;
    }
    return nlw_json::Run(*d, text, view, design);
}

bool Nlw_JsonReader::LoadText(const std::string& text, const char* fileName,
                              const Nlw_ReadOptions& options, Nlw_NlView& view,
                              std::unique_ptr<Nlw_Design>& design) {
    auto d = std::make_unique<nlw_json::Design>();
    d->fileName = fileName ? fileName : "";
    d->options = options;
    nlw_json::Input padded;
    padded.Copy(text);
    return nlw_json::Run(*d, padded, view, design);
}

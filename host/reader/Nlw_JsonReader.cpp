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
#include <memory>
#include <new>
#include <system_error>
#include <thread>

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
        m.json = simdjson::dom::object();
        std::unordered_map<std::string_view, uint32_t>().swap(m.portIndex);
    }
    for (LibType& lt : types) std::unordered_map<std::string_view, uint32_t>().swap(lt.pinIndex);
    std::unordered_map<std::string_view, uint32_t>().swap(moduleIndex);
    std::unordered_map<std::string_view, uint32_t>().swap(typeIndex);
    parser = simdjson::dom::parser();
    scratch = NameScratch();
    threadScratch = NameScratch();
}

namespace {

// The text of a file followed by the padding the parser may read past its
// end. The file is read, not mapped: a mapped file that someone truncates
// while it is parsed ends the process with SIGBUS, a read one gives an
// error. Only a regular file is read, so that its size is known before and
// checked after: /dev/zero or a fifo cannot make the load grow without end.
//
// A large text is allocated in whole model chunks, so that once it is read
// it can be handed to the model (see Nlw_NlArena::Donate): the model is
// built in the pages the text has touched already.
class Input {
public:
    bool ReadFile(const char* fileName, std::string& reason) {
        int fd = ::open(fileName, O_RDONLY | O_CLOEXEC | O_NONBLOCK);
        if (fd < 0) {
            reason = std::strerror(errno);
            return false;
        }
        bool ok = Read(fd, reason);
        ::close(fd);
        return ok;
    }

    void Copy(const std::string& text) {
        Allocate(text.size());
        if (!text.empty()) std::memcpy(region_.get(), text.data(), text.size());
    }

    const char* data() const { return region_.get(); }
    size_t size() const { return size_; }
    // Lets the text go: to the model's arenas when it is large enough to
    // serve them.
    void Release() {
        if (capacity_ >= kDonateFrom) Nlw_NlArena::Donate(std::move(region_), capacity_);
        region_.reset();
    }

private:
    static constexpr size_t kDonateFrom = 8 * Nlw_NlArena::kChunk;

    void Allocate(size_t size) {
        const size_t align = size >= kDonateFrom ? Nlw_NlArena::kChunk : 64;
        const size_t capacity = (size + simdjson::SIMDJSON_PADDING + align - 1) / align * align;
        char* p = static_cast<char*>(std::aligned_alloc(align, capacity));
        if (p == nullptr) throw std::bad_alloc();
        region_ = std::shared_ptr<char>(p, [](char* c) { std::free(c); });
        std::memset(region_.get() + size, 0, capacity - size);
        size_ = size;
        capacity_ = capacity;
    }

    static constexpr int kShort = -1;

    // Reads [begin, end) of the file into place; 0, errno or kShort. Fresh pages
    // are made in one call before they are filled, which costs about half
    // as much as one fault per page; the advice is new (Linux 5.14), and
    // without it the read makes them.
    int ReadRange(int fd, size_t begin, size_t end) {
        char* at = region_.get();
#if defined(MADV_POPULATE_WRITE)
        const size_t page = static_cast<size_t>(::sysconf(_SC_PAGESIZE));
        const size_t first = (reinterpret_cast<uintptr_t>(at + begin) + page - 1) / page * page;
        const size_t last = reinterpret_cast<uintptr_t>(at + end) / page * page;
        if (end - begin >= kDonateFrom && last > first)
            ::madvise(reinterpret_cast<void*>(first), last - first, MADV_POPULATE_WRITE);
#endif
        while (begin < end) {
            ssize_t n = ::pread(fd, at + begin, end - begin, static_cast<off_t>(begin));
            if (n < 0 && errno == EINTR) continue;
            if (n < 0) return errno;
            if (n == 0) return kShort;  // the file is shorter than it was
            begin += static_cast<size_t>(n);
        }
        return 0;
    }

    bool Read(int fd, std::string& reason) {
        struct stat before, after;
        if (::fstat(fd, &before) != 0) {
            reason = std::strerror(errno);
            return false;
        }
        if (S_ISDIR(before.st_mode)) {
            reason = std::strerror(EISDIR);
            return false;
        }
        if (!S_ISREG(before.st_mode)) {
            reason = "not a regular file; the design is read from a file whose size is known";
            return false;
        }
        const size_t size = static_cast<size_t>(before.st_size);
        Allocate(size);
        // A large file is read as two halves at once: making and filling
        // fresh pages is most of the cost, and the halves do it in parallel.
        size_t half = size >= 4 * kDonateFrom ? size / 2 / kDonateFrom * kDonateFrom : size;
        int secondError = 0;
        std::thread second;
        if (half < size) {
            try {
                second = std::thread([&, half] { secondError = ReadRange(fd, half, size); });
            } catch (const std::system_error&) {
                half = size;  // no thread to be had: one reader does it all
            }
        }
        int error = ReadRange(fd, 0, half);
        if (second.joinable()) second.join();
        if (error == 0) error = secondError;
        if (error != 0 && error != kShort) {
            reason = std::strerror(error);
            return false;
        }
        if (error == kShort || ::fstat(fd, &after) != 0 || after.st_size != before.st_size ||
            after.st_mtim.tv_sec != before.st_mtim.tv_sec ||
            after.st_mtim.tv_nsec != before.st_mtim.tv_nsec) {
            reason = "the file changed while it was read";
            return false;
        }
        return true;
    }

    std::shared_ptr<char> region_;
    size_t size_ = 0;
    size_t capacity_ = 0;
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

}  // namespace

void FailParse(const Design& d, simdjson::error_code err) {
    if (err == simdjson::MEMALLOC) throw std::bad_alloc();
    std::string what = simdjson::error_message(err);
    size_t at = FindSyntaxError(d.text, d.textLen);
    // A number the syntax allows that the parser still refuses does not fit
    // in 64 bits.
    if (at == std::string::npos &&
        (err == simdjson::NUMBER_ERROR || err == simdjson::NUMBER_OUT_OF_RANGE))
        Fail("number out of range: a number in the file does not fit in 64 bits");
    if (at != std::string::npos)
        Fail("malformed JSON at byte offset " + std::to_string(at) + " (" +
             Position(d.text, d.textLen, at) + "): " + what);
    Fail("malformed JSON: " + what);
}

namespace {

bool Run(Design& d, Input& text, Nlw_NlView& view, std::unique_ptr<Nlw_Design>& design) {
    try {
        d.text = text.data();
        d.textLen = text.size();
        ReadModuleList(d);
        ResolveHierarchy(d);
        // The digests hold their own copy of every text they need.
        d.ReleaseDocument();
        d.text = nullptr;
        d.textLen = 0;
        text.Release();
        CheckUnfoldedSize(d);
        if (d.options.flatten)
            BuildFlat(d, view);
        else
            BuildUnfolded(d, view);
        Nlw_NlArena::DropDonations();
        ConnectOpenOutputs(view);
        design = std::make_unique<Nlw_Design>(d.modules[d.top].nameText);
        return true;
    } catch (const ReadError& e) {
        Nlw_NlArena::DropDonations();
        NLW_MSG().issueError("%s: %s\n", d.File(), e.text.c_str());
    } catch (const std::bad_alloc&) {
        Nlw_NlArena::DropDonations();
        NLW_MSG().issueError(
            "%s: out of memory: the design does not fit in the memory of this "
            "machine\n",
            d.File());
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

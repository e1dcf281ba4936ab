// Files, streams, path names, the installation roots and the environment.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstdlib>
#include <cstring>
#include <set>
#include <string>

#include "port/Port.h"

#ifndef NLW_SOURCE_SHARE_DIR
#define NLW_SOURCE_SHARE_DIR "share"
#endif
#ifndef NLW_SHARE_FROM_BIN
#define NLW_SHARE_FROM_BIN "../share/nlw_verilog"
#endif

namespace Port {

// ---- Stream --------------------------------------------------------------

Stream::Stream(int access, size_t bufferSize) : buf_(bufferSize >= 2 ? bufferSize : 4096) {
    (void)access;  // streams are opened for reading only
}

Stream::~Stream() {
    close();
}

void Stream::close() {
    if (fp_) std::fclose(fp_);
    fp_ = nullptr;
    pos_ = len_ = 0;
}

bool Stream::Fill() {
    // Keeps the characters not yet consumed and reads behind them, so that a
    // look two characters ahead works across a buffer boundary.
    if (!fp_) return false;
    size_t keep = len_ - pos_;
    if (keep > 0 && pos_ > 0) std::memmove(buf_.data(), buf_.data() + pos_, keep);
    pos_ = 0;
    len_ = keep;
    len_ += std::fread(buf_.data() + keep, 1, buf_.size() - keep, fp_);
    return len_ > keep;
}

int Stream::Get() {
    if (pos_ == len_ && !Fill()) return EOF;
    return static_cast<unsigned char>(buf_[pos_++]);
}

int Stream::Peek(size_t ahead) {
    if (pos_ + ahead >= len_ && !Fill()) return EOF;
    if (pos_ + ahead >= len_) return EOF;
    return static_cast<unsigned char>(buf_[pos_ + ahead]);
}

int Stream::readline(char* buffer, int size) {
    // Room for at least one character and the terminator; anything smaller
    // could never make progress.
    if (!buffer || size < 2 || !fp_) {
        if (buffer && size > 0) buffer[0] = '\0';
        return 0;
    }
    if (Peek() == EOF) {
        buffer[0] = '\0';
        return 0;
    }
    const size_t room = static_cast<size_t>(size) - 1;
    size_t n = 0;
    for (;;) {
        int c = Get();
        if (c == EOF || c == '\n') break;
        if (c == '\r' && Peek() == '\n') {
            Get();
            break;
        }
        buffer[n++] = static_cast<char>(c);
        if (n == room) {
            // A piece that fills the buffer right up to the line end takes
            // the line end with it, so the next call does not see a
            // spurious empty line.
            int next = Peek();
            if (next == '\n') {
                Get();
            } else if (next == '\r' && Peek(1) == '\n') {
                Get();
                Get();
            }
            break;
        }
    }
    buffer[n] = '\0';
    return 1;
}

bool Stream::readline(std::string& line) {
    line.clear();
    if (!fp_ || Peek() == EOF) return false;
    ++lineNo_;
    bool atEnd = false;
    for (;;) {
        if (line.size() > File::kMaxLine) break;
        // Copy runs of ordinary characters straight from the buffer.
        if (pos_ == len_ && !Fill()) {
            atEnd = true;  // the last line has no line end
            break;
        }
        const char* start = buf_.data() + pos_;
        const char* end = buf_.data() + len_;
        const char* nl = static_cast<const char*>(std::memchr(start, '\n', end - start));
        if (!nl) {
            line.append(start, end);
            pos_ = len_;
            continue;
        }
        line.append(start, nl);
        pos_ += static_cast<size_t>(nl - start) + 1;
        break;
    }
    if (line.size() > File::kMaxLine) {
        NLW_MSG().issueError("Cannot read file '%s': line %zu is longer than %zu bytes.\n",
                             path_.c_str(), lineNo_, File::kMaxLine);
        close();
        line.clear();
        return false;
    }
    if (!atEnd && !line.empty() && line.back() == '\r') line.pop_back();
    return true;
}

// ---- File ----------------------------------------------------------------

bool File::exist(const char* path) {
    struct stat st;
    return path && *path && ::stat(path, &st) == 0;
}

bool File::isdir(const char* path) {
    struct stat st;
    return path && *path && ::stat(path, &st) == 0 && S_ISDIR(st.st_mode);
}

namespace {

// Opens path for reading when it is a regular file of at most the data size
// limit; a fifo does not stall the open. Returns the descriptor, or -1 with
// reason set; refused tells a file that exists but may not be read (as
// opposed to one that is missing or unreadable).
int OpenData(const char* path, std::string& reason, bool& refused) {
    refused = false;
    int fd = ::open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (fd < 0) {
        reason = std::strerror(errno);
        return -1;
    }
    struct stat st;
    if (::fstat(fd, &st) != 0) {
        reason = std::strerror(errno);
    } else if (S_ISDIR(st.st_mode)) {
        reason = std::strerror(EISDIR);
    } else if (!S_ISREG(st.st_mode)) {
        reason = "not a regular file";
        refused = true;
    } else if (static_cast<unsigned long long>(st.st_size) > File::kMaxDataSize) {
        reason = "larger than the limit of " + std::to_string(File::kMaxDataSize >> 20) +
                 " MiB for installation data";
        refused = true;
    } else {
        ::fcntl(fd, F_SETFL, ::fcntl(fd, F_GETFL) & ~O_NONBLOCK);
        return fd;
    }
    ::close(fd);
    return -1;
}

}  // namespace

bool File::open(const char* path, Stream& stream, int flag) {
    (void)flag;
    stream.close();
    if (!path) return false;
    std::string reason;
    bool refused;
    int fd = OpenData(path, reason, refused);
    if (fd < 0) {
        if (refused) NLW_MSG().issueError("Cannot read file '%s': %s.\n", path, reason.c_str());
        return false;
    }
    stream.fp_ = ::fdopen(fd, "rb");
    if (!stream.fp_) {
        ::close(fd);
        return false;
    }
    stream.path_ = path;
    stream.lineNo_ = 0;
    return true;
}

bool File::readAll(const char* path, std::string& content, std::string* error) {
    content.clear();
    if (!path) {
        if (error) *error = "no file name";
        return false;
    }
    std::string reason;
    bool refused;
    int fd = OpenData(path, reason, refused);
    if (fd < 0) {
        if (error) *error = reason;
        return false;
    }
    char chunk[65536];
    for (;;) {
        ssize_t n = ::read(fd, chunk, sizeof chunk);
        if (n == 0) break;
        if (n < 0) {
            if (errno == EINTR) continue;
            if (error) *error = std::strerror(errno);
            ::close(fd);
            return false;
        }
        content.append(chunk, static_cast<size_t>(n));
        if (content.size() > kMaxDataSize) {  // it grew while being read
            if (error) *error = "larger than the limit for installation data";
            ::close(fd);
            content.clear();
            return false;
        }
    }
    ::close(fd);
    return true;
}

// ---- FileName ------------------------------------------------------------

const char* FileName::GetPath() {
    size_t slash = path_.rfind('/');
    dir_ = slash == std::string::npos ? std::string() : path_.substr(0, slash + 1);
    return dir_.c_str();
}

// ---- VornixPath ----------------------------------------------------------

namespace {

// Lists handed out stay valid for the whole process, even across Reset,
// because callers keep references to them.
struct RootCache {
    std::vector<std::unique_ptr<PathList>> retired;
    std::unique_ptr<PathList> current;
};

RootCache& Roots() {
    static RootCache cache;
    return cache;
}

// The installation that belongs to the running program, found relative to
// the program's own folder so that a moved installation keeps working.
std::string InstalledShare() {
    char exe[PATH_MAX + 1];
    ssize_t n = ::readlink("/proc/self/exe", exe, PATH_MAX);
    if (n <= 0) return std::string();
    exe[n] = '\0';
    std::string dir(exe);
    size_t slash = dir.rfind('/');
    if (slash == std::string::npos) return std::string();
    std::string share = dir.substr(0, slash) + "/" + NLW_SHARE_FROM_BIN;
    if (!File::isdir((share + "/verilog/src").c_str())) return std::string();
    // Names of the installation appear in written files; show them without
    // the "..".
    if (char* real = ::realpath(share.c_str(), nullptr)) {
        share = real;
        std::free(real);
    }
    return share;
}

std::unique_ptr<PathList> ReadRoots() {
    auto list = std::make_unique<PathList>();
    if (const char* vornix = std::getenv("VORNIX")) {
        std::string v(vornix);
        size_t start = 0;
        while (start <= v.size()) {
            size_t colon = v.find(':', start);
            if (colon == std::string::npos) colon = v.size();
            if (colon > start) list->push_back(v.substr(start, colon - start));
            start = colon + 1;
        }
        return list;
    }
    std::string share = InstalledShare();
    list->push_back(share.empty() ? std::string(NLW_SOURCE_SHARE_DIR) : share);
    return list;
}

}  // namespace

const PathList& VornixPath::GetInstance() {
    RootCache& cache = Roots();
    if (!cache.current) cache.current = ReadRoots();
    return *cache.current;
}

void VornixPath::Reset() {
    RootCache& cache = Roots();
    if (cache.current) cache.retired.push_back(std::move(cache.current));
}

namespace {

// root/<relative> for the root, or "" when the root is not an existing
// directory.
std::string UnderRoot(const char* root, const char* relative) {
    if (!File::exist(root) || !File::isdir(root)) return std::string();
    std::string path = root;
    path += '/';
    path += relative ? relative : "";
    return path;
}

}  // namespace

std::string VornixPath::FindDirectory(const char* relative) {
    const PathList& roots = GetInstance();
    for (size_t i = 0; i < roots.size(); ++i) {
        std::string path = UnderRoot(roots[i], relative);
        if (!path.empty() && File::exist(path.c_str()) && File::isdir(path.c_str())) return path;
    }
    return std::string();
}

bool VornixPath::OpenFile(const char* relative, Stream& stream) {
    const PathList& roots = GetInstance();
    for (size_t i = 0; i < roots.size(); ++i) {
        std::string path = UnderRoot(roots[i], relative);
        if (!path.empty() && File::exist(path.c_str()) && !File::isdir(path.c_str()) &&
            File::open(path.c_str(), stream, 0))
            return true;
    }
    return false;
}

}  // namespace Port

// ---- Port_Env ------------------------------------------------------------

const char* Port_Env::GetEnv(const char* name) {
    return name ? std::getenv(name) : nullptr;
}

const char* Port_Env::GetDataFileName(const char* name, int flag) {
    (void)flag;
    if (!name || !*name) return nullptr;
    // Returned names live as long as the process; each distinct name is
    // stored once.
    static std::set<std::string> names;
    const Port::PathList& roots = Port::VornixPath::GetInstance();
    for (size_t i = 0; i < roots.size(); ++i) {
        std::string candidate = std::string(roots[i]) + "/data/" + name;
        if (Port::File::exist(candidate.c_str()) && !Port::File::isdir(candidate.c_str()))
            return names.insert(candidate).first->c_str();
    }
    return nullptr;
}

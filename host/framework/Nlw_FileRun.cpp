// A run's files put into place all together, exclusive temporaries and their
// removal on signals.
#include "framework/Nlw_FileRun.h"

#include <fcntl.h>
#include <signal.h>
#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>

#include "port/Port.h"

// ---- The temporaries a signal removes --------------------------------------

namespace {

// A list the signal handler may walk at any moment: nodes are only ever
// added at the head and never freed; a node is reused by first marking it
// dead, then changing its name, then marking it live again. The process has
// one thread, so the handler only ever interrupts these steps, never runs
// beside them.
struct TempNode {
    char* path = nullptr;
    size_t capacity = 0;
    volatile sig_atomic_t live = 0;
    TempNode* next = nullptr;
};

TempNode* volatile g_head = nullptr;
struct sigaction g_previous[3];
const int kSignals[3] = {SIGINT, SIGTERM, SIGHUP};

void RemoveLive() {
    for (TempNode* n = g_head; n; n = n->next)
        if (n->live) ::unlink(n->path);
}

void OnSignal(int sig) {
    RemoveLive();
    // Then end as the signal would have: with its default action.
    for (int i = 0; i < 3; ++i)
        if (kSignals[i] == sig) ::sigaction(sig, &g_previous[i], nullptr);
    ::signal(sig, SIG_DFL);
    ::raise(sig);
}

void InstallHandlers() {
    static bool installed = false;
    if (installed) return;
    installed = true;
    for (int i = 0; i < 3; ++i) {
        struct sigaction now;
        ::sigaction(kSignals[i], nullptr, &g_previous[i]);
        // A signal the caller chose to ignore (nohup) stays ignored.
        if (g_previous[i].sa_handler == SIG_IGN) continue;
        std::memset(&now, 0, sizeof now);
        now.sa_handler = OnSignal;
        sigemptyset(&now.sa_mask);
        for (int s : kSignals) sigaddset(&now.sa_mask, s);
        ::sigaction(kSignals[i], &now, nullptr);
    }
    // An exit in the middle of a run (a fatal message) leaves none behind
    // either.
    std::atexit(RemoveLive);
}

void Track(const std::string& name) {
    InstallHandlers();
    TempNode* node = nullptr;
    for (TempNode* n = g_head; n && !node; n = n->next)
        if (!n->live) node = n;
    if (!node) {
        node = new TempNode;
        node->next = g_head;
        g_head = node;
    }
    if (node->capacity < name.size() + 1) {
        char* old = node->path;
        node->path = static_cast<char*>(std::malloc(name.size() + 1));
        node->capacity = name.size() + 1;
        std::free(old);
    }
    std::memcpy(node->path, name.c_str(), name.size() + 1);
    node->live = 1;
}

void Untrack(const std::string& name) {
    for (TempNode* n = g_head; n; n = n->next)
        if (n->live && name == n->path) {
            n->live = 0;
            return;
        }
}

}  // namespace

int Nlw_TempFile::Create(const std::string& target, mode_t mode, std::string& tempName) {
    const std::string stem = target + ".tmp" + std::to_string(static_cast<long>(::getpid()));
    for (unsigned attempt = 0; attempt < 1000; ++attempt) {
        tempName = attempt == 0 ? stem : stem + "." + std::to_string(attempt);
        // Registered before it exists, so that no signal can come between
        // making the file and knowing it.
        Track(tempName);
        int fd =
            ::open(tempName.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, mode);
        if (fd >= 0) return fd;
        const int err = errno;
        Untrack(tempName);
        if (err != EEXIST) {
            tempName.clear();
            errno = err;
            return -1;
        }
        // Someone's file, or a link planted at the name: left alone.
    }
    tempName.clear();
    errno = EEXIST;
    return -1;
}

void Nlw_TempFile::Remove(const std::string& tempName) {
    if (tempName.empty()) return;
    ::unlink(tempName.c_str());
    Untrack(tempName);
}

void Nlw_TempFile::Forget(const std::string& tempName) {
    Untrack(tempName);
}

void Nlw_TempFile::Keep(const std::string& name) {
    Track(name);
}

int Nlw_TempFile::Place(const std::string& temp, const std::string& target, bool createOnly) {
    if (!createOnly) return ::rename(temp.c_str(), target.c_str()) == 0 ? 0 : errno;
#ifdef RENAME_NOREPLACE
    if (::renameat2(AT_FDCWD, temp.c_str(), AT_FDCWD, target.c_str(), RENAME_NOREPLACE) == 0)
        return 0;
    if (errno != EINVAL && errno != ENOSYS && errno != EPERM) return errno;
#endif
    // A file system without the exclusive rename: a link is just as
    // exclusive.
    if (::link(temp.c_str(), target.c_str()) != 0) return errno;
    ::unlink(temp.c_str());
    return 0;
}

// ---- Runs ------------------------------------------------------------------

namespace {
Nlw_FileRun* g_current = nullptr;
}

Nlw_FileRun::Nlw_FileRun() {
    if (g_current) {
        joined_ = true;
        return;
    }
    g_current = this;
}

Nlw_FileRun::~Nlw_FileRun() {
    if (joined_) return;
    if (!done_) Abandon();
    g_current = nullptr;
}

Nlw_FileRun* Nlw_FileRun::Current() {
    return g_current;
}

void Nlw_FileRun::Add(const std::string& fileName, const std::string& temp,
                      const std::string& target, bool createOnly) {
    // A file written again in the same run (the passes of the assertion
    // file, timing files of blocks of one type): the later text wins, as it
    // would have had each been placed at once.
    for (Pending& p : files_)
        if (p.target == target) {
            Nlw_TempFile::Remove(p.temp);
            p.temp = temp;
            return;
        }
    Pending p;
    p.fileName = fileName;
    p.temp = temp;
    p.target = target;
    p.createOnly = createOnly;
    files_.push_back(std::move(p));
}

void Nlw_FileRun::Abandon() {
    for (Pending& p : files_) Nlw_TempFile::Remove(p.temp);
    files_.clear();
    done_ = true;
}

bool Nlw_FileRun::Commit() {
    if (joined_) return !g_current || !g_current->failed_;
    if (done_) return !failed_;
    if (failed_) {
        const bool any = !files_.empty();
        Abandon();
        if (any)
            NLW_MSG().issueInfo(
                "No output file was written or replaced, because of the errors above.\n");
        return false;
    }
    // Files that must be new first: one that exists after all stops the run
    // before anything was replaced.
    for (int pass = 0; pass < 2; ++pass)
        for (Pending& p : files_) {
            if (p.createOnly != (pass == 0) || Place(p)) continue;
            failed_ = true;
            RollBack();
            NLW_MSG().issueInfo(
                "No output file was written or replaced, because of the errors above.\n");
            return false;
        }
    for (Pending& p : files_)
        if (!p.backup.empty()) Nlw_TempFile::Remove(p.backup);
    files_.clear();
    done_ = true;
    return true;
}

bool Nlw_FileRun::Place(Pending& p) {
    struct stat st;
    if (::stat(p.temp.c_str(), &st) == 0) {
        p.dev = st.st_dev;
        p.ino = st.st_ino;
    }
    if (!p.createOnly && ::lstat(p.target.c_str(), &st) == 0 && S_ISREG(st.st_mode)) {
        // A second name for the old file, so that it can come back when a
        // later file of the run cannot be placed.
        std::string backup;
        const std::string stem = p.target + ".old" + std::to_string(static_cast<long>(::getpid()));
        for (unsigned n = 0; n < 100; ++n) {
            std::string name = n == 0 ? stem : stem + "." + std::to_string(n);
            Nlw_TempFile::Keep(name);
            if (::link(p.target.c_str(), name.c_str()) == 0) {
                backup = name;
                break;
            }
            const int err = errno;
            Nlw_TempFile::Forget(name);
            if (err != EEXIST) break;  // no links here: the file goes unguarded
        }
        p.backup = backup;
    }
    const int err = Nlw_TempFile::Place(p.temp, p.target, p.createOnly);
    if (err == 0) {
        Nlw_TempFile::Forget(p.temp);
        p.placed = true;
        return true;
    }
    if (err == EEXIST && p.createOnly)
        NLW_MSG().issueError("Output file '%s' exists; use -w to overwrite it.\n",
                             p.fileName.c_str());
    else
        NLW_MSG().issueError("Cannot write file '%s': %s\n", p.fileName.c_str(),
                             std::strerror(err));
    return false;
}

void Nlw_FileRun::RollBack() {
    for (Pending& p : files_) {
        if (p.placed) {
            if (!p.backup.empty()) {
                ::rename(p.backup.c_str(), p.target.c_str());
                Nlw_TempFile::Forget(p.backup);
            } else {
                // Made by this run: removed, unless someone has put another
                // file there since.
                struct stat st;
                if (::lstat(p.target.c_str(), &st) == 0 && st.st_dev == p.dev && st.st_ino == p.ino)
                    ::unlink(p.target.c_str());
            }
        } else {
            Nlw_TempFile::Remove(p.temp);
            if (!p.backup.empty()) Nlw_TempFile::Remove(p.backup);
        }
    }
    files_.clear();
    done_ = true;
}

// The files of one run: each written to an exclusive temporary beside it,
// all put into place together once every one is complete, none when any
// failed. Temporaries are removed when the process is ended by SIGINT,
// SIGTERM or SIGHUP.
#pragma once

#include <sys/types.h>

#include <string>
#include <vector>

class Nlw_FileRun {
public:
    // Begins a run, or joins the run already open (the outer one then
    // decides). While a run is open, every Nlw_Writer hands its completed
    // temporary to it instead of renaming it at once.
    Nlw_FileRun();
    // A run that was not committed is abandoned: its temporaries go.
    ~Nlw_FileRun();
    Nlw_FileRun(const Nlw_FileRun&) = delete;
    Nlw_FileRun& operator=(const Nlw_FileRun&) = delete;

    // Puts every file into place, or, when a file of the run failed or one
    // cannot be placed, none: files made by the run are removed again and
    // replaced files are restored. Returns true when all were placed (a
    // joined run returns whether nothing failed so far).
    bool Commit();

    // The open run, or null.
    static Nlw_FileRun* Current();

    // For Nlw_Writer: a completed temporary, to be renamed to target
    // (createOnly: only when no file of that name exists); fileName is the
    // name the messages show.
    void Add(const std::string& fileName, const std::string& temp, const std::string& target,
             bool createOnly);
    // A file of the run failed: the run will place nothing.
    void MarkFailed() { failed_ = true; }
    bool HasFailed() const { return failed_; }

private:
    struct Pending {
        std::string fileName, temp, target, backup;
        bool createOnly = false;
        bool placed = false;
        dev_t dev = 0;
        ino_t ino = 0;
    };
    void Abandon();
    bool Place(Pending& p);
    void RollBack();

    Nlw_FileRun* outer_ = nullptr;
    bool joined_ = false;
    bool failed_ = false;
    bool done_ = false;
    std::vector<Pending> files_;
};

// Temporary files: created exclusively, never through a link, and removed
// by the signal handler when the process is ended while they exist.
class Nlw_TempFile {
public:
    // Creates "<target>.tmp<pid>" (or that name with ".<n>" appended when it
    // is taken) in the target's folder, exclusively and without following a
    // link at that name; mode as open(2) takes it (the umask applies).
    // Returns the open descriptor, or -1 with errno set.
    static int Create(const std::string& target, mode_t mode, std::string& tempName);
    // Removes the temporary and forgets it.
    static void Remove(const std::string& tempName);
    // Forgets a name (after it was renamed into place).
    static void Forget(const std::string& tempName);
    // Keeps a name to be removed on a signal (a backup made by a run).
    static void Keep(const std::string& name);
    // Renames temp to target; with createOnly the target must not exist
    // (renameat2 with RENAME_NOREPLACE, or link and unlink where the file
    // system lacks it), so that of two runs exactly one creates the file.
    // Returns 0 or the errno value (EEXIST when the target exists).
    static int Place(const std::string& temp, const std::string& target, bool createOnly);
};

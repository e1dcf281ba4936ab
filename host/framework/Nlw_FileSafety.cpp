// Output name rules: inputs kept whole, files of others left alone, module
// file names made safe.
#include "framework/Nlw_FileSafety.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstring>
#include <map>
#include <set>

#include "port/Port.h"
#include "port/UT.h"

bool Nlw_FileSafety::IsSameFile(const char* a, const char* b) {
    if (!a || !b || !*a || !*b) return false;
    if (std::strcmp(a, b) == 0) return true;
    struct stat sa, sb;
    return ::stat(a, &sa) == 0 && ::stat(b, &sb) == 0 && sa.st_dev == sb.st_dev &&
           sa.st_ino == sb.st_ino;
}

const Nlw_InputFile* Nlw_FileSafety::FindInput(const char* path,
                                               const std::vector<Nlw_InputFile>& inputs) {
    for (const Nlw_InputFile& in : inputs)
        if (IsSameFile(path, in.path.c_str())) return &in;
    return nullptr;
}

bool Nlw_FileSafety::CheckNotInput(const char* path, const char* what,
                                   const std::vector<Nlw_InputFile>& inputs) {
    const Nlw_InputFile* in = FindInput(path, inputs);
    if (!in) return true;
    NLW_MSG().issueError(
        "%s '%s' is the %s file '%s'; writing it would destroy the input. Choose another "
        "name.\n",
        what, UT_STR::OrEmpty(path), in->role.c_str(), in->path.c_str());
    return false;
}

namespace {

// Texts that begin, or stand in the first lines of, the files this program
// writes. Writers of further file kinds add their own header's line here.
const char* const kOwnMarks[] = {
    "// Copyright (c) Vornix. All rights reserved.",
    "// Vornix qcf2dcf translation file produced by",
    "// Vornix signal/pin map file produced by program",
    "`define CHIPWIDE",
    "# Netlist dump of design ",
    "(VENDOR \"nlw-verilog\")",
    "# Hierarchy information of a multiple-hierarchy Verilog netlist.",
    "Equivalence guidance for design ",
};

}  // namespace

bool Nlw_FileSafety::IsOwnFile(const char* path) {
    // Non-blocking, so that a fifo at the name cannot stall the look.
    int fd = ::open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (fd < 0) return false;
    struct stat st;
    if (::fstat(fd, &st) != 0 || !S_ISREG(st.st_mode)) {
        ::close(fd);
        return false;
    }
    char buf[4096];
    ssize_t n = ::pread(fd, buf, sizeof buf, 0);
    ::close(fd);
    if (n < 0) return false;
    if (n == 0) return true;  // nothing to lose
    const std::string head(buf, static_cast<size_t>(n));
    for (const char* mark : kOwnMarks)
        if (head.find(mark) != std::string::npos) return true;
    return false;
}

// ---- Module file names -----------------------------------------------------

namespace {

std::string Lower(std::string s) {
    for (char& c : s)
        if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    return s;
}

bool IsDeviceName(const std::string& lower) {
    static const std::set<std::string> kNames = {"con", "prn", "aux", "nul", "clock$"};
    if (kNames.count(lower)) return true;
    return lower.size() == 4 &&
           (lower.compare(0, 3, "com") == 0 || lower.compare(0, 3, "lpt") == 0) &&
           lower[3] >= '0' && lower[3] <= '9';
}

std::string Sanitize(const std::string& name) {
    std::string out;
    for (char c : name) {
        const bool keep = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') ||
                          (c >= '0' && c <= '9') || c == '_' || c == '-';
        out += keep ? c : '_';
        if (out.size() == Nlw_FileSafety::kMaxBaseName) break;
    }
    if (out.empty() || out[0] == '-') out.insert(out.begin(), '_');
    if (out.size() > Nlw_FileSafety::kMaxBaseName) out.resize(Nlw_FileSafety::kMaxBaseName);
    if (IsDeviceName(Lower(out))) out += '_';
    return out;
}

}  // namespace

std::vector<std::string> Nlw_FileSafety::SafeFileNames(const std::vector<std::string>& names,
                                                       const std::vector<std::string>& reserved) {
    std::set<std::string> taken;  // lower case
    for (const std::string& r : reserved) taken.insert(Lower(r));
    std::map<std::string, std::string> given;  // name -> base name
    std::vector<std::string> out;
    out.reserve(names.size());
    for (const std::string& name : names) {
        auto it = given.find(name);
        if (it != given.end()) {
            out.push_back(it->second);
            continue;
        }
        std::string base = Sanitize(name);
        if (taken.count(Lower(base))) {
            // A counter makes it unique; the stem is cut so that the whole
            // stays within the length limit.
            for (unsigned n = 2;; ++n) {
                const std::string suffix = "_" + std::to_string(n);
                std::string stem = base.substr(0, kMaxBaseName - suffix.size());
                if (!taken.count(Lower(stem + suffix))) {
                    base = stem + suffix;
                    break;
                }
            }
        }
        taken.insert(Lower(base));
        given.emplace(name, base);
        out.push_back(base);
    }
    return out;
}

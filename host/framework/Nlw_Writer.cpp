// The file writer base: buffered output, the temporary file and its
// renaming into place, and the external property list.
#include "framework/Nlw_Writer.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>

#include "framework/Nlw_FileRun.h"
#include "framework/Nlw_FileSafety.h"
#include "framework/Nlw_NetlistWriter.h"
#include "model/Nlw_Nl.h"
#include "model/Vdm_Property.h"
#include "port/UT.h"

// ---- Opening and closing ---------------------------------------------------

Nlw_Writer::Nlw_Writer(Nlw_NetlistWriter* nlw, const char* fileName, Port::Stream::Access access)
    : nlw_(nlw), fileName_(UT_STR::OrEmpty(fileName)), access_(access) {
    if (access_ == Port::Stream::Memory) return;
    if (access_ != Port::Stream::Create && access_ != Port::Stream::Replace) {
        Fail("the file is not opened for writing");
        return;
    }
    if (fileName_.empty()) {
        Fail("no file name was given");
        return;
    }
    Nlw_Params* params = GetParams();
    if (params &&
        !Nlw_FileSafety::CheckNotInput(fileName_.c_str(), "Output file", params->GetInputFiles())) {
        Refuse();
        return;
    }
    struct stat lst, st;
    const bool present = ::lstat(fileName_.c_str(), &lst) == 0;
    const bool resolves = present && ::stat(fileName_.c_str(), &st) == 0;
    if (resolves && S_ISDIR(st.st_mode)) {
        Fail(std::strerror(EISDIR));
        return;
    }
    if (present) {
        // Only a file the user named, or one this program wrote, may go;
        // a dangling link counts as a file that exists.
        const bool named =
            !params || (params->GetOutputFileNamed() &&
                        Nlw_FileSafety::IsSameFile(fileName_.c_str(), params->GetOutputFileName()));
        if (!named && !(resolves && Nlw_FileSafety::IsOwnFile(fileName_.c_str()))) {
            NLW_MSG().issueError(
                "File '%s' exists and was not written by this program; it is left as it "
                "is. Move it away, or choose another output file name or folder.\n",
                fileName_.c_str());
            Refuse();
            return;
        }
        if (access_ == Port::Stream::Create) {
            NLW_MSG().issueError("Output file '%s' exists; use -w to overwrite it.\n",
                                 fileName_.c_str());
            Refuse();
            return;
        }
        if (resolves && !S_ISREG(st.st_mode)) {
            // A device or pipe (/dev/null, a fifo) is written in place:
            // renaming a file over it would replace the device itself.
            int fd = ::open(fileName_.c_str(), O_WRONLY | O_CLOEXEC);
            if (fd < 0 || !OpenStream(fd)) Fail(std::strerror(errno));
            return;
        }
    }
    // A symbolic link keeps pointing at the file: the new text replaces the
    // file it leads to. A dangling one is replaced itself.
    targetName_ = fileName_;
    if (present && resolves && S_ISLNK(lst.st_mode)) {
        if (char* real = ::realpath(fileName_.c_str(), nullptr)) {
            targetName_ = real;
            std::free(real);
        }
    }
    std::string temp;
    int fd = Nlw_TempFile::Create(targetName_, 0666, temp);
    if (fd < 0) {
        Fail(std::strerror(errno));
        return;
    }
    tempName_ = temp;
    // A replaced file keeps its permissions.
    if (resolves && ::fchmod(fd, st.st_mode & 07777) != 0) {
        Fail(std::strerror(errno));
        ::close(fd);
        return;
    }
    if (!OpenStream(fd)) Fail(std::strerror(errno));
}

bool Nlw_Writer::OpenStream(int fd) {
    fp_ = ::fdopen(fd, "wb");
    if (!fp_) {
        const int err = errno;
        ::close(fd);
        errno = err;
        return false;
    }
    // The writer buffers in large blocks itself; unbuffered stdio makes every
    // write error show at the fwrite that caused it.
    std::setvbuf(fp_, nullptr, _IONBF, 0);
    return true;
}

void Nlw_Writer::Refuse() {
    ok_ = false;
    if (Nlw_FileRun* run = Nlw_FileRun::Current()) run->MarkFailed();
}

Nlw_Writer::~Nlw_Writer() {
    Close();
}

Nlw_Writer::Nlw_Writer(const Nlw_Writer& other)
    : nlw_(other.nlw_),
      filter_(other.filter_),
      fileName_(other.fileName_),
      access_(other.access_),
      indent_(other.indent_),
      ok_(false),
      closed_(true) {}

Nlw_Writer& Nlw_Writer::operator=(const Nlw_Writer& other) {
    if (this == &other) return *this;
    Close();
    nlw_ = other.nlw_;
    filter_ = other.filter_;
    fileName_ = other.fileName_;
    access_ = other.access_;
    indent_ = other.indent_;
    buffer_.clear();
    ok_ = false;
    closed_ = true;
    return *this;
}

void Nlw_Writer::Fail(const char* what) {
    if (!ok_) return;  // one message per file
    Refuse();
    NLW_MSG().issueError("Cannot write file '%s': %s\n", fileName_.c_str(), what);
    if (fp_) std::fclose(fp_);
    fp_ = nullptr;
    Nlw_TempFile::Remove(tempName_);
    tempName_.clear();
    buffer_.Release();
}

void Nlw_Writer::Flush() {
    if (!fp_ || buffer_.empty()) return;
    errno = 0;
    size_t n = std::fwrite(buffer_.data(), 1, buffer_.size(), fp_);
    if (n != buffer_.size()) {
        Fail(std::strerror(errno ? errno : EIO));
        return;
    }
    buffer_.clear();
}

bool Nlw_Writer::Close() {
    if (closed_) return ok_;
    closed_ = true;
    if (!ok_ || access_ == Port::Stream::Memory) return ok_;
    Flush();
    if (!ok_) return false;
    FILE* fp = fp_;
    fp_ = nullptr;
    errno = 0;
    if (std::fclose(fp) != 0) {
        Fail(std::strerror(errno ? errno : EIO));
        return false;
    }
    if (tempName_.empty()) return true;  // written in place
    const bool createOnly = access_ == Port::Stream::Create;
    // In a run, the file goes into place with all the others.
    if (Nlw_FileRun* run = Nlw_FileRun::Current()) {
        run->Add(fileName_, tempName_, targetName_, createOnly);
        tempName_.clear();
        return true;
    }
    const int err = Nlw_TempFile::Place(tempName_, targetName_, createOnly);
    if (err == EEXIST && createOnly) {
        Nlw_TempFile::Remove(tempName_);
        tempName_.clear();
        ok_ = false;
        NLW_MSG().issueError("Output file '%s' exists; use -w to overwrite it.\n",
                             fileName_.c_str());
        return false;
    }
    if (err != 0) {
        Fail(std::strerror(err));
        return false;
    }
    Nlw_TempFile::Forget(tempName_);
    tempName_.clear();
    return true;
}

// ---- Output ----------------------------------------------------------------

void Nlw_Writer::AppendIndent() {
    static const char kBlanks[] = "                                ";  // 32
    size_t n = static_cast<size_t>(indent_) * kIndentWidth;
    while (n > 0) {
        size_t k = n < sizeof kBlanks - 1 ? n : sizeof kBlanks - 1;
        Append(kBlanks, k);
        n -= k;
    }
}

void Nlw_Writer::WriteL(const char* text) {
    text = UT_STR::OrEmpty(text);
    Append(text, std::strlen(text));
    Append("\n", 1);
}

void Nlw_Writer::WriteIL(const char* text) {
    AppendIndent();
    WriteL(text);
}

void Nlw_Writer::WriteI(const char* text) {
    AppendIndent();
    Write(text, 0, 0);
}

void Nlw_Writer::Write(const char* text, int, int) {
    text = UT_STR::OrEmpty(text);
    Append(text, std::strlen(text));
}

void Nlw_Writer::WriteText(const char* text, size_t len) {
    Append(text, len);
}

void Nlw_Writer::CollectText() {
    Close();
    access_ = Port::Stream::Memory;
    tempName_.clear();
    targetName_.clear();
    fp_ = nullptr;
    buffer_.clear();
    ok_ = true;
    closed_ = false;
}

void Nlw_Writer::AppendTextOf(const Nlw_Writer& other) {
    // In pieces, so that the text is handed to the file as it goes rather
    // than copied whole into this writer's buffer first.
    const char* text = other.buffer_.data();
    for (size_t at = 0, n = other.buffer_.size(); at < n; at += kFlushSize)
        Append(text + at, std::min(kFlushSize, n - at));
}

void Nlw_Writer::WriteIText(const std::string& text) {
    AppendIndent();
    Append(text.data(), text.size());
}

Nlw_Params* Nlw_Writer::GetParams() const {
    return nlw_ ? nlw_->GetParams() : nullptr;
}

// ---- Properties ------------------------------------------------------------

const char* Nlw_Writer::LegalString(const char* text, unsigned char, const char*) {
    return text;
}

Vdm_Property* Nlw_Writer::FindExternalProperties(Vdm_PropertyHolder* holder) {
    if (!holder) return nullptr;
    // Blocks are their own data-model objects.
    auto* block = static_cast<Nlw_NlBlock*>(holder);
    Vdm_Property* list = block->GetExternalProperties();
    if (!list || list->GetCount() == 0) return nullptr;

    const std::vector<Vdm_Property*>& elems = list->GetElements();
    size_t i = 0;
    while (i < elems.size() && IsExternalProperty(elems[i], block)) ++i;
    if (i == elems.size()) return list;

    // Some are left out: collect the rest in the writer's own list, which
    // borrows them from the block.
    if (!scratchList_) scratchList_.reset(Vdm_Property::NewBorrowingList(list->GetName()));
    Vdm_Property* kept = scratchList_.get();
    kept->ClearElements();
    for (size_t k = 0; k < i; ++k) kept->Add(elems[k]);
    for (++i; i < elems.size(); ++i)
        if (IsExternalProperty(elems[i], block)) kept->Add(elems[i]);
    return kept->GetCount() == 0 ? nullptr : kept;
}

unsigned char Nlw_Writer::IsExternalProperty(Vdm_Property* property, Nlw_NlBlock*) {
    if (!property) return 0;
    return filter_ && filter_->IsFiltered(property->GetName()) ? 0 : 1;
}

unsigned char Nlw_Writer::IsExternalProperty(Vdm_Property* property, Vdm_PropertyHolder*) {
    if (!property) return 0;
    return filter_ && filter_->IsFiltered(property->GetName()) ? 0 : 1;
}

// ---- Property output filter ------------------------------------------------

namespace {

std::string LowerCase(const char* s) {
    std::string out(UT_STR::OrEmpty(s));
    for (char& c : out)
        if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    return out;
}

}  // namespace

Vdh_PropOutFilter::Vdh_PropOutFilter(const char* path, const void* options) {
    (void)options;
    std::string content, error;
    if (!Port::File::readAll(path, content, &error)) {
        NLW_MSG().issueWarning("Cannot read property filter file '%s': %s\n", UT_STR::OrEmpty(path),
                               error.c_str());
        return;
    }
    loaded_ = true;
    size_t pos = 0;
    while (pos < content.size()) {
        size_t end = content.find('\n', pos);
        if (end == std::string::npos) end = content.size();
        std::string line = content.substr(pos, end - pos);
        pos = end + 1;
        size_t hash = line.find('#');
        if (hash != std::string::npos) line.erase(hash);
        std::string token;
        const char* p = line.c_str();
        for (;;) {
            char sep = UT_STR::GetToken(p, token, " \t\r,");
            if (!token.empty()) {
                std::string name = LowerCase(token.c_str());
                if (name.find('*') != std::string::npos)
                    patterns_.push_back(name);
                else
                    names_.insert(name);
            }
            if (!sep) break;
            p += token.size() + 1;
        }
    }
}

bool Vdh_PropOutFilter::IsFiltered(const char* propertyName) const {
    if (!propertyName) return false;
    if (names_.count(LowerCase(propertyName))) return true;
    for (const std::string& pattern : patterns_)
        if (UT_STR::IMatch(propertyName, pattern.c_str())) return true;
    return false;
}

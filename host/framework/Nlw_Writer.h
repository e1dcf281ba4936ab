// The base of every file writer: buffered, checked output to a file that
// appears under its name only once it is complete.
#pragma once

#include <cstdio>
#include <memory>
#include <string>
#include <unordered_set>
#include <vector>

#include "framework/Nlw_TextBuffer.h"
#include "port/Port.h"

class Nlw_NetlistWriter;
class Nlw_Params;
class Nlw_NlView;
class Nlw_NlBlock;
class Vdm_Property;
class Vdm_PropertyHolder;

// Filters properties out of the external lists: reads a file of property
// names, one per line or several separated by blanks or commas, '#' starting
// a comment; "*" in a name matches any run of characters, case is ignored.
// A listed name is not written as a parameter. A file that cannot be read
// is reported as a warning and filters nothing.
class Vdh_PropOutFilter {
public:
    Vdh_PropOutFilter(const char* path, const void* options);
    bool IsFiltered(const char* propertyName) const;
    bool IsLoaded() const { return loaded_; }

private:
    // Plain names, lower case, looked up whole; names with "*" are matched
    // one by one.
    std::unordered_set<std::string> names_;
    std::vector<std::string> patterns_;
    bool loaded_ = false;
};

class Nlw_Writer {
public:
    // Opens fileName for writing in the access mode. Text goes to a temporary
    // file beside it ("<fileName>.tmp<pid>", created exclusively), renamed
    // into place when the writer is closed after every write succeeded, or,
    // while an Nlw_FileRun is open, when the run is committed; until then an
    // old file of that name stays as it was. With Create, an existing file is
    // an error and is kept. A name that is one of the run's inputs, or an
    // existing file the user did not name and this program did not write, is
    // refused in both modes. Failures are reported as one error naming the
    // file and the reason; the writer then discards what it is given, leaves
    // no file behind and fails the open run. Memory collects the text for
    // GetMemoryText and opens no file.
    Nlw_Writer(Nlw_NetlistWriter* nlw, const char* fileName, Port::Stream::Access access);
    virtual ~Nlw_Writer();
    // A copy shares the owner, the property filter, the file name and the
    // indentation, but not the open file: it discards what it is given.
    // Assignment first closes the file the target writer had open.
    Nlw_Writer(const Nlw_Writer& other);
    Nlw_Writer& operator=(const Nlw_Writer& other);

    virtual void WriteView(Nlw_NlView* view, unsigned char flag) = 0;
    virtual void WriteBlock(Nlw_NlBlock* block) = 0;
    // The text unchanged.
    virtual const char* LegalString(const char* text, unsigned char flag, const char* replacement);
    // The holder must be a block's data-model object (GetDataBlock). Gives
    // the block's external property list, keeping the elements for which
    // IsExternalProperty(element, block) holds: the stored list itself when
    // all are kept, else a list owned by the writer that is valid until the
    // next call (its elements stay the block's). Null when nothing remains.
    virtual Vdm_Property* FindExternalProperties(Vdm_PropertyHolder* holder);
    // Both: false when the property output filter lists the name, else true.
    virtual unsigned char IsExternalProperty(Vdm_Property* property, Nlw_NlBlock* block);
    virtual unsigned char IsExternalProperty(Vdm_Property* property, Vdm_PropertyHolder* holder);

    // Output.
    void WriteL(const char* text);                 // text and line end
    void WriteIL(const char* text);                // indentation, text, line end
    void WriteI(const char* text);                 // indentation and text
    void Write(const char* text, int, int);        // text alone
    void WriteText(const char* text, size_t len);  // len characters of text
    void WriteIText(const std::string& text);      // indentation and text
    void UpIndent() { ++indent_; }
    void DownIndent() {
        if (indent_ > 0) --indent_;
    }
    int GetIndent() const { return indent_; }

    Nlw_NetlistWriter* GetNlw() const { return nlw_; }
    Nlw_Params* GetParams() const;
    void SetExtPropFilter(Vdh_PropOutFilter* filter) { filter_ = filter; }
    Vdh_PropOutFilter* GetExtPropFilter() const { return filter_; }

    const char* GetFileName() const { return fileName_.c_str(); }
    bool IsOk() const { return ok_; }
    // Flushes, closes and renames into place; reports failure. Called by the
    // destructor when not called before. Returns true on success.
    bool Close();
    // Memory mode: the text written so far.
    std::string GetMemoryText() const { return buffer_.str(); }
    // Makes this writer (a copy, say) collect what it is given in memory,
    // from empty; AppendTextOf then writes that text on through another.
    void CollectText();
    void AppendTextOf(const Nlw_Writer& other);

    // Indentation unit.
    static constexpr int kIndentWidth = 2;
    // Text is handed to the file in blocks of at least this size.
    static constexpr size_t kFlushSize = 256 * 1024;

private:
    // Every piece of output passes here: inline, so that a line of several
    // pieces costs no calls.
    void Append(const char* text, size_t len) {
        if (!ok_ || closed_) return;
        buffer_.Append(text, len);
        if (fp_ && buffer_.size() >= kFlushSize) Flush();
    }
    void AppendIndent();
    void Flush();
    void Fail(const char* what);
    void Refuse();
    bool OpenStream(int fd);

    Nlw_NetlistWriter* nlw_ = nullptr;
    Vdh_PropOutFilter* filter_ = nullptr;
    std::string fileName_;
    std::string tempName_;    // empty when writing in place
    std::string targetName_;  // renamed into: the file name, or where its link leads
    Port::Stream::Access access_ = Port::Stream::Create;
    FILE* fp_ = nullptr;
    Nlw_TextBuffer buffer_;
    int indent_ = 0;
    bool ok_ = true;
    bool closed_ = false;
    std::unique_ptr<Vdm_Property> scratchList_;
};

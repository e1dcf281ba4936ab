// Loading a netlist JSON file: reading, parsing, and the steps that turn
// the document into a view. Every fault of the input ends the load with one
// error message that names the file.
#include "Nlw_JsonReader.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <new>

#include "Nlw_JsonReader_Internal.h"
#include "Port.h"

namespace nlw_json {

void Fail(std::string text) { throw ReadError{std::move(text)}; }

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

namespace {

// Reads the whole file into a buffer with the padding the parser needs.
bool ReadFile(const char* fileName, simdjson::padded_string& out, std::string& reason) {
    FILE* fp = std::fopen(fileName, "rb");
    if (!fp) {
        reason = std::strerror(errno);
        return false;
    }
    struct stat st;
    if (fstat(fileno(fp), &st) != 0 || S_ISDIR(st.st_mode)) {
        reason = S_ISDIR(st.st_mode) ? std::strerror(EISDIR) : std::strerror(errno);
        std::fclose(fp);
        return false;
    }
    size_t size = static_cast<size_t>(st.st_size);
    simdjson::padded_string buf(size);
    if (size > 0 && buf.data() == nullptr) {
        std::fclose(fp);
        reason = "not enough memory to read it";
        return false;
    }
    size_t got = size ? std::fread(buf.data(), 1, size, fp) : 0;
    bool bad = std::ferror(fp) != 0;
    int err = errno;
    std::fclose(fp);
    if (bad || got != size) {
        reason = bad ? std::strerror(err) : "the file changed while it was read";
        return false;
    }
    out = std::move(buf);
    return true;
}

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

void Parse(Design& d, const simdjson::padded_string& text) {
    simdjson::error_code err = d.parser.parse(text).get(d.root);
    if (!err) return;
    std::string what = simdjson::error_message(err);
    size_t at = FindSyntaxError(text.data(), text.size());
    if (at != std::string::npos)
        Fail("malformed JSON at byte offset " + std::to_string(at) + " (" +
             Position(text.data(), text.size(), at) + "): " + what);
    Fail("malformed JSON: " + what);
}

bool Run(Design& d, simdjson::padded_string& text, Nlw_NlView& view,
         std::unique_ptr<Nlw_Design>& design) {
    try {
        Parse(d, text);
        // The document holds its own copy of every string; the text can go.
        text = simdjson::padded_string();
        ReadModuleList(d);
        ResolveHierarchy(d);
        if (d.options.flatten)
            BuildFlat(d, view);
        else
            BuildUnfolded(d, view);
        design = std::make_unique<Nlw_Design>(std::string(d.modules[d.top].name).c_str());
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
    simdjson::padded_string text;
    std::string reason;
    if (!nlw_json::ReadFile(d->File(), text, reason)) {
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
    simdjson::padded_string padded(text);
    return nlw_json::Run(*d, padded, view, design);
}

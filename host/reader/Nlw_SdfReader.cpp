#include "reader/Nlw_SdfReader.h"

#include <cerrno>
#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

struct ParseError {
    int line;
    std::string text;
};

struct Token {
    enum Kind { Open, Close, Word, String, End } kind = End;
    std::string_view text;
    int line = 1;
};

// Splits the file into parentheses, quoted strings and words. A backslash
// takes the next character into the word whatever it is.
class Lexer {
public:
    Lexer(const char* text, size_t size) : p_(text), end_(text + size) {}

    Token Next() {
        SkipBlanks();
        Token t;
        t.line = line_;
        if (p_ >= end_) return t;
        const char c = *p_;
        if (c == '(' || c == ')') {
            t.kind = c == '(' ? Token::Open : Token::Close;
            t.text = std::string_view(p_++, 1);
            return t;
        }
        if (c == '"') {
            const char* start = ++p_;
            while (p_ < end_ && *p_ != '"') {
                if (*p_ == '\\' && p_ + 1 < end_) ++p_;
                if (*p_ == '\n') ++line_;
                ++p_;
            }
            if (p_ >= end_) throw ParseError{t.line, "a quoted string does not end"};
            t.kind = Token::String;
            t.text = std::string_view(start, p_ - start);
            ++p_;
            return t;
        }
        const char* start = p_;
        while (p_ < end_) {
            const char d = *p_;
            if (d == '\\' && p_ + 1 < end_) {
                if (p_[1] == '\n') ++line_;
                p_ += 2;
                continue;
            }
            if (d == '(' || d == ')' || d == '"' || d == ' ' || d == '\t' || d == '\n' || d == '\r')
                break;
            ++p_;
        }
        t.kind = Token::Word;
        t.text = std::string_view(start, p_ - start);
        return t;
    }

private:
    void SkipBlanks() {
        while (p_ < end_) {
            const char c = *p_;
            if (c == '\n') {
                ++line_;
                ++p_;
            } else if (c == ' ' || c == '\t' || c == '\r' || c == '\f') {
                ++p_;
            } else if (c == '/' && p_ + 1 < end_ && (p_[1] == '/' || p_[1] == '*')) {
                SkipComment();
            } else {
                break;
            }
        }
    }
    // Comments are not SDF, but some tools write them; they are skipped.
    void SkipComment() {
        if (p_[1] == '/') {
            while (p_ < end_ && *p_ != '\n') ++p_;
            return;
        }
        p_ += 2;
        while (p_ + 1 < end_ && !(p_[0] == '*' && p_[1] == '/')) {
            if (*p_ == '\n') ++line_;
            ++p_;
        }
        p_ = p_ + 1 < end_ ? p_ + 2 : end_;
    }

    const char* p_;
    const char* end_;
    int line_ = 1;
};

bool Is(const Token& t, const char* keyword) {
    return t.kind == Token::Word && t.text.size() == std::strlen(keyword) &&
           UT_STR::INCompare(t.text.data(), keyword, t.text.size()) == 0;
}

std::string Unescape(std::string_view s) {
    std::string out;
    out.reserve(s.size());
    for (size_t i = 0; i < s.size(); ++i) {
        if (s[i] == '\\' && i + 1 < s.size()) ++i;
        out += s[i];
    }
    return out;
}

const char* KindName(Token::Kind k) {
    switch (k) {
        case Token::Open:
            return "'('";
        case Token::Close:
            return "')'";
        case Token::Word:
            return "a word";
        case Token::String:
            return "a quoted string";
        case Token::End:
            break;
    }
    return "the end of the file";
}

class Parser {
public:
    Parser(const char* file, const char* text, size_t size, Nlw_NlView& view, Nlw_Timing& timing)
        : file_(file), lex_(text, size), view_(view), timing_(timing) {
        Advance();
    }

    void Run() {
        Expect(Token::Open);
        ExpectKeyword("DELAYFILE");
        while (tok_.kind == Token::Open) {
            Advance();
            if (tok_.kind != Token::Word) Fail(std::string("expected a keyword, found ") + Found());
            if (Is(tok_, "CELL")) {
                Advance();
                ParseCell();
            } else {
                ParseHeaderEntry();
            }
        }
        Expect(Token::Close);
        if (tok_.kind != Token::End) Fail("text follows the end of DELAYFILE");
        if (!sawVersion_) Fail("the file has no SDFVERSION");
        if (unmatched_ > 0)
            NLW_MSG().issueWarning(
                "%zu timing entries of '%s' match nothing in the design and are not carried "
                "over.\n",
                unmatched_, file_);
    }

private:
    // ---- tokens
    void Advance() { tok_ = lex_.Next(); }
    [[noreturn]] void Fail(const std::string& text) { throw ParseError{tok_.line, text}; }
    std::string Found() const {
        if (tok_.kind == Token::Word || tok_.kind == Token::String)
            return "'" + std::string(tok_.text.substr(0, 60)) + "'";
        return KindName(tok_.kind);
    }
    void Expect(Token::Kind kind) {
        if (tok_.kind != kind)
            Fail(std::string("expected ") + KindName(kind) + ", found " + Found());
        Advance();
    }
    void ExpectKeyword(const char* keyword) {
        if (!Is(tok_, keyword)) Fail(std::string("expected ") + keyword + ", found " + Found());
        Advance();
    }
    // Skips the rest of a group whose "(" and keyword were read, with
    // everything nested in it.
    void SkipGroup() {
        int depth = 1;
        while (depth > 0) {
            if (tok_.kind == Token::End) Fail("the file ends inside a group");
            if (tok_.kind == Token::Open) ++depth;
            if (tok_.kind == Token::Close) --depth;
            Advance();
        }
    }
    void Warn(int line, const std::string& text) {
        NLW_MSG().issueWarning("%s:%d: %s\n", file_, line, text.c_str());
    }

    // ---- header
    void ParseHeaderEntry() {
        if (Is(tok_, "SDFVERSION")) {
            Advance();
            if (tok_.kind != Token::String) Fail("expected the version as a quoted string");
            const std::string v(tok_.text);
            if (v.find("3.0") == std::string::npos && v.find("2.1") == std::string::npos)
                Fail("SDF version '" + v + "' is not supported (3.0 and 2.1 are)");
            sawVersion_ = true;
            Advance();
            Expect(Token::Close);
        } else if (Is(tok_, "DIVIDER")) {
            Advance();
            if (tok_.kind != Token::Word || tok_.text.size() != 1 ||
                (tok_.text[0] != '/' && tok_.text[0] != '.'))
                Fail("DIVIDER must be '/' or '.'");
            divider_ = tok_.text[0];
            Advance();
            Expect(Token::Close);
        } else if (Is(tok_, "TIMESCALE")) {
            Advance();
            ParseTimescale();
            Expect(Token::Close);
        } else if (Is(tok_, "DESIGN") || Is(tok_, "DATE") || Is(tok_, "VENDOR") ||
                   Is(tok_, "PROGRAM") || Is(tok_, "VERSION") || Is(tok_, "VOLTAGE") ||
                   Is(tok_, "PROCESS") || Is(tok_, "TEMPERATURE")) {
            Advance();
            SkipGroup();
        } else {
            Fail("unknown header entry " + Found());
        }
    }

    // "1ps", "1 ps", "10.0ns": the picoseconds of one written unit.
    void ParseTimescale() {
        std::string text;
        while (tok_.kind == Token::Word) {
            text += tok_.text;
            Advance();
        }
        char* rest = nullptr;
        const double number = std::strtod(text.c_str(), &rest);
        std::string unit = rest ? rest : "";
        for (char& c : unit) c = static_cast<char>(tolower(static_cast<unsigned char>(c)));
        double ps = 0;
        if (unit == "s") ps = 1e12;
        if (unit == "ms") ps = 1e9;
        if (unit == "us") ps = 1e6;
        if (unit == "ns") ps = 1e3;
        if (unit == "ps") ps = 1;
        if (unit == "fs") ps = 1e-3;
        if (rest == text.c_str() || ps == 0 || !(number == 1 || number == 10 || number == 100))
            Fail("TIMESCALE '" + text + "' is not 1, 10 or 100 of s, ms, us, ns, ps or fs");
        scale_ = number * ps;
    }

    // ---- names
    // The block an instance path names, relative to a block (the whole
    // path when base is null); null when there is none.
    Nlw_NlBlock* FindBlock(const Nlw_NlBlock* base, const std::string& path) {
        // Consecutive entries often name one instance (the driver of a
        // net with several loads): the last answer is kept.
        if (base == lastBase_ && path == lastPath_ && lastFound_) return lastFound_;
        lastBase_ = base;
        lastPath_ = path;
        lastFound_ = Lookup(base, path);
        return lastFound_;
    }
    Nlw_NlBlock* Lookup(const Nlw_NlBlock* base, const std::string& path) {
        if (index_.empty()) MakeIndex();
        const std::string* prefix = nullptr;
        if (base) {
            auto p = pathOf_.find(base);
            if (p != pathOf_.end() && !p->second.empty()) prefix = &p->second;
        }
        // Paths below the top are looked up as they stand; others are
        // joined in a buffer kept from call to call.
        const std::string* key = &path;
        if (prefix) {
            key_ = *prefix;
            if (!path.empty()) {
                key_ += '/';
                key_ += path;
            }
            key = &key_;
        }
        if (key->empty()) return view_.GetRootMacro();
        auto it = index_.find(*key);
        return it == index_.end() ? nullptr : it->second;
    }

    // Every block by its path of original instance names joined with "/":
    // a flattened cell named "u1/r" and the cell r of instance u1 have the
    // same path, as the file names them.
    void MakeIndex() {
        index_.reserve(view_.GetNumLeafBlocks() + view_.GetNumMacros());
        const UT_DARRAY<Nlw_NlBlock*>& macros = view_.GetMacros();
        for (size_t i = 0; i < macros.GetCount(); ++i) {
            Nlw_NlBlock* macro = macros[i];
            if (macro == nullptr) continue;
            if (macro->GetParent() == nullptr) pathOf_[macro] = "";
            const std::string& base = pathOf_[macro];
            for (Nlw_NlBlock* child : macro->GetChildren()) {
                std::string key =
                    base.empty() ? child->GetWritableName() : base + '/' + child->GetWritableName();
                if (child->IsMacro()) pathOf_[child] = key;
                index_.emplace(std::move(key), child);
            }
        }
    }

    // A path split at its last divider that is not escaped: the instance
    // part and the last name, both unescaped, the dividers turned to "/".
    void SplitPath(std::string_view text, std::string& instance, std::string& last) const {
        size_t cut = std::string_view::npos;
        for (size_t i = 0; i < text.size(); ++i) {
            if (text[i] == '\\') {
                ++i;
                continue;
            }
            if (text[i] == divider_) cut = i;
        }
        instance.clear();
        if (cut == std::string_view::npos) {
            last = Unescape(text);
            return;
        }
        std::string_view head = text.substr(0, cut);
        for (size_t i = 0; i < head.size(); ++i) {
            if (head[i] == '\\' && i + 1 < head.size()) {
                instance += head[++i];
            } else {
                instance += head[i] == divider_ ? '/' : head[i];
            }
        }
        last = Unescape(text.substr(cut + 1));
    }

    // The pin a port path names relative to the cell's block; null after a
    // warning when there is none.
    Nlw_NlPin* FindPin(Nlw_NlBlock* cell, std::string_view text, int line, const char* what) {
        std::string instance, pinName;
        SplitPath(text, instance, pinName);
        Nlw_NlBlock* block = instance.empty() ? cell : FindBlock(cell, instance);
        if (block == nullptr) {
            Warn(line, "no instance '" + instance + "' in the design; " + what +
                           " entry not carried over");
            return nullptr;
        }
        Nlw_NlPin* pin = block->GetPinByAlias(pinName.c_str());
        if (pin == nullptr)
            Warn(line, std::string(block->IsMacro() ? "module" : "cell") + " instance '" +
                           Describe(block) + "' of type '" + block->GetTypeName() +
                           "' has no pin '" + pinName + "'; " + what + " entry not carried over");
        return pin;
    }

    std::string Describe(const Nlw_NlBlock* block) {
        if (index_.empty()) MakeIndex();
        if (block->IsMacro()) return block->GetParent() ? pathOf_[block] : "(top)";
        const std::string& base = pathOf_[block->GetParent()];
        return base.empty() ? block->GetWritableName() : base + '/' + block->GetWritableName();
    }

    // ---- cells
    void ParseCell() {
        const int cellLine = tok_.line;
        Expect(Token::Open);
        ExpectKeyword("CELLTYPE");
        if (tok_.kind != Token::String) Fail("expected the CELLTYPE as a quoted string");
        const std::string cellType(tok_.text);
        Advance();
        Expect(Token::Close);
        Expect(Token::Open);
        ExpectKeyword("INSTANCE");
        std::string path;
        while (tok_.kind == Token::Word) {
            if (tok_.text == "*") Fail("wildcard instances (INSTANCE *) are not supported");
            std::string instance, last;
            SplitPath(tok_.text, instance, last);
            if (!path.empty()) path += '/';
            path += instance.empty() ? last : instance + '/' + last;
            Advance();
        }
        Expect(Token::Close);

        Nlw_NlBlock* cell = FindBlock(nullptr, path);
        bool skip = false;
        if (cell == nullptr) {
            Warn(cellLine, "no instance '" + path + "' in the design; its timing entries are " +
                               "not carried over");
            skip = true;
        } else if (!path.empty() && cellType != cell->GetTypeName()) {
            Warn(cellLine, "instance '" + path + "' is of type '" + cell->GetTypeName() +
                               "', not '" + cellType +
                               "' as its CELLTYPE says; its timing entries are not carried over");
            skip = true;
        }
        const size_t firstEntry = timing_.entries.size();
        while (tok_.kind == Token::Open) {
            Advance();
            if (Is(tok_, "DELAY")) {
                Advance();
                ParseDelay(cell, skip);
            } else if (Is(tok_, "TIMINGCHECK")) {
                Advance();
                while (tok_.kind == Token::Open) {
                    Advance();
                    ParseCheck(cell, skip);
                }
                Expect(Token::Close);
            } else {
                Unsupported();
            }
        }
        Expect(Token::Close);
        InferPathEdges(firstEntry);
    }

    // An entry this reader does not carry: one warning, counted, skipped.
    void Unsupported() {
        if (tok_.kind != Token::Word) Fail("expected a keyword, found " + Found());
        Warn(tok_.line, std::string(tok_.text) + " entries are not supported; not carried over");
        ++unmatched_;
        Advance();
        SkipGroup();
    }

    void ParseDelay(Nlw_NlBlock* cell, bool skip) {
        while (tok_.kind == Token::Open) {
            Advance();
            if (!Is(tok_, "ABSOLUTE")) {
                Unsupported();
                continue;
            }
            Advance();
            while (tok_.kind == Token::Open) {
                Advance();
                ParseDelayEntry(cell, skip);
            }
            Expect(Token::Close);
        }
        Expect(Token::Close);
    }

    void ParseDelayEntry(Nlw_NlBlock* cell, bool skip) {
        const int line = tok_.line;
        Nlw_TimingEntry e;
        std::string_view port1, port2;
        if (Is(tok_, "IOPATH")) {
            e.kind = Nlw_TimingKind::IoPath;
            Advance();
            port1 = ParsePortSpec(e.edge1);
            port2 = ParsePort();
        } else if (Is(tok_, "INTERCONNECT")) {
            e.kind = Nlw_TimingKind::Interconnect;
            Advance();
            port1 = ParsePort();
            port2 = ParsePort();
        } else if (Is(tok_, "PORT")) {
            e.kind = Nlw_TimingKind::Port;
            Advance();
            port1 = ParsePort();
        } else {
            Unsupported();
            return;
        }
        ParseValues(e, 1, 12);
        Expect(Token::Close);
        Add(e, cell, skip, line, port1, port2);
    }

    void ParseCheck(Nlw_NlBlock* cell, bool skip) {
        static const struct {
            const char* word;
            Nlw_TimingKind kind;
            int ports, values;
        } kChecks[] = {
            {"SETUP", Nlw_TimingKind::Setup, 2, 1},
            {"HOLD", Nlw_TimingKind::Hold, 2, 1},
            {"SETUPHOLD", Nlw_TimingKind::SetupHold, 2, 2},
            {"RECOVERY", Nlw_TimingKind::Recovery, 2, 1},
            {"REMOVAL", Nlw_TimingKind::Removal, 2, 1},
            {"RECREM", Nlw_TimingKind::RecRem, 2, 2},
            {"SKEW", Nlw_TimingKind::Skew, 2, 1},
            {"WIDTH", Nlw_TimingKind::Width, 1, 1},
            {"PERIOD", Nlw_TimingKind::Period, 1, 1},
            {"NOCHANGE", Nlw_TimingKind::NoChange, 2, 2},
        };
        const int line = tok_.line;
        for (const auto& c : kChecks) {
            if (!Is(tok_, c.word)) continue;
            Advance();
            Nlw_TimingEntry e;
            e.kind = c.kind;
            std::string_view port1 = ParsePortSpec(e.edge1), port2;
            if (c.ports == 2) port2 = ParsePortSpec(e.edge2);
            ParseValues(e, c.values, c.values);
            if (tok_.kind == Token::Open) {
                // SCOND / CCOND of a SETUPHOLD or RECREM.
                Advance();
                Unsupported();
                while (tok_.kind == Token::Open) {
                    Advance();
                    SkipGroup();
                }
                Expect(Token::Close);
                timing_.values.resize(e.firstValue);
                return;
            }
            Expect(Token::Close);
            Add(e, cell, skip, line, port1, port2);
            return;
        }
        Unsupported();
    }

    void Add(Nlw_TimingEntry& e, Nlw_NlBlock* cell, bool skip, int line, std::string_view port1,
             std::string_view port2) {
        const char* what = Nlw_Timing::Keyword(e.kind);
        if (!skip) e.pin1 = FindPin(cell, port1, line, what);
        if (!skip && e.pin1 && !port2.empty()) e.pin2 = FindPin(cell, port2, line, what);
        if (skip || e.pin1 == nullptr || (!port2.empty() && e.pin2 == nullptr)) {
            timing_.values.resize(e.firstValue);
            ++unmatched_;
            return;
        }
        if (e.kind != Nlw_TimingKind::Interconnect && e.pin1->GetBlock()->IsMacro()) {
            Warn(line, std::string(what) + " entry on a module instance port is not carried " +
                           "over (only cells carry delays and checks)");
            timing_.values.resize(e.firstValue);
            ++unmatched_;
            return;
        }
        timing_.entries.push_back(e);
    }

    // A port, or "(posedge port)" / "(negedge port)".
    std::string_view ParsePortSpec(uint8_t& edge) {
        edge = NLW_EDGE_NONE;
        if (tok_.kind != Token::Open) return ParsePort();
        Advance();
        if (Is(tok_, "posedge")) {
            edge = NLW_EDGE_POS;
        } else if (Is(tok_, "negedge")) {
            edge = NLW_EDGE_NEG;
        } else {
            Fail("conditions and edges other than posedge and negedge are not supported, found " +
                 Found());
        }
        Advance();
        std::string_view port = ParsePort();
        Expect(Token::Close);
        return port;
    }

    std::string_view ParsePort() {
        if (tok_.kind != Token::Word) Fail("expected a port name, found " + Found());
        std::string_view port = tok_.text;
        Advance();
        return port;
    }

    // Between min and max rvalues: "()", "(v)", "(v:v:v)" with fields
    // that may be empty.
    void ParseValues(Nlw_TimingEntry& e, int min, int max) {
        e.firstValue = static_cast<uint32_t>(timing_.values.size());
        int count = 0;
        while (tok_.kind == Token::Open) {
            Advance();
            if (count == max) Fail("too many delay values");
            timing_.values.push_back(ParseRvalue());
            ++count;
        }
        if (count < min) Fail("expected a delay value, found " + Found());
        e.numValues = static_cast<uint8_t>(count);
    }

    Nlw_Rvalue ParseRvalue() {
        Nlw_Rvalue r;
        // Mostly one word ("1.2:1.3:1.4"), read in place; a value written
        // in pieces ("1.2 : 1.3") is joined first.
        std::string_view text;
        if (tok_.kind == Token::Word) {
            text = tok_.text;
            Advance();
            if (tok_.kind == Token::Word) {
                joined_.assign(text);
                while (tok_.kind == Token::Word) {
                    joined_ += tok_.text;
                    Advance();
                }
                text = joined_;
            }
        }
        if (tok_.kind == Token::Open) Fail("pulse rejection limits are not supported");
        Expect(Token::Close);
        if (text.empty()) return r;
        size_t start = 0;
        for (int field = 0;; ++field) {
            size_t colon = text.find(':', start);
            std::string_view part =
                text.substr(start, colon == std::string_view::npos ? colon : colon - start);
            if (field > 2) Fail("'" + std::string(text) + "' has more than three values");
            if (!part.empty()) {
                double v = 0;
                const char* end = part.data() + part.size();
                const char* begin = part.data() + (part[0] == '+' ? 1 : 0);
                const std::from_chars_result got = std::from_chars(begin, end, v);
                if (got.ec != std::errc() || got.ptr != end || begin == end)
                    Fail("delay value '" + std::string(part) + "' is not a number");
                r.v[field] = v * scale_;
                r.present |= static_cast<uint8_t>(1 << field);
            }
            if (colon == std::string_view::npos) {
                if (field == 0) {
                    // One value stands for all three.
                    r.v[1] = r.v[2] = r.v[0];
                    r.present = r.present ? 7 : 0;
                } else if (field != 2) {
                    Fail("'" + std::string(text) + "' is neither one value nor three");
                }
                break;
            }
            start = colon + 1;
        }
        return r;
    }

    // A path of a clocked cell written without its edge ("IOPATH CLK Q")
    // takes the edge its clock has in the cell's checks, as the cell
    // models' specify blocks write it ("posedge CLK => Q").
    void InferPathEdges(size_t first) {
        for (size_t i = first; i < timing_.entries.size(); ++i) {
            Nlw_TimingEntry& path = timing_.entries[i];
            if (path.kind != Nlw_TimingKind::IoPath || path.edge1 != NLW_EDGE_NONE) continue;
            for (size_t j = first; j < timing_.entries.size(); ++j) {
                const Nlw_TimingEntry& c = timing_.entries[j];
                if (Nlw_Timing::IsCheck(c.kind) && c.pin2 == path.pin1 && c.edge2) {
                    path.edge1 = c.edge2;
                    break;
                }
            }
        }
    }

    const char* file_;
    Lexer lex_;
    Token tok_;
    Nlw_NlView& view_;
    Nlw_Timing& timing_;
    char divider_ = '.';
    double scale_ = 1000.0;  // without TIMESCALE, values are in ns
    bool sawVersion_ = false;
    size_t unmatched_ = 0;
    std::unordered_map<std::string, Nlw_NlBlock*> index_;
    std::string key_;     // Lookup's work space
    std::string joined_;  // ParseRvalue's work space
    const Nlw_NlBlock* lastBase_ = nullptr;
    std::string lastPath_;
    Nlw_NlBlock* lastFound_ = nullptr;
    std::unordered_map<const Nlw_NlBlock*, std::string> pathOf_;
};

}  // namespace

bool Nlw_SdfReader::LoadText(const char* fileName, const char* text, size_t size, Nlw_NlView& view,
                             Nlw_Timing& timing) {
    timing.source = fileName;
    try {
        Parser parser(fileName, text, size, view, timing);
        parser.Run();
    } catch (const ParseError& e) {
        NLW_MSG().issueError("%s:%d: %s\n", fileName, e.line, e.text.c_str());
        timing.entries.clear();
        timing.values.clear();
        return false;
    }
    return true;
}

bool Nlw_SdfReader::Load(const char* fileName, Nlw_NlView& view, Nlw_Timing& timing) {
    std::FILE* fp = std::fopen(fileName, "rb");
    if (fp == nullptr) {
        NLW_MSG().issueError("%s: cannot read the timing file: %s\n", fileName,
                             std::strerror(errno));
        return false;
    }
    std::string text;
    if (std::fseek(fp, 0, SEEK_END) == 0) {
        const long size = std::ftell(fp);
        if (size > 0) text.reserve(static_cast<size_t>(size));
        std::rewind(fp);
    }
    char buf[1 << 16];
    size_t n;
    while ((n = std::fread(buf, 1, sizeof buf, fp)) > 0) text.append(buf, n);
    const bool failed = std::ferror(fp) != 0;
    std::fclose(fp);
    if (failed) {
        NLW_MSG().issueError("%s: cannot read the timing file\n", fileName);
        return false;
    }
    return LoadText(fileName, text.data(), text.size(), view, timing);
}

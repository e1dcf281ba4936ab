// The process-wide keyword cache of the legalizer.
#include <cstring>
#include <deque>
#include <string>
#include <string_view>
#include <unordered_set>

#include "framework/Nlw_Nl_LU.h"

namespace {

// Keywords of the 2005 Verilog standard.
// clang-format off
const char* const kVerilogKeywords[] = {
    "always", "and", "assign", "automatic", "begin", "buf", "bufif0", "bufif1", "case", "casex",
    "casez", "cell", "cmos", "config", "deassign", "default", "defparam", "design", "disable",
    "edge", "else", "end", "endcase", "endconfig", "endfunction", "endgenerate", "endmodule",
    "endprimitive", "endspecify", "endtable", "endtask", "event", "for", "force", "forever",
    "fork", "function", "generate", "genvar", "highz0", "highz1", "if", "ifnone", "incdir",
    "include", "initial", "inout", "input", "instance", "integer", "join", "large", "liblist",
    "library", "localparam", "macromodule", "medium", "module", "nand", "negedge", "nmos", "nor",
    "noshowcancelled", "not", "notif0", "notif1", "or", "output", "parameter", "pmos", "posedge",
    "primitive", "pull0", "pull1", "pulldown", "pullup", "pulsestyle_ondetect",
    "pulsestyle_onevent", "rcmos", "real", "realtime", "reg", "release", "repeat", "rnmos",
    "rpmos", "rtran", "rtranif0", "rtranif1", "scalared", "showcancelled", "signed", "small",
    "specify", "specparam", "strong0", "strong1", "supply0", "supply1", "table", "task", "time",
    "tran", "tranif0", "tranif1", "tri", "tri0", "tri1", "triand", "trior", "trireg", "unsigned",
    "use", "uwire", "vectored", "wait", "wand", "weak0", "weak1", "while", "wire", "wor", "xnor",
    "xor",
};
// clang-format on

// Keywords the 2017 SystemVerilog standard adds.
// clang-format off
const char* const kSystemVerilogKeywords[] = {
    "accept_on", "alias", "always_comb", "always_ff", "always_latch", "assert", "assume", "before",
    "bind", "bins", "binsof", "bit", "break", "byte", "chandle", "checker", "class", "clocking",
    "const", "constraint", "context", "continue", "cover", "covergroup", "coverpoint", "cross",
    "dist", "do", "endchecker", "endclass", "endclocking", "endgroup", "endinterface",
    "endpackage", "endprogram", "endproperty", "endsequence", "enum", "eventually", "expect",
    "export", "extends", "extern", "final", "first_match", "foreach", "forkjoin", "global", "iff",
    "ignore_bins", "illegal_bins", "implements", "implies", "import", "inside", "int",
    "interconnect", "interface", "intersect", "join_any", "join_none", "let", "local", "logic",
    "longint", "matches", "modport", "nettype", "new", "nexttime", "null", "package", "packed",
    "priority", "program", "property", "protected", "pure", "rand", "randc", "randcase",
    "randsequence", "ref", "reject_on", "restrict", "return", "s_always", "s_eventually",
    "s_nexttime", "s_until", "s_until_with", "sequence", "shortint", "shortreal", "soft", "solve",
    "static", "string", "strong", "struct", "super", "sync_accept_on", "sync_reject_on", "tagged",
    "this", "throughout", "timeprecision", "timeunit", "type", "typedef", "union", "unique",
    "unique0", "until", "until_with", "untyped", "var", "virtual", "void", "wait_order", "weak",
    "wildcard", "with", "within",
    // Not a keyword of either standard, but reserved by tools that read
    // the netlists.
    "bool",
};
// clang-format on

struct Cache {
    std::deque<std::string> texts;  // the caller's table, copied
    std::unordered_set<std::string_view> words;
    size_t longest = 0;  // longer names are no keywords, without hashing
    bool built = false;
    void Insert(std::string_view word) {
        words.insert(word);
        if (word.size() > longest) longest = word.size();
    }
};

Cache& GetCache() {
    static Cache cache;
    return cache;
}

}  // namespace

void Nlw_Nl_SpkCache::MakeSpkCache(const char** words, bool flag) {
    Cache& cache = GetCache();
    if (flag || !cache.built) {
        cache.words.clear();
        cache.texts.clear();
        cache.longest = 0;
        for (const char* w : kVerilogKeywords) cache.Insert(w);
        for (const char* w : kSystemVerilogKeywords) cache.Insert(w);
    }
    for (const char** w = words; w && *w; ++w) {
        if (cache.words.count(*w)) continue;
        cache.texts.emplace_back(*w);
        cache.Insert(cache.texts.back());
    }
    cache.built = true;
}

bool Nlw_Nl_SpkCache::IsKeyword(const char* name) {
    return name && IsKeyword(name, std::strlen(name));
}

bool Nlw_Nl_SpkCache::IsKeyword(const char* name, size_t len) {
    const Cache& cache = GetCache();
    return cache.built && name && len <= cache.longest &&
           cache.words.count(std::string_view(name, len)) != 0;
}

bool Nlw_Nl_SpkCache::IsBuilt() {
    return GetCache().built;
}

void Nlw_Nl_SpkCache::Clear() {
    Cache& cache = GetCache();
    cache.words.clear();
    cache.texts.clear();
    cache.longest = 0;
    cache.built = false;
}

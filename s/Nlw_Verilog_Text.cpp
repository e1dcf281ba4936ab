// Identifier text: reserved words, escaping, bus ranges and bus indexes.
#include <string>

#include "../host/Nlw_Nl.h"
#include "../host/Port.h"
#include "../host/UT.h"
#include "Nlw_Verilog.h"

namespace {

// The Verilog keywords handed to the host keyword cache before names are
// legalized.
const char* kReservedWords[] = {
    "always",      "and",          "assign",    "attribute",   "begin",     "buf",
    "bufif0",      "bufif1",       "case",      "casex",       "casez",     "cmos",
    "deassign",    "default",      "defparam",  "disable",     "edge",      "else",
    "end",         "endattribute", "endcase",   "endfunction", "endmodule", "endprimitive",
    "endspecify",  "endtable",     "endtask",   "event",       "for",       "force",
    "forever",     "fork",         "function",  "highz0",      "highz1",    "if",
    "initial",     "inout",        "input",     "integer",     "join",      "large",
    "macromodule", "medium",       "module",    "nand",        "negedge",   "nmos",
    "nor",         "not",          "notif0",    "notif1",      "or",        "output",
    "parameter",   "pmos",         "posedge",   "primitive",   "pull0",     "pull1",
    "pulldown",    "pullup",       "rcmos",     "reg",         "release",   "repeat",
    "rnmos",       "rpmos",        "rtran",     "rtranif0",    "rtranif1",  "scalared",
    "small",       "specify",      "specparam", "strength",    "strong0",   "strong1",
    "supply0",     "supply1",      "table",     "task",        "time",      "tran",
    "tranif0",     "tranif1",      "tri",       "tri0",        "tri1",      "triand",
    "trior",       "trireg",       "use",       "vectored",    "wait",      "wand",
    "weak0",       "weak1",        "while",     "wire",        "wor",       "xnor",
    "xor",         nullptr,
};

// Each text operation owns one result buffer that its next call overwrites.
// The buffers grow for long names; the reserve keeps the usual names from
// moving them, so a result pointer of the previous call reads the new text.
std::string& ResultBuffer(int which) {
    static std::string buffers[3] = {std::string(), std::string(), std::string()};
    std::string& buffer = buffers[which];
    if (buffer.capacity() < 2048) buffer.reserve(2048);
    return buffer;
}

enum { kEscapeBuffer = 0, kRangeBuffer = 1, kIndexesBuffer = 2 };

bool IsSimpleIdentifier(const std::string& name) {
    for (size_t i = 0; i < name.size(); ++i) {
        if (!Nlw_Verilog::IsSimpleIdentifierChar(static_cast<unsigned char>(name[i]), i == 0))
            return false;
    }
    return true;
}

}  // namespace

const char** Nlw_Verilog::GetReservedWords() {
    return kReservedWords;
}

// An escaped name begins with a backslash and ends with a space, or with a
// space followed by a bracketed bus index.
unsigned char Nlw_Verilog::IsEscaped(const char* name) {
    if (name == nullptr) return 0;
    return UT_STR::IMatch(name, "\\* ") != 0 || UT_STR::IMatch(name, "\\* [*]") != 0;
}

const char* Nlw_Verilog::Escape(const char* name, unsigned char isBused) {
    std::string& result = ResultBuffer(kEscapeBuffer);
    if (name == nullptr) {
        result.clear();
        return result.c_str();
    }
    // Work on a copy: the name may be a result of an earlier call that lives
    // in the buffer itself.
    std::string candidate = name;
    DARRAY_Util_INT32 indexes;
    bool isBusBit = false;
    if (isBused) {
        std::string base;
        if (Nlw_NlBus::IsBusName(name, base, &indexes)) {
            isBusBit = true;
            candidate.swap(base);
        }
    }
    if (this->IsEscaped(candidate.c_str())) return name;

    if (IsSimpleIdentifier(candidate)) {
        result = candidate;
    } else {
        result = "\\";
        result += candidate;
        result += ' ';
    }
    if (isBusBit) result += this->GetIndexesString(&indexes);
    return result.c_str();
}

// A bus without dimensions leaves the buffer as the previous call left it.
// Should a bus ever have more than one dimension, each range follows the
// previous one.
const char* Nlw_Verilog::GetRangeString(Nlw_NlBus* bus) {
    std::string& result = ResultBuffer(kRangeBuffer);
    if (bus == nullptr || bus->GetDimension() < 1) return result.c_str();
    const int type = Nlw_NlBus::GetOutputDelimiterType();
    const char left = Nlw_NlBus::GetLeftDelimiter(type);
    const char right = Nlw_NlBus::GetRightDelimiter(type);
    result.clear();
    for (int d = 0; d < bus->GetDimension(); ++d) {
        const bool msbFirst = bus->GetOrder(d) == 0;
        const int32_t first = msbFirst ? bus->GetMSB(d) : bus->GetLSB(d);
        const int32_t second = msbFirst ? bus->GetLSB(d) : bus->GetMSB(d);
        Port_AppendFormat(result, "%c%d : %d%c", left, static_cast<int>(first),
                          static_cast<int>(second), right);
    }
    return result.c_str();
}

// An empty index array leaves the buffer as the previous call left it.
// Several indexes are written one bracket pair each.
const char* Nlw_Verilog::GetIndexesString(DARRAY_Util_INT32* indexes) {
    std::string& result = ResultBuffer(kIndexesBuffer);
    if (indexes == nullptr || indexes->GetCount() == 0) return result.c_str();
    const int type = Nlw_NlBus::GetOutputDelimiterType();
    const char left = Nlw_NlBus::GetLeftDelimiter(type);
    const char right = Nlw_NlBus::GetRightDelimiter(type);
    result.clear();
    for (size_t i = 0; i < indexes->GetCount(); ++i)
        Port_AppendFormat(result, "%c%d%c", left, static_cast<int>((*indexes)[i]), right);
    return result.c_str();
}

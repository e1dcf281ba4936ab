// Identifier text: reserved words, escaping, bus ranges and bus indexes.
#include <charconv>
#include <cstring>
#include <string>
#include <typeinfo>

#include "Nlw_Verilog.h"
#include "model/Nlw_Nl.h"
#include "model/Nlw_NlBuilder.h"
#include "port/Port.h"
#include "port/UT.h"

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
    // One set per thread: module definitions may be written on two.
    thread_local std::string buffers[3] = {std::string(), std::string(), std::string()};
    std::string& buffer = buffers[which];
    if (buffer.capacity() < 2048) buffer.reserve(2048);
    return buffer;
}

enum { kEscapeBuffer = 0, kRangeBuffer = 1, kIndexesBuffer = 2 };

bool IsSimpleIdentifier(const char* name) {
    for (size_t i = 0; name[i] != '\0'; ++i) {
        if (!Nlw_Verilog::IsSimpleIdentifierChar(static_cast<unsigned char>(name[i]), i == 0))
            return false;
    }
    return true;
}

// The common bus bit: a simple identifier with one index, written as the
// writer writes indexes ("data[3]"). Splitting it and joining it again gives
// the same text, so it stands as it is.
bool IsPlainBusBit(const char* name) {
    const size_t end = std::strlen(name);
    const int type = Nlw_NlBus::GetOutputDelimiterType();
    size_t left = 0;
    int32_t value = 0;
    if (!Nlw_NlSplitIndex(name, end, type, left, value) || left == 0 ||
        name[left] != Nlw_NlBus::GetLeftDelimiter(type) ||
        name[end - 1] != Nlw_NlBus::GetRightDelimiter(type))
        return false;
    for (size_t i = 0; i < left; ++i)
        if (!Nlw_Verilog::IsSimpleIdentifierChar(static_cast<unsigned char>(name[i]), i == 0))
            return false;
    // The index as the writer writes it: no leading zeros.
    char again[16];
    const std::to_chars_result written = std::to_chars(again, again + sizeof again, value);
    const size_t length = end - left - 2;
    return static_cast<size_t>(written.ptr - again) == length &&
           std::memcmp(again, name + left + 1, length) == 0;
}

// Makes buffer "\name " in place, so that earlier results keep reading the
// buffer; name may itself point into the buffer.
void AssignEscaped(std::string& buffer, const char* name) {
    const char* begin = buffer.data();
    if (name >= begin && name <= begin + buffer.size()) {
        const std::string copy(name);
        AssignEscaped(buffer, copy.c_str());
        return;
    }
    buffer.assign(1, '\\');
    buffer += name;
    buffer += ' ';
}

}  // namespace

const char** Nlw_Verilog::GetReservedWords() {
    return kReservedWords;
}

// An escaped name begins with a backslash and ends with a space, or with a
// space followed by a bracketed bus index.
unsigned char Nlw_Verilog::IsEscaped(const char* name) {
    // Only a name that starts with a backslash can match; most names do not,
    // and this runs for every name written.
    if (name == nullptr || name[0] != '\\') return 0;
    return UT_STR::IMatch(name, "\\* ") != 0 || UT_STR::IMatch(name, "\\* [*]") != 0;
}

const char* Nlw_Verilog::Escape(const char* name, unsigned char isBused) {
    std::string& result = ResultBuffer(kEscapeBuffer);
    if (name == nullptr) {
        result.clear();
        return result.c_str();
    }
    if (!isBused) {
        // The common case: no bus index to split off, so the name is tested
        // in place (it may be an earlier result living in the buffer itself,
        // which std::string::assign handles).
        if (this->IsEscaped(name)) {
            // Every call takes the buffer over, this one included: a result
            // kept from an earlier call now reads the name given.
            result.assign(name);
            return name;
        }
        if (IsSimpleIdentifier(name))
            result.assign(name);
        else
            AssignEscaped(result, name);
        return result.c_str();
    }
    // A class of its own may write indexes its own way: it is asked.
    if (typeid(*this) == typeid(Nlw_Verilog) && IsPlainBusBit(name)) {
        result.assign(name);
        return result.c_str();
    }
    // The base part of a bus-bit name goes to a working buffer of its own;
    // like the result, it is reused by every call.
    thread_local std::string base;
    thread_local DARRAY_Util_INT32 indexes;
    const bool isBusBit = Nlw_NlBus::IsBusName(name, base, &indexes);
    const char* candidate = isBusBit ? base.c_str() : name;
    if (this->IsEscaped(candidate)) {
        result.assign(name);
        return name;
    }

    if (IsSimpleIdentifier(candidate))
        result.assign(candidate);
    else
        AssignEscaped(result, candidate);
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
    // Written for every bus bit of every port map: appended directly rather
    // than formatted.
    char digits[16];
    for (size_t i = 0; i < indexes->GetCount(); ++i) {
        const std::to_chars_result end =
            std::to_chars(digits, digits + sizeof digits, static_cast<int>((*indexes)[i]));
        result += left;
        result.append(digits, end.ptr);
        result += right;
    }
    return result.c_str();
}

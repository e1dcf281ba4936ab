// The Verilog name legalizer: the two questions the host legalizer asks of a
// format.
#include "Nlw_VerilogLU.h"

#include <cstring>
#include <string>
#include <typeinfo>

#include "Nlw_Verilog.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

Nlw_VerilogLU::Nlw_VerilogLU(Nlw_Verilog* nlw, Nlw_NlView* view, bool first, bool second,
                             bool third, bool fourth, bool fifth)
    : Nlw_Nl_LU(view, third, fourth, fifth, first), writeEscapedNames(second), nlw(nlw) {}

Nlw_VerilogLU::Nlw_VerilogLU(const Nlw_VerilogLU& other)
    : Nlw_Nl_LU(other), writeEscapedNames(other.writeEscapedNames), nlw(other.nlw) {}

Nlw_VerilogLU& Nlw_VerilogLU::operator=(const Nlw_VerilogLU& other) {
    Nlw_Nl_LU::operator=(other);
    writeEscapedNames = other.writeEscapedNames;
    nlw = other.nlw;
    return *this;
}

namespace {

// With escaping on, the space is the only character an escaped identifier
// cannot hold; with escaping off, the simple identifier rule applies.
bool IsIllegalChar(unsigned char c, bool first, bool writeEscapedNames) {
    if (writeEscapedNames) return c == ' ';
    return !Nlw_Verilog::IsSimpleIdentifierChar(c, first);
}

}  // namespace

bool Nlw_VerilogLU::IsLegal(Port::String name, bool isBused) {
    if (nlw != nullptr && nlw->IsEscaped(name.c_str())) return true;
    // The base part of a bus-bit name goes to working buffers that every
    // call reuses: the legalizer asks this of every name in the design.
    thread_local std::string base;
    thread_local DARRAY_Util_INT32 indexes;
    const char* text = name.c_str();
    size_t length = name.length();
    if (isBused && Nlw_NlBus::IsBusName(text, base, &indexes)) {
        text = base.c_str();
        length = base.size();
    }
    // Escaped, only a space is illegal.
    if (writeEscapedNames) return std::memchr(text, ' ', length) == nullptr;
    for (size_t i = 0; i < length; ++i) {
        if (IsIllegalChar(static_cast<unsigned char>(text[i]), i == 0, writeEscapedNames))
            return false;
    }
    return true;
}

bool Nlw_VerilogLU::AnswersOnTwoThreads() const {
    return typeid(*this) == typeid(Nlw_VerilogLU) &&
           (nlw == nullptr || typeid(*nlw) == typeid(Nlw_Verilog));
}

Port::String Nlw_VerilogLU::Legalize(Port::String name, bool isBused) {
    if (nlw != nullptr && nlw->IsEscaped(name.c_str())) return name;
    DARRAY_Util_INT32 indexes;
    bool isBusBit = false;
    if (isBused) {
        std::string base;
        if (Nlw_NlBus::IsBusName(name.c_str(), base, &indexes)) {
            isBusBit = true;
            name = base.c_str();
        }
    }
    const size_t length = name.length();
    for (size_t i = 0; i < length; ++i) {
        if (IsIllegalChar(static_cast<unsigned char>(name[i]), i == 0, writeEscapedNames))
            name.SetChar(i, '_');
    }
    if (isBusBit) {
        if (nlw != nullptr) {
            name += nlw->GetIndexesString(&indexes);
        } else {
            const int type = Nlw_NlBus::GetOutputDelimiterType();
            for (int32_t index : indexes)
                name += vorform("%c%d%c", Nlw_NlBus::GetLeftDelimiter(type),
                                static_cast<int>(index), Nlw_NlBus::GetRightDelimiter(type));
        }
    }
    return name;
}

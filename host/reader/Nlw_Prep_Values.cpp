// Parameter values as the writers want them: converted to the kind a
// simulation library definition expects, or as Verilog literals.
#include <cerrno>
#include <climits>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>

#include "model/Vdm_Property.h"
#include "port/UT.h"
#include "reader/Nlw_Prep.h"

namespace {

bool Is(const char* type, const char* what) {
    return UT_STR::ICompare(type, what) == 0;
}

bool HasUnknownBits(std::string_view bits) {
    return bits.find_first_not_of("01") != std::string::npos;
}

// Hexadecimal digits of a bit text (most significant first), padded with
// zeros to whole digits; x and z count as 0.
std::string BitsToHex(std::string_view bits) {
    static const char kDigits[] = "0123456789ABCDEF";
    size_t pad = (4 - bits.size() % 4) % 4;
    std::string hex;
    hex.reserve((bits.size() + pad) / 4);
    unsigned nibble = 0;
    size_t count = pad;
    for (char c : bits) {
        nibble = (nibble << 1) | (c == '1' ? 1u : 0u);
        if (++count == 4) {
            hex += kDigits[nibble];
            nibble = 0;
            count = 0;
        }
    }
    return hex;
}

// The value of a bit text as a 32-bit integer: the low 32 bits, x and z as 0.
int32_t BitsToInt(std::string_view bits) {
    uint32_t v = 0;
    for (char c : bits) v = (v << 1) | (c == '1' ? 1u : 0u);
    return static_cast<int32_t>(v);
}

std::string UnsignedToBase(uint32_t v, unsigned shift) {
    static const char kDigits[] = "0123456789ABCDEF";
    std::string t;
    do {
        t.insert(t.begin(), kDigits[v & ((1u << shift) - 1)]);
        v >>= shift;
    } while (v);
    return t;
}

bool ParseInt(const char* text, int32_t& out) {
    if (!text || !*text) return false;
    char* end = nullptr;
    errno = 0;
    long long v = std::strtoll(text, &end, 10);
    if (errno || *end || v < INT32_MIN || v > INT32_MAX) return false;
    out = static_cast<int32_t>(v);
    return true;
}

// A real literal that reads back as the same double and is never taken for
// an integer.
std::string RealText(double v) {
    char buf[40];
    for (int precision = 15; precision <= 17; ++precision) {
        std::snprintf(buf, sizeof buf, "%.*g", precision, v);
        if (std::strtod(buf, nullptr) == v) break;
    }
    std::string t = buf;
    if (t.find_first_of(".eE") == std::string::npos) t += ".0";
    return t;
}

std::string QuotedText(const char* text) {
    std::string t = "\"";
    for (const char* p = text ? text : ""; *p; ++p) {
        unsigned char c = static_cast<unsigned char>(*p);
        if (c == '\\' || c == '"') {
            t += '\\';
            t += static_cast<char>(c);
        } else if (c == '\n') {
            t += "\\n";
        } else if (c == '\t') {
            t += "\\t";
        } else if (c < 0x20 || c == 0x7F) {
            char oct[8];
            std::snprintf(oct, sizeof oct, "\\%03o", c);
            t += oct;
        } else {
            t += static_cast<char>(c);
        }
    }
    return t + "\"";
}

}  // namespace

std::unique_ptr<Vdm_Property> Nlw_Prep::Convert(const Vdm_Property& value, const char* typeText) {
    const char* name = value.GetName();
    const char* type = typeText ? typeText : "";
    std::unique_ptr<Vdm_Property> out;
    switch (value.GetType()) {
        case VDM_PROP_BITS: {
            // A bits property always has its text.
            const std::string_view bits = value.GetString();
            int32_t n = BitsToInt(bits);
            if (Is(type, "HV"))
                out.reset(Vdm_Property::NewString(name, BitsToHex(bits).c_str()));
            else if (Is(type, "BV"))
                out.reset(Vdm_Property::NewString(name, value.GetString()));
            else if (Is(type, "I") || Is(type, "S"))
                out.reset(Vdm_Property::NewInt(name, n));
            else if (Is(type, "F"))
                out.reset(Vdm_Property::NewFloat(name, static_cast<double>(n)));
            else if (Is(type, "BL"))
                out.reset(Vdm_Property::NewString(name, n ? "TRUE" : "FALSE"));
            break;
        }
        case VDM_PROP_INT: {
            uint32_t u = static_cast<uint32_t>(value.GetInt32());
            if (Is(type, "HV"))
                out.reset(Vdm_Property::NewString(name, UnsignedToBase(u, 4).c_str()));
            else if (Is(type, "BV"))
                out.reset(Vdm_Property::NewString(name, UnsignedToBase(u, 1).c_str()));
            else if (Is(type, "F"))
                out.reset(Vdm_Property::NewFloat(name, value.GetInt32()));
            else if (Is(type, "BL"))
                out.reset(Vdm_Property::NewString(name, u ? "TRUE" : "FALSE"));
            break;
        }
        case VDM_PROP_FLOAT: {
            double d = value.GetFloat();
            if (Is(type, "I") && std::isfinite(d) && d == std::floor(d) && d >= INT32_MIN &&
                d <= INT32_MAX)
                out.reset(Vdm_Property::NewInt(name, static_cast<int32_t>(d)));
            break;
        }
        case VDM_PROP_STRING: {
            int32_t n;
            if (Is(type, "I") && ParseInt(value.GetString(), n))
                out.reset(Vdm_Property::NewInt(name, n));
            break;
        }
        case VDM_PROP_BOOL:
            if (Is(type, "BL"))
                out.reset(Vdm_Property::NewString(name, value.GetBool() ? "TRUE" : "FALSE"));
            break;
        default:
            break;
    }
    return out;
}

bool Nlw_Prep::VerilogLiteral(const Vdm_Property& value, std::string& out) {
    switch (value.GetType()) {
        case VDM_PROP_BITS: {
            const std::string_view bits = value.GetString();
            if (bits.empty()) return false;
            if (bits.size() % 4 == 0 && !HasUnknownBits(bits)) {
                out = std::to_string(bits.size()) + "'h" + BitsToHex(bits);
            } else {
                out = std::to_string(bits.size()) + "'b";
                out.append(bits);
            }
            return true;
        }
        case VDM_PROP_INT:
            out = std::to_string(value.GetInt32());
            return true;
        case VDM_PROP_FLOAT:
            if (!std::isfinite(value.GetFloat())) return false;
            out = RealText(value.GetFloat());
            return true;
        case VDM_PROP_STRING:
            out = QuotedText(value.GetString());
            return true;
        case VDM_PROP_BOOL:
            out = value.GetBool() ? "1'b1" : "1'b0";
            return true;
        default:
            return false;
    }
}

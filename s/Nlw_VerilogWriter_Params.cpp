// Cell parameters: which properties are written, how each is formatted
// (inline "#( ... )" list or defparam statements), and whether a string is a
// hexadecimal or a bit-string literal.
#include <cctype>
#include <cstdlib>
#include <cstring>
#include <string>

#include "Nlw_VerilogWriter.h"
#include "framework/Nlw_Params.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "port/UT.h"

namespace {

// Type names this long or longer are not looked up in the type library.
constexpr size_t kMaxTypeNameLength = 256;

bool IEquals(const char* a, const char* b) {
    return UT_STR::ICompare(a, b) == 0;
}

// Plain strings are written as upper-case string literals; a quote or a
// backslash in the value must not end the literal.
void AppendUpperStringLiteral(std::string& out, const char* text) {
    out += '"';
    for (const char* p = text; *p; ++p) {
        char c = *p;
        if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
        if (c == '"' || c == '\\') out += '\\';
        out += c;
    }
    out += '"';
}

bool IsDigitOf(char c, bool hex) {
    c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return c == '0' || c == '1' || c == 'x' || c == 'z' ||
           (hex && ((c >= '2' && c <= '9') || (c >= 'a' && c <= 'f')));
}

// Hexadecimal digits as bits, four per digit; x and z stay x and z.
std::string HexToBits(const std::string& hex) {
    std::string bits;
    for (char c : hex) {
        const char l = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
        if (l == 'x' || l == 'z') {
            bits.append(4, l);
            continue;
        }
        const int v = l <= '9' ? l - '0' : l - 'a' + 10;
        for (int k = 3; k >= 0; --k) bits += ((v >> k) & 1) ? '1' : '0';
    }
    return bits;
}

// Bits as hexadecimal digits, padded with zeros on the left to whole digits;
// a digit holding an x or z bit is x or z.
std::string BitsToHex(const std::string& bits) {
    const std::string padded = std::string((4 - bits.size() % 4) % 4, '0') + bits;
    std::string hex;
    for (size_t i = 0; i < padded.size(); i += 4) {
        int v = 0;
        char unknown = 0;
        for (size_t k = 0; k < 4; ++k) {
            const char c =
                static_cast<char>(std::tolower(static_cast<unsigned char>(padded[i + k])));
            if (c == 'x' || c == 'z') unknown = unknown ? unknown : c;
            v = v * 2 + (c == '1');
        }
        hex += unknown ? unknown : "0123456789ABCDEF"[v];
    }
    return hex;
}

}  // namespace

bool Nlw_VerilogWriter::DecodeLiteral(const char* text, RawParam& raw) {
    raw = RawParam();
    raw.literal = text;
    const std::string t = text;
    const size_t tick = t.find('\'');
    if (tick != std::string::npos && tick > 0 && tick + 2 < t.size() &&
        t.find_first_not_of("0123456789") == tick) {
        const char radix = static_cast<char>(std::tolower(static_cast<unsigned char>(t[tick + 1])));
        if (radix != 'h' && radix != 'b') return false;
        raw.digits = t.substr(tick + 2);
        for (char c : raw.digits)
            if (!IsDigitOf(c, radix == 'h')) return false;
        raw.kind = radix == 'h' ? RawParam::Hex : RawParam::Bits;
        return true;
    }
    if (t.size() >= 2 && t.front() == '"' && t.back() == '"') {
        for (size_t i = 1; i + 1 < t.size(); ++i) {
            if (t[i] == '\\' && i + 2 < t.size()) ++i;
            raw.digits += t[i];
        }
        raw.kind = RawParam::String;
        return true;
    }
    // A decimal integer or a real, as the preparation pass writes them.
    char* end = nullptr;
    std::strtod(text, &end);
    if (end != text && *end == '\0' && t.find_first_of("0123456789") == t.find_first_not_of("+-")) {
        raw.kind = RawParam::Number;
        return true;
    }
    return false;
}

void Nlw_VerilogWriter::AppendRawValue(const RawParam& raw, Vdm_Property* element,
                                       Nlw_NlBlock* block) {
    switch (raw.kind) {
        case RawParam::Hex:
        case RawParam::Bits: {
            const bool hexKind = IsHexStringProperty(element, block);
            const bool bitKind = !hexKind && IsBitStringProperty(element, block);
            if (hexKind) {
                const std::string hex =
                    raw.kind == RawParam::Hex ? raw.digits : BitsToHex(raw.digits);
                Port_AppendFormat(line_, "%zu'h%s", 4 * hex.size(), hex.c_str());
            } else if (bitKind) {
                const std::string bits =
                    raw.kind == RawParam::Bits ? raw.digits : HexToBits(raw.digits);
                Port_AppendFormat(line_, "%zu'b%s", bits.size(), bits.c_str());
            } else {
                // A vector the device data names neither way keeps its literal.
                line_ += raw.literal;
            }
            break;
        }
        case RawParam::String:
        case RawParam::Number:
            // Numbers as they stand, and the design's own text in its own
            // case: string parameters are compared with case.
            line_ += raw.literal;
            break;
    }
}

unsigned char Nlw_VerilogWriter::IsExternalProperty(Vdm_Property* property, Nlw_NlBlock* block) {
    const unsigned char base = Nlw_Writer::IsExternalProperty(property, block);
    if (!base) return 0;
    // Functional models have no message or X-generation switches.
    if (IEquals(property->GetName(), "MSGON") || IEquals(property->GetName(), "XON"))
        return GetParams()->GetFuncellMode() ? 0 : base;
    return base;
}

bool Nlw_VerilogWriter::IsHexStringProperty(Vdm_Property* property, Nlw_NlBlock* block) {
    return IsStringPropertyOfKind(property, block, "'h", hexStringPropertyTable_);
}

bool Nlw_VerilogWriter::IsBitStringProperty(Vdm_Property* property, Nlw_NlBlock* block) {
    return IsStringPropertyOfKind(property, block, "'b", bitStringPropertyTable_);
}

bool Nlw_VerilogWriter::IsStringPropertyOfKind(Vdm_Property* property, Nlw_NlBlock* block,
                                               const char* marker, const NameSet& table) {
    // The type library can only add names to the table's, never remove one.
    Ldm_TypeLib* typeLib = GetNlw()->GetTypeLib();
    Vdm_PropertyHolder* holder = block ? block->GetDataBlock() : nullptr;
    Vdm_Property* typeProp = holder ? holder->GetPropertyByName("TYPE") : nullptr;
    const char* typeName = typeProp ? typeProp->GetString() : nullptr;
    if (typeLib && typeName) {
        Ldm_TypeBlock* typeBlock = typeLib->GetBlockByName(typeName);
        // A simulation cell V_<name> is described under <name>.
        if (!typeBlock && std::strlen(typeName) < kMaxTypeNameLength &&
            std::strstr(typeName, "V_")) {
            const char* underscore = std::strchr(typeName, '_');
            if (underscore && underscore[1]) typeBlock = typeLib->GetBlockByName(underscore + 1);
        }
        if (typeBlock) {
            for (Vdm_Property* def : typeBlock->GetPropertyCItr("Config_General_Data")) {
                if (!def || def->GetType() != VDM_PROP_TYPEDEF) continue;
                if (!IEquals(def->GetName(), property->GetName())) continue;
                const std::vector<std::string>& values = def->GetValueTexts();
                if (values.empty() || values[0].find(marker) == std::string::npos) continue;
                if (block->GetPropertyByName(def->GetName())) return true;
            }
        }
    }
    return table.count(Port::String(property->GetName())) != 0;
}

bool Nlw_VerilogWriter::FormatParam(Vdm_Property* element, Nlw_NlBlock* block, bool typed,
                                    bool inlineForm, const char* instance) {
    const char* name = element->GetName();
    line_.clear();
    // The head of the text: ".name ( " inline, "defparam inst.name = " else.
    // A name that is no simple identifier (a black box's "a-b") is escaped;
    // every other name stands as it is.
    auto head = [&](const char* paramName) {
        if (inlineForm) {
            line_ += '.';
            line_ += GetNlw()->Escape(paramName, 0);
            line_ += " ( ";
        } else {
            line_ += "defparam ";
            line_ += instance;
            line_ += '.';
            line_ += GetNlw()->Escape(paramName, 0);
            line_ += " = ";
        }
    };
    auto tail = [&]() { line_ += inlineForm ? " )" : ";"; };

    if (!typed) {
        // The host has made the value Verilog-ready text.
        const char* text = element->GetString();
        if (!text) return false;
        head(name);
        line_ += text;
        tail();
        return true;
    }

    // The preparation pass hands Verilog-ready texts; typed formatting works
    // on the raw typed values they stand for, so that both formattings give
    // the same valid value.
    if (element->GetType() == VDM_PROP_STRING && element->GetString()) {
        RawParam raw;
        // A bare digit string of a vector property is a raw value already.
        if (DecodeLiteral(element->GetString(), raw) &&
            (raw.kind != RawParam::Number ||
             (!IsHexStringProperty(element, block) && !IsBitStringProperty(element, block)))) {
            head(name);
            AppendRawValue(raw, element, block);
            tail();
            return true;
        }
    }

    switch (element->GetType()) {
        case VDM_PROP_FLOAT:
            head(name);
            Port_AppendFormat(line_, "%.4f", element->GetFloat());
            tail();
            return true;
        case VDM_PROP_INT:
            head(name);
            if (IsHexStringProperty(element, block))
                Port_AppendFormat(line_, "12'h%03X", static_cast<unsigned>(element->GetInt32()));
            else
                Port_AppendFormat(line_, "%d", element->GetInt32());
            tail();
            return true;
        case VDM_PROP_STRING:
            break;
        default:
            return false;
    }

    const char* value = element->GetString();
    if (!value) value = "";
    const size_t length = std::strlen(value);
    if (IsHexStringProperty(element, block)) {
        head(name);
        Port_AppendFormat(line_, "%zu'h%s", 4 * length, value);
        tail();
    } else if (IsBitStringProperty(element, block)) {
        if (IEquals(name, "XON") && IEquals(value, "TRUE")) {
            // A true XON lets timing violations drive the outputs to x.
            if (inlineForm) {
                line_ += ".notifier ( 1'bx )";
            } else {
                line_ += "initial assign ";
                line_ += instance;
                line_ += ".notifier = 1'bx;";
            }
            return true;
        }
        head(IEquals(name, "INIT_BIT") ? "INIT" : name);
        Port_AppendFormat(line_, "%zu'b%s", length, value);
        tail();
    } else {
        head(name);
        AppendUpperStringLiteral(line_, value);
        tail();
    }
    return true;
}

void Nlw_VerilogWriter::WriteInlineParamStatements(Nlw_NlBlock* block) {
    Vdm_Property* list = FindExternalProperties(block->GetDataBlock());
    if (!list || list->GetCount() == 0) return;

    int count = 0;
    for (Vdm_Property* element : list->GetElements()) {
        const bool typed = Port_Env::GetEnv("NLW_OLD_PFD") != nullptr;
        if (!element || !FormatParam(element, block, typed, true, nullptr)) {
            if (element)
                NLW_MSG().issueInternal(
                    "Unexpected %s property type (name='%s') in external list on %s.\n",
                    element->GetPropertyTypeName(), element->GetName(), block->ToString().c_str());
            continue;
        }
        if (count++ == 0) {
            WriteL("#(");
            UpIndent();
        } else {
            WriteL(",");
        }
        WriteI(line_.c_str());
    }
    if (count > 0) {
        WriteL(")");
        DownIndent();
    }
}

void Nlw_VerilogWriter::WriteExternalProperties(Vdm_Property* list, Nlw_NlBlock* block) {
    if (!list) return;
    std::string instance;
    for (Vdm_Property* element : list->GetElements()) {
        if (!element) continue;
        if (instance.empty()) instance = GetNlw()->Escape(block->GetInstanceName(), 0);
        const bool typed = Port_Env::GetEnv("NLW_OLD_PFD") != nullptr;
        if (!FormatParam(element, block, typed, false, instance.c_str())) {
            NLW_MSG().issueInternal(
                "Unexpected %s property type (name='%s') in external list on %s.\n",
                element->GetPropertyTypeName(), element->GetName(), block->ToString().c_str());
            continue;
        }
        WriteIL(line_.c_str());
    }
}

void Nlw_VerilogWriter::WriteDefparamStatements(Nlw_NlBlock* block) {
    WriteExternalProperties(FindExternalProperties(block->GetDataBlock()), block);
}

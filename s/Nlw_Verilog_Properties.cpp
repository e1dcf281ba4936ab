// Turns a cell property into the Verilog text of the parameter that the
// simulation library defines for the cell type.
#include <cctype>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <vector>

#include "Nlw_Verilog.h"
#include "model/Nlw_Nl.h"
#include "model/Vdm_Property.h"
#include "port/Port.h"

namespace {

bool TypeIs(const Nlw_Property& definition, const char* type) {
    return definition.GetType().Compare(type, Port::String::IgnoreCase) == 0;
}

const Nlw_Property* FindDefinition(const Nlw_SimPropTable& table, const char* typeName,
                                   const Port::String& parameterName) {
    // The table orders its keys ignoring case, so find gives the entry whose
    // key equals the type name ignoring case.
    const auto entry = table.find(typeName ? typeName : "");
    if (entry == table.end() || entry->second == nullptr) return nullptr;
    return Nlw_Property::Find(*entry->second, parameterName.c_str());
}

// The width part of a default such as 16'h0000: the text before the
// apostrophe when the default is exactly two non-empty pieces around
// apostrophes, or empty.
std::string DefaultWidthText(const char* text) {
    std::string first;
    size_t pieces = 0;
    for (const char* p = text; *p;) {
        const char* end = p;
        while (*end && *end != '\'') ++end;
        if (end != p && ++pieces == 1) first.assign(p, end);
        if (pieces > 2) return std::string();
        p = *end ? end + 1 : end;
    }
    return pieces == 2 ? first : std::string();
}

// A sized vector literal such as 16'hABCD or 4'b0101. The width comes from the
// definition's default (width, apostrophe, value); a default without that
// form gives the width of the value itself. The value is padded or cut to
// the width's digit count, with a warning.
Port::String MakeVectorText(Nlw_NetlistWriter& nlw, const Nlw_Property& definition,
                            const Port::String& parameterName, const char* text, bool hex) {
    Port::String value(text);
    const uint32_t ownWidth = static_cast<uint32_t>(hex ? 4 * value.length() : value.length());
    std::string widthText = DefaultWidthText(definition.GetDefault().c_str());
    if (widthText.empty()) widthText = std::to_string(ownWidth);
    bool isNumber = false;
    uint32_t width = Port::String(widthText).GetUINT32(&isNumber);
    // A width that is no decimal number, or zero, would make an unusable
    // literal: the value's own width stands in for it.
    if (!isNumber || width == 0) {
        width = ownWidth;
        widthText = std::to_string(ownWidth);
    }
    const size_t digits = hex ? width / 4 + (width % 4 != 0 ? 1 : 0) : width;
    if (value.length() != digits) {
        if (hex)
            NLW_MSG().issueWarning("Padding or triming the value for hex property %s:\n",
                                   parameterName.c_str());
        else
            NLW_MSG().issueWarning("Padding or triming the value for binary property %s:\n",
                                   parameterName.c_str());
        nlw.PadOrTrim(digits, value, "0");
    }
    widthText += hex ? "'h" : "'b";
    widthText += value.str();
    return Port::String(widthText);
}

// A value the literal of its kind can hold: hexadecimal ('h') or binary
// ('b') digits, x and z included, or a finite real ('r').
bool IsNumberText(const char* text, char kind) {
    if (*text == '\0') return false;
    if (kind == 'r') {
        char* end = nullptr;
        const double v = std::strtod(text, &end);
        return *end == '\0' && std::isfinite(v) && !std::isspace(static_cast<unsigned char>(*text));
    }
    for (const char* p = text; *p; ++p) {
        const char c = static_cast<char>(std::tolower(static_cast<unsigned char>(*p)));
        const bool digit = c == '0' || c == '1' || c == 'x' || c == 'z' ||
                           (kind == 'h' && ((c >= '2' && c <= '9') || (c >= 'a' && c <= 'f')));
        if (!digit) return false;
    }
    return true;
}

}  // namespace

unsigned char Nlw_Verilog::AddIfSimulatableProperty(Nlw_NlBlock* block, Vdm_Property* property,
                                                    Vdm_Property* list) {
    if (block == nullptr || property == nullptr || list == nullptr) return 0;
    const Port::String name = Nlw_Property::ParameterName(property->GetName());
    const Nlw_Property* definition = FindDefinition(simPropTable, block->GetTypeName(), name);
    if (definition == nullptr) return 0;

    const char* expected = definition->GetType().c_str();
    Port::String text;
    switch (property->GetType()) {
        case VDM_PROP_BOOL:
            if (!TypeIs(*definition, "BL")) {
                NLW_MSG().issueWarning(
                    "Mismatched property type detected - type %s expected for property %s:, "
                    "but type bool detected, ignored.\n",
                    expected, name.c_str());
                return 0;
            }
            text = "true";
            break;
        case VDM_PROP_FLOAT:
            if (!TypeIs(*definition, "F")) {
                NLW_MSG().issueWarning(
                    "Mismatched property type detected - type %s expected for property %s:, "
                    "but type float detected, ignored.\n",
                    expected, name.c_str());
                return 0;
            }
            text = vorform("%f", property->GetFloat());
            break;
        case VDM_PROP_INT:
            if (TypeIs(*definition, "I")) {
                text = std::to_string(static_cast<int>(property->GetInt32())).c_str();
            } else if (TypeIs(*definition, "S")) {
                text = vorform("\"%d\"", static_cast<int>(property->GetInt32()));
            } else {
                NLW_MSG().issueWarning(
                    "Mismatched property type detected - type %s expected for property %s:, "
                    "but type integer detected, ignored.\n",
                    expected, name.c_str());
                return 0;
            }
            break;
        case VDM_PROP_STRING: {
            const char* value = property->GetString();
            if (value == nullptr) value = "";
            if (TypeIs(*definition, "S")) {
                text = vorform("\"%s\"", value);
            } else if (TypeIs(*definition, "BL")) {
                Port::String upper(value);
                upper.MakeUpper();
                text = vorform("\"%s\"", upper.c_str());
            } else if (TypeIs(*definition, "HV") || TypeIs(*definition, "BV") ||
                       TypeIs(*definition, "F")) {
                const char* kind = TypeIs(*definition, "HV")   ? "hexadecimal"
                                   : TypeIs(*definition, "BV") ? "binary"
                                                               : "real";
                if (!IsNumberText(value, kind[0])) {
                    // Padding or cutting would turn the text into some other
                    // value; nothing sound can be written.
                    NLW_MSG().issueError(
                        "Instance '%s': parameter %s has the value \"%s\", which is no %s "
                        "number.\n",
                        block->GetInstanceName(), definition->GetName().c_str(), value, kind);
                    return 0;
                }
                if (kind[0] == 'r')
                    text = value;
                else
                    text = MakeVectorText(*this, *definition, name, value, kind[0] == 'h');
            } else {
                NLW_MSG().issueWarning(
                    "Mismatched property type detected - type %s expected for property %s:, "
                    "but type string detected, ignored.\n",
                    expected, name.c_str());
                return 0;
            }
            break;
        }
        default:
            NLW_MSG().issueWarning("Invalid property type detected - %s, ignored.\n", name.c_str());
            return 0;
    }
    // Under the model's own spelling: simulators match parameter names with
    // case.
    list->CreatePropertyString(definition->GetName().c_str(), text.c_str());
    return 1;
}

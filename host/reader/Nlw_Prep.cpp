// The preparation pass: installation data into the writer, and each library
// cell's parameters into its external property list.
#include "reader/Nlw_Prep.h"

#include <algorithm>
#include <string>
#include <unordered_map>

#include "framework/Nlw_NetlistWriter.h"
#include "framework/Nlw_Util.h"
#include "port/Port.h"
#include "port/UT.h"
#include "reader/Nlw_JsonReader.h"

namespace {

using Definitions = std::vector<Nlw_Property>;

// A simple identifier, or one that escaping keeps whole (no blank, control
// character or backtick), of a length a reader takes.
bool IsWritableParameterName(const char* name) {
    size_t n = 0;
    for (const char* c = name; *c; ++c, ++n) {
        const unsigned char u = static_cast<unsigned char>(*c);
        if (u <= ' ' || u == 0x7f || u == '`') return false;
    }
    return n > 0 && n <= 2047;
}

void PrepareBlock(Nlw_NetlistWriter& nlw, Nlw_NlBlock* block, const Definitions* defs) {
    size_t count = Nlw_JsonReader::GetParameterCount(*block);
    if (count == 0) {
        block->SetExternalProperties(nullptr);
        return;
    }
    const std::vector<Vdm_Property*>& props = *block->GetProperties();
    std::unique_ptr<Vdm_Property> list(Vdm_Property::NewList("NLW_EXTERNAL_PROPERTIES"));
    std::string literal;
    // Per definition, the parameter that sets it: "INITSTATE" and "INIT_BIT"
    // set "INIT" too, and one model parameter takes one value, so a
    // parameter of the definition's own name wins over such an alias.
    std::vector<std::pair<const Nlw_Property*, Vdm_Property*>> chosen;
    if (defs)
        for (size_t k = 0; k < count; ++k) {
            Vdm_Property* p = props[k];
            const Nlw_Property* def =
                Nlw_Property::Find(*defs, Nlw_Property::ParameterName(p->GetName()));
            if (!def) continue;
            auto same = std::find_if(chosen.begin(), chosen.end(),
                                     [def](const auto& c) { return c.first == def; });
            if (same == chosen.end()) {
                chosen.emplace_back(def, p);
                continue;
            }
            const bool ownName =
                def->GetName().Compare(p->GetName(), Port::String::IgnoreCase) == 0;
            Vdm_Property* dropped = ownName ? same->second : p;
            if (ownName) same->second = p;
            NLW_MSG().issueWarning(
                "Instance '%s': parameter %s is left out, %s sets the same model parameter %s.\n",
                block->GetInstanceName(), dropped->GetName(),
                (ownName ? p : same->second)->GetName(), def->GetName().c_str());
        }
    for (size_t k = 0; k < count; ++k) {
        Vdm_Property* p = props[k];
        if (defs) {
            // A parameter the table does not define is not simulatable.
            const Nlw_Property* def =
                Nlw_Property::Find(*defs, Nlw_Property::ParameterName(p->GetName()));
            if (!def) continue;
            if (std::find_if(chosen.begin(), chosen.end(), [def, p](const auto& c) {
                    return c.first == def && c.second == p;
                }) == chosen.end())
                continue;
            std::unique_ptr<Vdm_Property> converted = Nlw_Prep::Convert(*p, def->GetType().c_str());
            nlw.AddIfSimulatableProperty(block, converted ? converted.get() : p, list.get());
        } else if (!IsWritableParameterName(p->GetName())) {
            // Parameter names are written as they stand; this one would
            // break the statement, and no model can declare it.
            NLW_MSG().issueError(
                "Instance '%s': parameter name \"%.200s\" is no Verilog identifier; the "
                "parameter is left out.\n",
                block->GetInstanceName(), p->GetName());
        } else if (Nlw_Prep::VerilogLiteral(*p, literal)) {
            list->CreatePropertyString(p->GetName(), literal.c_str());
        }
    }
    block->SetExternalProperties(list->GetCount() ? list.release() : nullptr);
}

}  // namespace

Ldm_TypeLib* Nlw_Prep::LoadInstallationData(Nlw_NetlistWriter& nlw) {
    const char* found = Port_Env::GetDataFileName("simprops.dat", 0);
    if (!found) return nullptr;
    std::string path = found;
    if (!nlw.LoadSimPropTable(path.c_str())) return nullptr;
    auto* lib = new Ldm_TypeLib;
    for (const auto& entry : nlw.simPropTable) {
        Ldm_TypeBlock* type = lib->AddBlock(entry.first.c_str());
        if (!entry.second) continue;
        for (const Nlw_Property& def : *entry.second) {
            const char* t = def.GetType().c_str();
            if (UT_STR::ICompare(t, "HV") != 0 && UT_STR::ICompare(t, "BV") != 0) continue;
            type->AddDefinition(
                "Config_General_Data",
                Vdm_Property::NewTypeDef(def.GetName().c_str(), {def.GetDefault().str()}));
        }
    }
    return lib;
}

void Nlw_Prep::PrepareProperties(Nlw_NetlistWriter& nlw) {
    Nlw_NlView* view = nlw.GetView();
    if (!view) return;
    // The table's definitions per library type, looked up once per type.
    std::unordered_map<const Nlw_NlType*, const Definitions*> defsOf;
    for (const Nlw_NlType* type : view->GetTypes()) {
        if (type->IsModule()) continue;
        auto it = nlw.simPropTable.find(Port::String(type->GetName()));
        defsOf.emplace(type, it == nlw.simPropTable.end() ? nullptr : it->second);
    }
    for (Nlw_NlBlock* macro : view->GetMacros())
        for (Nlw_NlBlock* child : macro->GetChildren()) {
            if (child->IsMacro()) continue;
            auto it = defsOf.find(child->GetType());
            PrepareBlock(nlw, child, it == defsOf.end() ? nullptr : it->second);
        }
}

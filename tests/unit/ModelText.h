// The whole of a view as text, for golden-file comparisons: every macro with
// its ports, nets and buses, every child with its properties and pins, the
// global signals and the device. Each object shows what any test may ask of
// it, so that one comparison covers a design read or changed.
#pragma once

#include <string>

#include "model/Nlw_Nl.h"
#include "port/Port.h"

namespace nlwtest {

// A new property of a case table's kind (bits, int, float, bool, list,
// typedef, else a string) and value text.
inline Vdm_Property* NewProperty(const std::string& kind, const char* name, const std::string& v) {
    if (kind == "bits") return Vdm_Property::NewBits(name, v.c_str());
    if (kind == "int") return Vdm_Property::NewInt(name, std::stoi(v));
    if (kind == "float") return Vdm_Property::NewFloat(name, std::stod(v));
    if (kind == "bool") return Vdm_Property::NewBool(name, v == "1");
    if (kind == "list") return Vdm_Property::NewList(name);
    if (kind == "typedef") return Vdm_Property::NewTypeDef(name, {v});
    return Vdm_Property::NewString(name, v.c_str());
}

inline std::string PropertyText(const Vdm_PropertyHolder& h) {
    std::string out;
    if (!h.GetProperties()) return out;
    for (const Vdm_Property* p : *h.GetProperties()) {
        out += std::string(" ") + p->GetName() + ":" + p->GetPropertyTypeName() + "=";
        if (p->GetString())
            out += "'" + std::string(p->GetString()) + "'";
        else if (p->GetType() == VDM_PROP_FLOAT)
            out += vorform("%.17g", p->GetFloat());
        else
            out += std::to_string(p->GetInt32());
    }
    return out;
}

inline std::string NameAndAka(const char* name, const char* aka) {
    return std::string(name) + (aka ? std::string(" aka '") + aka + "'" : "");
}

inline std::string PinText(const Nlw_NlPin& p) {
    static const char* const dirs[] = {"untyped", "input", "output", "inout"};
    std::string out = "    pin " + NameAndAka(p.GetWritableName(), p.GetAka()) + " " +
                      (p.GetDirection() < 4 ? dirs[p.GetDirection()] : "?");
    if (p.GetPinType()) out += " pintype=" + std::to_string(p.GetPinType());
    if (!p.IsVisible()) out += " hidden";
    if (p.GetSignal()) out += std::string(" net=") + p.GetSignal()->GetWritableName();
    if (p.GetChildSignal()) out += std::string(" inside=") + p.GetChildSignal()->GetWritableName();
    return out + PropertyText(p) + "\n";
}

inline std::string ModelText(const Nlw_NlView& view) {
    std::string out;
    for (const Nlw_NlBlock* m : view.GetMacros()) {
        out += "macro " + std::string(m->GetTypeName()) + " " +
               NameAndAka(m->GetInstanceName(), m->GetAka()) + PropertyText(*m) + "\n";
        for (const Nlw_NlPin& p : m->GetPins()) out += PinText(p);
        if (const auto* buses = m->GetPinBuses())
            for (const Nlw_NlPinBus* b : *buses)
                out += vorform("  portbus %s[%d:%d]%s\n", b->GetWritableName(), b->GetMSB(0),
                               b->GetLSB(0), NameAndAka("", b->GetAka()).c_str());
        for (const Nlw_NlSignal* s : m->GetSignals()) {
            out += "  net " + NameAndAka(s->GetWritableName(), s->GetAka());
            if (!s->IsVisible()) out += " hidden";
            out += PropertyText(*s);
            if (s->GetNetwork()) out += " network{" + PropertyText(*s->GetNetwork()) + " }";
            out += "\n";
        }
        if (const auto* buses = m->GetSignalBuses())
            for (const Nlw_NlBus* b : *buses)
                out += vorform("  bus %s[%d:%d]%s\n", b->GetWritableName(), b->GetMSB(0),
                               b->GetLSB(0), NameAndAka("", b->GetAka()).c_str());
        for (const Nlw_NlBlock* c : m->GetChildren()) {
            out += "  " + std::string(c->IsMacro() ? "instance " : "cell ") + c->GetTypeName() +
                   " " + NameAndAka(c->GetInstanceName(), c->GetAka());
            if (c->IsTimcell()) out += " timcell";
            if (c->IsFuncell()) out += " funcell";
            if (c->GetPrimType()) out += " prim=" + std::to_string(c->GetPrimType());
            out += PropertyText(*c) + "\n";
            for (const Nlw_NlPin& p : c->GetPins()) out += PinText(p);
        }
    }
    for (const Nlw_NlSignal* g : {view.GetSetReset(), view.GetTristate()}) {
        if (!g) continue;
        out +=
            std::string(g == view.GetSetReset() ? "setreset " : "tristate ") + g->GetWritableName();
        if (g->GetRefPin()) out += std::string(" refpin=") + g->GetRefPin()->GetWritableName();
        out += "\n";
    }
    if (view.GetPartName())
        out += std::string("part ") + view.GetPartName() + " device " +
               (view.GetDeviceInfo() ? view.GetDeviceInfo() : "-") + "\n";
    return out;
}

// The view's types in stored order, with their akas.
inline std::string TypesText(const Nlw_NlView& view) {
    std::string out;
    for (const Nlw_NlType* t : view.GetTypes())
        out += std::string(t->IsModule() ? "module " : "library ") +
               NameAndAka(t->GetName(), t->GetAka()) + "\n";
    return out;
}

}  // namespace nlwtest

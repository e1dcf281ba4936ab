// Model building shared by the unfolding and the flattening builder: the top
// block, ports, properties, constant port bits and global signals.
#include <algorithm>
#include <cstring>
#include <string>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

const char* const kParamCount = "NLW_PARAM_COUNT";

Vdm_Property* MakeProperty(const Param& p) {
    switch (p.kind) {
        case ValueKind::Bits:
            return Vdm_Property::NewBits(p.name, p.text);
        case ValueKind::Int:
            return Vdm_Property::NewInt(p.name, static_cast<int32_t>(p.i));
        case ValueKind::Float:
            return Vdm_Property::NewFloat(p.name, p.d);
        case ValueKind::Bool:
            return Vdm_Property::NewBool(p.name, p.i != 0);
        case ValueKind::String:
            break;
    }
    return Vdm_Property::NewString(p.name, p.text);
}

}  // namespace

void AddBlockProperties(const Module& m, const Cell& c, const LibType* lt, Text padPinName,
                        Nlw_NlBlock* block) {
    for (uint32_t k = 0; k < c.paramCount; ++k)
        block->AddProperty(MakeProperty(m.params[c.paramFirst + k]));
    if (c.extra == kNone && !(lt && lt->pad)) return;
    const CellExtra& x = m.ExtraOf(c);
    Text pinName = *x.pinName || !lt || !lt->pad ? x.pinName : padPinName;
    bool extra = false;
    // A parameter of the same name stays; the attribute does not replace it.
    if (*pinName && !block->GetPropertyByName("PINNAME")) {
        block->AddProperty(Vdm_Property::NewString("PINNAME", pinName));
        extra = true;
    }
    if (*x.typeAttr && !block->GetPropertyByName("TYPE")) {
        block->AddProperty(Vdm_Property::NewString("TYPE", x.typeAttr));
        extra = true;
    }
    if (extra) block->AddProperty(Vdm_Property::NewInt(kParamCount, int32_t(c.paramCount)));
}

int32_t PadPinRef(const Module& m, const Cell& c, const LibType& lt) {
    if (!lt.pad || lt.padPin < 0) return kConstX;
    for (uint32_t k = 0; k < c.connCount; ++k) {
        const Conn& cn = m.conns[c.connFirst + k];
        if (cn.slot == static_cast<uint32_t>(lt.padPin) && cn.width > 0) return m.refs[cn.bitFirst];
    }
    return kConstX;
}

Nlw_NlType* ModuleType(Module& m, Nlw_NlBuilder& b) {
    if (!m.nlType) m.nlType = b.AddModuleType(m.nameText);
    return m.nlType;
}

Nlw_NlBlock* CreateTop(Design& d, Nlw_NlBuilder& b) {
    CreateLibTypes(d, b);
    Module& top = d.modules[d.top];
    if (*top.part) {
        // A part name reads device-package-speed.
        std::string part(top.part);
        b.SetDevice(part.substr(0, part.find('-')).c_str(), part.c_str());
    }
    Nlw_NlBlock* root = b.CreateRoot(ModuleType(top, b), top.nameText);
    AddPorts(b, top, root);
    return root;
}

void AddPorts(Nlw_NlBuilder& b, const Module& m, Nlw_NlBlock* block) {
    b.ReservePorts(block, m.numPins);
    for (const Port& p : m.ports) {
        if (p.width == 0) continue;
        if (p.IsBus())
            b.AddPortBus(block, p.name, p.dir, p.msb, p.lsb);
        else
            b.AddPort(block, p.name, p.dir);
    }
}

Nlw_NlSignal* ConstSignal(Nlw_NlBuilder& b, Nlw_NlBlock* block, int32_t ref,
                          Nlw_NlSignal* (&cache)[4]) {
    Nlw_NlSignal*& s = cache[-ref - 1];
    if (!s) {
        // Written as the constant itself and never declared.
        s = b.AddSignal(block, ConstName(ref));
        b.SetVisible(s, false);
        s->AddProperty(Vdm_Property::NewInt("NLW_GLOBAL_SIGNAL", 1));
    }
    return s;
}

void ApplyGlobals(const Module& top, Nlw_NlBuilder& b, Nlw_NlBlock* root,
                  const std::vector<Nlw_NlSignal*>& signals) {
    bool haveSetReset = false, haveTristate = false;
    for (const GlobalNet& g : top.globals) {
        if (g.ref < 0) continue;
        bool& have = g.setReset ? haveSetReset : haveTristate;
        if (have) continue;
        have = true;
        Nlw_NlSignal* s = signals[static_cast<size_t>(g.ref)];
        if (!s) continue;
        if (g.setReset)
            b.SetSetReset(s);
        else
            b.SetTristate(s);
        s->AddProperty(
            Vdm_Property::NewInt(g.setReset ? "NLW_SETRESET_CONN" : "NLW_TRISTATE_CONN", g.conn));
        b.GetOrCreateNetwork(s)->AddProperty(Vdm_Property::NewInt("VL_FLOATVAL", g.floatVal));
        // A top-level port on the net is the pin the signal refers to.
        for (Nlw_NlPin& pin : root->GetPins())
            if (pin.GetChildSignal() == s) {
                b.SetRefPin(s, &pin);
                break;
            }
    }
}

}  // namespace nlw_json

size_t Nlw_JsonReader::GetParameterCount(const Vdm_PropertyHolder& block) {
    const std::vector<Vdm_Property*>* props = block.GetProperties();
    if (!props) return 0;
    if (const Vdm_Property* n = block.GetPropertyByName(nlw_json::kParamCount)) {
        int32_t v = n->GetInt32();
        return v < 0 ? 0 : std::min(props->size(), static_cast<size_t>(v));
    }
    size_t k = 0;
    while (k < props->size() && std::strncmp((*props)[k]->GetName(), "NLW_", 4) != 0) ++k;
    return k;
}

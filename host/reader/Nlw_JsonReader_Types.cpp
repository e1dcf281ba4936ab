// Library cell types: where their pins come from, and their model types.
#include <algorithm>
#include <string>

#include "port/Port.h"
#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

void PinsFromLibrary(LibType& lt, const Nlw_CellDef& def) {
    lt.pad = def.pad;
    for (const Nlw_CellPinDef& cp : def.pins) {
        LibType::Pin p;
        p.name = cp.name.c_str();
        p.dir = cp.dir;
        p.bus = cp.bus;
        p.width = static_cast<uint32_t>(cp.Width());
        p.msb = cp.msb;
        p.lsb = cp.lsb;
        p.fixedRange = true;
        p.pad = cp.pad;
        if (p.pad && lt.padPin < 0) lt.padPin = static_cast<int32_t>(lt.pins.size());
        lt.pinIndex.emplace(p.name, static_cast<uint32_t>(lt.pins.size()));
        lt.pins.push_back(p);
    }
}

// A blackbox module's ports describe its pins; a port of one bit is a
// scalar pin whatever its index.
void PinsFromBlackbox(LibType& lt, const Module& bb) {
    for (const Port& port : bb.ports) {
        if (port.width == 0) continue;
        LibType::Pin p;
        p.name = port.name;
        p.dir = port.dir;
        p.width = port.width;
        p.bus = port.IsBus();
        p.msb = port.msb;
        p.lsb = port.lsb;
        p.fixedRange = true;
        lt.pinIndex.emplace(p.name, static_cast<uint32_t>(lt.pins.size()));
        lt.pins.push_back(p);
    }
}

}  // namespace

uint32_t FindOrAddLibType(Design& d, std::string_view name) {
    auto it = d.typeIndex.find(name);
    if (it != d.typeIndex.end()) return it->second;
    uint32_t idx = static_cast<uint32_t>(d.types.size());
    d.types.emplace_back();
    LibType& lt = d.types.back();
    lt.name = d.pool.Keep(name);
    lt.def = d.cellLib.Find(std::string(name));
    if (lt.def) {
        PinsFromLibrary(lt, *lt.def);
    } else {
        auto mit = d.moduleIndex.find(name);
        if (mit != d.moduleIndex.end() && d.modules[mit->second].blackbox) {
            lt.blackbox = static_cast<int32_t>(mit->second);
            PinsFromBlackbox(lt, d.modules[mit->second]);
        }
    }
    d.typeIndex.emplace(lt.name, idx);
    return idx;
}

uint32_t FindOrAddVariant(Design& d, uint32_t type, const Module& m, const Cell& c) {
    LibType& lt = d.types[type];
    std::vector<uint32_t>& sig = d.signature;
    sig.clear();
    if (lt.flexible) {
        // Widths of the open pins; a pin left unconnected is a scalar.
        sig.assign(lt.pins.size(), 1);
        for (uint32_t k = 0; k < c.connCount; ++k) {
            const Conn& cn = m.conns[c.connFirst + k];
            if (!lt.pins[cn.slot].fixedRange) sig[cn.slot] = std::max(sig[cn.slot], cn.width);
        }
        while (!sig.empty() && sig.back() == 1) sig.pop_back();
    }
    auto it = lt.variants.find(sig);
    if (it != lt.variants.end()) return it->second;
    uint32_t idx = static_cast<uint32_t>(d.variants.size());
    d.variants.emplace_back();
    d.variants.back().base = type;
    d.variants.back().signature = sig;
    lt.variants.emplace(sig, idx);
    return idx;
}

void CreateLibTypes(Design& d, Nlw_NlBuilder& b) {
    for (const LibType& lt : d.types) {
        bool untyped = false;
        for (const LibType::Pin& p : lt.pins) untyped = untyped || p.dir == NLW_DIR_UNTYPED;
        if (untyped)
            NLW_MSG().issueWarning(
                "%s: cell type '%s' has pins with no direction (neither the cell library nor "
                "its cells' \"port_directions\" give one); they are left untyped\n",
                d.File(), lt.name);
    }
    // In the order the layouts were met.
    for (LibVariant& v : d.variants) {
        const LibType& lt = d.types[v.base];
        bool timcell = lt.def && lt.def->timcell;
        bool funcell = lt.def && lt.def->funcell;
        v.type =
            b.AddLibraryType(lt.name, timcell, funcell, lt.pad ? NLW_PRIM_PAD : NLW_PRIM_OTHER);
        const size_t n = lt.pins.size();
        v.pos.resize(n);
        v.width.resize(n);
        v.bus.resize(n);
        uint32_t pos = 0;
        for (size_t k = 0; k < n; ++k) {
            const LibType::Pin& p = lt.pins[k];
            uint32_t width = p.fixedRange ? p.width : k < v.signature.size() ? v.signature[k] : 1;
            bool bus = p.fixedRange ? p.bus : width > 1;
            v.pos[k] = pos;
            v.width[k] = width;
            v.bus[k] = bus;
            if (bus) {
                int32_t msb = p.fixedRange ? p.msb : static_cast<int32_t>(width) - 1;
                int32_t lsb = p.fixedRange ? p.lsb : 0;
                b.AddTypePinBus(v.type, p.name, p.dir, msb, lsb);
            } else {
                b.AddTypePin(v.type, p.name, p.dir, p.pad ? NLW_PINTYPE_PAD : NLW_PINTYPE_PLAIN);
            }
            pos += width;
        }
    }
}

}  // namespace nlw_json

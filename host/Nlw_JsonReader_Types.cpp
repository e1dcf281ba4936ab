// Library cell types: where their pins come from, and their model types.
#include <string>

#include "Nlw_JsonReader_Internal.h"
#include "Port.h"

namespace nlw_json {

namespace {

void PinsFromLibrary(LibType& lt, const Nlw_CellDef& def) {
    lt.pad = def.pad;
    for (const Nlw_CellPinDef& cp : def.pins) {
        LibType::Pin p;
        p.name = cp.name;
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
    lt.name = name;
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
    d.typeIndex.emplace(name, idx);
    return idx;
}

void CreateLibTypes(Design& d, Nlw_NlBuilder& b) {
    for (LibType& lt : d.types) {
        bool untyped = false;
        for (const LibType::Pin& p : lt.pins) untyped = untyped || p.dir == NLW_DIR_UNTYPED;
        if (untyped)
            NLW_MSG().issueWarning(
                "%s: cell type '%s' has pins with no direction (neither the cell library nor "
                "its cells' \"port_directions\" give one); they are left untyped\n",
                d.File(), std::string(lt.name).c_str());
        bool timcell = lt.def && lt.def->timcell;
        bool funcell = lt.def && lt.def->funcell;
        lt.type = b.AddLibraryType(lt.name.data(), timcell, funcell,
                                   lt.pad ? NLW_PRIM_PAD : NLW_PRIM_OTHER);
        uint32_t pos = 0;
        for (LibType::Pin& p : lt.pins) {
            p.pos = pos;
            if (p.bus) {
                b.AddTypePinBus(lt.type, p.name.data(), p.dir, p.msb, p.lsb);
            } else {
                b.AddTypePin(lt.type, p.name.data(), p.dir,
                             p.pad ? NLW_PINTYPE_PAD : NLW_PINTYPE_PLAIN);
            }
            pos += p.bus ? p.width : 1;
        }
    }
}

}  // namespace nlw_json

// Reading the cells of a module: their types, parameters, the attributes the
// reader uses, and their connections checked against the pins of their types.
#include <string>

#include "Nlw_JsonReader_Internal.h"

namespace nlw_json {

using simdjson::dom::element;
using simdjson::dom::object;

namespace {

int DirectionOf(object dirs, bool haveDirs, std::string_view pin) {
    if (!haveDirs) return NLW_DIR_UNTYPED;
    std::string_view s;
    if (dirs.at_key(pin).get_string().get(s)) return NLW_DIR_UNTYPED;
    if (s == "input") return NLW_DIR_INPUT;
    if (s == "output") return NLW_DIR_OUTPUT;
    if (s == "inout") return NLW_DIR_INOUT;
    return NLW_DIR_UNTYPED;
}

// A pin a connection or a direction names that the type's definition does
// not have: the type's pins are the union of all of them.
uint32_t AddPin(LibType& lt, std::string_view name, int dir, uint32_t width) {
    LibType::Pin p;
    p.name = name;
    p.dir = dir;
    p.width = width ? width : 1;
    p.bus = width > 1;
    p.msb = static_cast<int32_t>(p.width) - 1;
    uint32_t idx = static_cast<uint32_t>(lt.pins.size());
    lt.pins.push_back(p);
    lt.pinIndex.emplace(name, idx);
    return idx;
}

uint32_t LeafSlot(Design& d, uint32_t type, std::string_view pin, uint32_t width, object dirs,
                  bool haveDirs, const Where& where) {
    LibType& lt = d.types[type];
    auto it = lt.pinIndex.find(pin);
    if (it == lt.pinIndex.end()) return AddPin(lt, pin, DirectionOf(dirs, haveDirs, pin), width);
    LibType::Pin& p = lt.pins[it->second];
    if (p.dir == NLW_DIR_UNTYPED) p.dir = DirectionOf(dirs, haveDirs, pin);
    if (width > p.width) {
        if (p.fixedRange)
            Fail(where.Text() + ": " + std::to_string(width) + " bits, but pin '" +
                 std::string(pin) + "' of cell type '" + std::string(lt.name) + "' has " +
                 std::to_string(p.width));
        p.width = width;
        p.bus = true;
        p.msb = static_cast<int32_t>(width) - 1;
        p.lsb = 0;
    }
    return it->second;
}

uint32_t MacroSlot(const Module& child, std::string_view pin, uint32_t width,
                   const Where& where) {
    auto it = child.portIndex.find(pin);
    if (it == child.portIndex.end())
        Fail(where.Text() + ": module '" + std::string(child.name) + "' has no port '" +
             std::string(pin) + "'");
    const Port& p = child.ports[it->second];
    if (width > p.width)
        Fail(where.Text() + ": " + std::to_string(width) + " bits, but port '" + std::string(pin) +
             "' of module '" + std::string(child.name) + "' has " + std::to_string(p.width));
    return it->second;
}

void ReadCellAttrs(object co, Module& m, Cell& c, const Where& where, bool pad) {
    object attrs;
    element e;
    if (co.at_key("attributes").get(e)) return;
    if (e.get_object().get(attrs)) Fail(where.Text() + ": expected an object for \"attributes\"");
    std::string_view loc;
    for (auto kv : attrs) {
        std::string_view k = kv.key;
        if (k == "hdlname") {
            std::string_view t = ValueText(ReadValue(kv.value, m, where), m);
            std::string path(t);
            for (char& ch : path)
                if (ch == ' ') ch = '/';
            c.aka = m.Keep(std::move(path));
        } else if (k == "PINNAME") {
            c.pinName = ValueText(ReadValue(kv.value, m, where), m);
        } else if (k == "LOC") {
            loc = ValueText(ReadValue(kv.value, m, where), m);
        } else if (k == "TYPE") {
            c.typeAttr = ValueText(ReadValue(kv.value, m, where), m);
        }
    }
    // "LOC" stands for the package pin only on a pad.
    if (c.pinName.empty() && pad) c.pinName = loc;
}

}  // namespace

void ReadCells(Design& d, Module& m, object cells) {
    Where where{m.name, {}, {}, {}};
    for (auto kv : cells) {
        where.cell = kv.key;
        where.section = {};
        where.key = {};
        object co;
        if (kv.value.get_object().get(co)) Fail(where.Text() + ": expected an object");
        Cell c;
        c.name = kv.key;
        if (co.at_key("type").get_string().get(c.typeName))
            Fail(where.Text() + ": missing or bad \"type\"");
        auto mit = d.moduleIndex.find(c.typeName);
        if (mit != d.moduleIndex.end() && !d.modules[mit->second].blackbox) {
            c.macro = true;
            c.type = mit->second;
        } else {
            c.type = FindOrAddLibType(d, c.typeName);
        }

        object params;
        element e;
        c.paramFirst = static_cast<uint32_t>(m.params.size());
        if (!co.at_key("parameters").get(e)) {
            if (e.get_object().get(params))
                Fail(where.Text() + ": expected an object for \"parameters\"");
            where.section = "parameter";
            for (auto pv : params) {
                where.key = pv.key;
                m.params.push_back({pv.key, ReadValue(pv.value, m, where)});
            }
            where.section = {};
            where.key = {};
        }
        c.paramCount = static_cast<uint32_t>(m.params.size()) - c.paramFirst;
        ReadCellAttrs(co, m, c, where, !c.macro && d.types[c.type].pad);

        object dirs;
        bool haveDirs = false;
        if (!co.at_key("port_directions").get(e)) {
            if (e.get_object().get(dirs))
                Fail(where.Text() + ": expected an object for \"port_directions\"");
            haveDirs = true;
        }
        c.connFirst = static_cast<uint32_t>(m.conns.size());
        object conns;
        if (!co.at_key("connections").get(e)) {
            if (e.get_object().get(conns))
                Fail(where.Text() + ": expected an object for \"connections\"");
            where.section = "connection";
            for (auto cv : conns) {
                where.key = cv.key;
                Conn cn;
                cn.bitFirst = static_cast<uint32_t>(m.refs.size());
                cn.width = ReadBits(cv.value, m, where);
                cn.slot = c.macro ? MacroSlot(d.modules[c.type], cv.key, cn.width, where)
                                  : LeafSlot(d, c.type, cv.key, cn.width, dirs, haveDirs, where);
                m.conns.push_back(cn);
            }
            where.section = {};
            where.key = {};
        }
        c.connCount = static_cast<uint32_t>(m.conns.size()) - c.connFirst;
        // A type the library does not define also takes the pins its
        // instances declare without connecting them.
        if (!c.macro && haveDirs) {
            LibType& lt = d.types[c.type];
            if (!lt.def && lt.blackbox < 0 && dirs.size() != c.connCount) {
                for (auto dv : dirs)
                    if (!lt.pinIndex.count(dv.key))
                        AddPin(lt, dv.key, DirectionOf(dirs, true, dv.key), 1);
            }
        }
        if (!c.macro && d.types[c.type].pad) m.ownPads = true;
        m.cells.push_back(c);
    }
}

}  // namespace nlw_json

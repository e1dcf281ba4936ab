// Reading the cells of a module: their types, parameters, the attributes the
// reader uses, and their connections checked against the pins of their types.
#include <cstring>
#include <string>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

using simdjson::dom::element;
using simdjson::dom::object;

namespace {

int DirectionOf(object dirs, bool haveDirs, std::string_view pin) {
    if (!haveDirs) return NLW_DIR_UNTYPED;
    std::string_view s;
    // The pin's name as the file may spell it, with yosys's public mark.
    if (dirs.at_key(pin).get_string().get(s) &&
        dirs.at_key("\\" + std::string(pin)).get_string().get(s))
        return NLW_DIR_UNTYPED;
    if (s == "input") return NLW_DIR_INPUT;
    if (s == "output") return NLW_DIR_OUTPUT;
    if (s == "inout") return NLW_DIR_INOUT;
    return NLW_DIR_UNTYPED;
}

// A pin a connection or a direction names that the type's definition does
// not have: the type's pins are the union of all of them, and each instance
// gives such a pin its own width.
uint32_t AddPin(LibType& lt, std::string_view name, int dir, TextPool& pool) {
    LibType::Pin p;
    p.name = pool.Keep(name);
    p.dir = dir;
    uint32_t idx = static_cast<uint32_t>(lt.pins.size());
    lt.pins.push_back(p);
    lt.pinIndex.emplace(p.name, idx);
    lt.flexible = true;
    return idx;
}

// The type's pin of a connection. Instances list their connections in the
// same order as a rule, mostly the order of the type's pins, so the pin at
// the connection's position is tried before the index.
uint32_t LeafSlot(Design& d, LibType& lt, uint32_t position, std::string_view pin, uint32_t width,
                  object dirs, bool haveDirs, const Where& where) {
    uint32_t idx;
    if (position < lt.pins.size() && pin == lt.pins[position].name) {
        idx = position;
    } else {
        auto it = lt.pinIndex.find(pin);
        // The library and a black box define every pin their cells have.
        if (it == lt.pinIndex.end() && (lt.def || lt.blackbox >= 0))
            Fail(where.Text() + ": cell type '" + lt.name + "' has no pin '" + std::string(pin) +
                 "'");
        if (it == lt.pinIndex.end())
            return AddPin(lt, pin, DirectionOf(dirs, haveDirs, pin), d.pool);
        idx = it->second;
    }
    LibType::Pin& p = lt.pins[idx];
    if (p.dir == NLW_DIR_UNTYPED) p.dir = DirectionOf(dirs, haveDirs, pin);
    if (p.fixedRange && width > p.width)
        Fail(where.Text() + ": " + std::to_string(width) + " bits, but pin '" + std::string(pin) +
             "' of cell type '" + lt.name + "' has " + std::to_string(p.width));
    return idx;
}

uint32_t MacroSlot(const Module& child, uint32_t position, std::string_view pin, uint32_t width,
                   const Where& where) {
    uint32_t idx;
    if (position < child.ports.size() && pin == child.ports[position].name) {
        idx = position;
    } else {
        auto it = child.portIndex.find(pin);
        if (it == child.portIndex.end())
            Fail(where.Text() + ": module '" + std::string(child.name) + "' has no port '" +
                 std::string(pin) + "'");
        idx = it->second;
    }
    const Port& p = child.ports[idx];
    if (width > p.width)
        Fail(where.Text() + ": " + std::to_string(width) + " bits, but port '" + std::string(pin) +
             "' of module '" + std::string(child.name) + "' has " + std::to_string(p.width));
    return idx;
}

object ObjectOf(element e, const Where& where, const char* key) {
    object o;
    if (e.get_object().get(o))
        Fail(where.Text() + ": expected an object for \"" + std::string(key) + "\"");
    return o;
}

void ReadCellAttrs(object attrs, TextPool& pool, CellExtra& x, const Where& where, bool pad) {
    std::string_view loc;
    for (auto kv : attrs) {
        std::string_view k = kv.key;
        if (k == "hdlname") {
            x.aka = JoinPath(ValueText(ReadValue(kv.value, pool, where), pool), pool);
        } else if (k == "PINNAME") {
            x.pinName = pool.Keep(ValueText(ReadValue(kv.value, pool, where), pool));
        } else if (k == "LOC") {
            loc = ValueText(ReadValue(kv.value, pool, where), pool);
        } else if (k == "TYPE") {
            x.typeAttr = pool.Keep(ValueText(ReadValue(kv.value, pool, where), pool));
        }
    }
    // "LOC" stands for the package pin only on a pad.
    if (!*x.pinName && pad && !loc.empty()) x.pinName = pool.Keep(loc);
}

// The cell's type: a module of the file, or a library type. Runs of cells
// of one type are common, so the last answer is kept.
struct TypeCache {
    std::string last;
    bool macro = false;
    uint32_t type = 0;
};

void ResolveType(Design& d, std::string_view name, TypeCache& cache, Cell& c) {
    if (!cache.last.empty() && name == cache.last) {
        c.macro = cache.macro;
        c.type = cache.type;
        return;
    }
    auto mit = d.moduleIndex.find(name);
    if (mit != d.moduleIndex.end() && !d.modules[mit->second].blackbox) {
        c.macro = true;
        c.type = mit->second;
    } else {
        c.macro = false;
        c.type = FindOrAddLibType(d, name);
    }
    cache.last.assign(name);
    cache.macro = c.macro;
    cache.type = c.type;
}

}  // namespace

void ReadCells(Design& d, Module& m, object cells) {
    Where where{m.name, {}, {}, {}};
    TypeCache cache;
    Nlw_NameTable& cellNames = d.scratch.cellNames;
    // Room for a typical cell's connections and parameters; what is left
    // over is given back when the module is digested.
    const size_t n = cells.size();
    cellNames.Reset(n);
    m.cells.reserve(m.cells.size() + n);
    m.conns.reserve(m.conns.size() + 4 * n);
    m.refs.reserve(m.refs.size() + 4 * n);
    m.params.reserve(m.params.size() + n);
    for (auto kv : cells) {
        where.cell = kv.key;
        where.section = {};
        where.key = {};
        object co;
        if (kv.value.get_object().get(co)) Fail(where.Text() + ": expected an object");
        // One walk over the cell's members; the connections wait for the
        // type and the directions.
        std::string_view typeName;
        bool haveType = false, haveDirs = false, haveConns = false;
        object params, attrs, dirs, conns;
        bool haveParams = false, haveAttrs = false;
        for (auto f : co) {
            std::string_view k = f.key;
            if (k == "type") {
                haveType = !f.value.get_string().get(typeName);
            } else if (k == "parameters") {
                params = ObjectOf(f.value, where, "parameters");
                haveParams = true;
            } else if (k == "attributes") {
                attrs = ObjectOf(f.value, where, "attributes");
                haveAttrs = true;
            } else if (k == "port_directions") {
                dirs = ObjectOf(f.value, where, "port_directions");
                haveDirs = true;
            } else if (k == "connections") {
                conns = ObjectOf(f.value, where, "connections");
                haveConns = true;
            }
        }
        if (!haveType) Fail(where.Text() + ": missing or bad \"type\"");
        Cell c;
        c.name = d.pool.Keep(PublicName(kv.key));
        if (!cellNames.Insert(c.name, nullptr).second) Fail(where.Text() + ": given twice");
        ResolveType(d, PublicName(typeName), cache, c);
        // A leaf's type is its library type until its layout is known.
        const uint32_t base = c.type;
        const bool pad = !c.macro && d.types[base].pad;

        c.paramFirst = static_cast<uint32_t>(m.params.size());
        if (haveParams) {
            where.section = "parameter";
            for (auto pv : params) {
                where.key = pv.key;
                Value v = ReadValue(pv.value, d.pool, where);
                Param p;
                p.name = d.pool.Keep(pv.key);
                p.kind = v.kind;
                p.text = v.kind == ValueKind::Bits || v.kind == ValueKind::String
                             ? d.pool.Keep(v.text)
                             : "";
                p.i = v.i;
                p.d = v.d;
                m.params.push_back(p);
            }
            where.section = {};
            where.key = {};
        }
        c.paramCount = static_cast<uint32_t>(m.params.size()) - c.paramFirst;
        if (haveAttrs && attrs.size() > 0) {
            CellExtra x;
            ReadCellAttrs(attrs, d.pool, x, where, pad);
            if (*x.aka || *x.pinName || *x.typeAttr) {
                c.extra = static_cast<uint32_t>(m.extras.size());
                m.extras.push_back(x);
            }
        }

        c.connFirst = static_cast<uint32_t>(m.conns.size());
        if (haveConns) {
            where.section = "connection";
            uint32_t position = 0;
            for (auto cv : conns) {
                where.key = cv.key;
                Conn cn;
                cn.bitFirst = static_cast<uint32_t>(m.refs.size());
                cn.width = ReadBits(cv.value, m, where);
                const std::string_view pin = PublicName(cv.key);
                cn.slot = c.macro ? MacroSlot(d.modules[c.type], position, pin, cn.width, where)
                                  : LeafSlot(d, d.types[base], position, pin, cn.width, dirs,
                                             haveDirs, where);
                m.conns.push_back(cn);
                ++position;
            }
            where.section = {};
            where.key = {};
        }
        c.connCount = static_cast<uint32_t>(m.conns.size()) - c.connFirst;
        if (!c.macro) {
            // A type the library does not define also takes the pins its
            // instances declare without connecting them.
            LibType& lt = d.types[base];
            if (haveDirs && !lt.def && lt.blackbox < 0 && dirs.size() != c.connCount) {
                for (auto dv : dirs)
                    if (!lt.pinIndex.count(PublicName(dv.key)))
                        AddPin(lt, PublicName(dv.key), DirectionOf(dirs, true, dv.key), d.pool);
            }
            c.type = FindOrAddVariant(d, base, m, c);
            if (pad) m.ownPads = true;
        }
        m.cells.push_back(c);
    }
}

}  // namespace nlw_json

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

// The attributes the writers read; "LOC" is kept aside, since it stands for
// the package pin only on a pad, and whether the cell is one is known only
// when its type is resolved.
void ReadCellAttrs(object attrs, TextPool& pool, CellExtra& x, std::string_view& loc,
                   const Where& where) {
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

void ReadCellTexts(Module& m, object cells, TextPool& pool, NameScratch& scratch,
                   DigestWork& work) {
    Where where{m.name, {}, {}, {}};
    Nlw_NameTable& cellNames = scratch.cellNames;
    // Room for a typical cell's connections and parameters; what is left
    // over is given back when the module is digested.
    const size_t n = cells.size();
    cellNames.Reset(n);
    m.cells.reserve(m.cells.size() + n);
    m.conns.reserve(m.conns.size() + 4 * n);
    m.refs.reserve(m.refs.size() + 4 * n);
    m.params.reserve(m.params.size() + n);
    work.cells.reserve(n);
    work.connKeys.reserve(4 * n);
    for (auto kv : cells) {
        where.cell = kv.key;
        where.section = {};
        where.key = {};
        object co;
        if (kv.value.get_object().get(co)) Fail(where.Text() + ": expected an object");
        // One walk over the cell's members; the connections wait for the
        // type and the directions.
        CellTexts t;
        t.key = kv.key;
        bool haveType = false, haveConns = false;
        object params, attrs, conns;
        bool haveParams = false, haveAttrs = false;
        for (auto f : co) {
            std::string_view k = f.key;
            if (k == "type") {
                haveType = !f.value.get_string().get(t.typeName);
            } else if (k == "parameters") {
                params = ObjectOf(f.value, where, "parameters");
                haveParams = true;
            } else if (k == "attributes") {
                attrs = ObjectOf(f.value, where, "attributes");
                haveAttrs = true;
            } else if (k == "port_directions") {
                t.dirs = ObjectOf(f.value, where, "port_directions");
                t.haveDirs = true;
            } else if (k == "connections") {
                conns = ObjectOf(f.value, where, "connections");
                haveConns = true;
            }
        }
        if (!haveType) Fail(where.Text() + ": missing or bad \"type\"");
        Cell& c = m.cells.emplace_back();
        c.name = pool.Keep(PublicName(kv.key));
        if (!cellNames.Insert(c.name, nullptr).second) {
            m.cells.pop_back();
            Fail(where.Text() + ": given twice");
        }
        // From here on, a fault of the cell comes after those its type and
        // connections have: the cell is resolved up to the fault.
        work.cells.push_back(t);
        CellTexts& kept = work.cells.back();

        c.paramFirst = static_cast<uint32_t>(m.params.size());
        c.connFirst = static_cast<uint32_t>(m.conns.size());
        if (haveParams) {
            where.section = "parameter";
            for (auto pv : params) {
                where.key = pv.key;
                Value v = ReadValue(pv.value, pool, where);
                Param p;
                p.name = pool.Keep(pv.key);
                p.kind = v.kind;
                p.text = v.kind == ValueKind::Bits || v.kind == ValueKind::String
                             ? pool.Keep(v.text)
                             : "";
                p.i = v.i;
                p.d = v.d;
                m.params.push_back(p);
                ++c.paramCount;
            }
            where.section = {};
            where.key = {};
        }
        if (haveAttrs && attrs.size() > 0) {
            CellExtra x;
            ReadCellAttrs(attrs, pool, x, kept.loc, where);
            if (*x.aka || *x.pinName || *x.typeAttr) {
                c.extra = static_cast<uint32_t>(m.extras.size());
                m.extras.push_back(x);
            }
        }
        if (haveConns) {
            where.section = "connection";
            for (auto cv : conns) {
                where.key = cv.key;
                Conn cn;
                cn.bitFirst = static_cast<uint32_t>(m.refs.size());
                cn.width = ReadBits(cv.value, m, where);
                m.conns.push_back(cn);
                work.connKeys.push_back(cv.key);
                ++c.connCount;
            }
        }
    }
}

void ResolveCells(Design& d, Module& m, DigestWork& work) {
    Where where{m.name, {}, "connection", {}};
    TypeCache cache;
    for (size_t i = 0; i < work.cells.size(); ++i) {
        Cell& c = m.cells[i];
        const CellTexts& t = work.cells[i];
        where.cell = t.key;
        ResolveType(d, PublicName(t.typeName), cache, c);
        // A leaf's type is its library type until its layout is known.
        const uint32_t base = c.type;
        const bool pad = !c.macro && d.types[base].pad;
        for (uint32_t k = 0; k < c.connCount; ++k) {
            Conn& cn = m.conns[c.connFirst + k];
            where.key = work.connKeys[c.connFirst + k];
            const std::string_view pin = PublicName(where.key);
            cn.slot = c.macro
                          ? MacroSlot(d.modules[c.type], k, pin, cn.width, where)
                          : LeafSlot(d, d.types[base], k, pin, cn.width, t.dirs, t.haveDirs, where);
        }
        if (c.macro) continue;
        // A type the library does not define also takes the pins its
        // instances declare without connecting them.
        LibType& lt = d.types[base];
        if (t.haveDirs && !lt.def && lt.blackbox < 0 && t.dirs.size() != c.connCount) {
            for (auto dv : t.dirs)
                if (!lt.pinIndex.count(PublicName(dv.key)))
                    AddPin(lt, PublicName(dv.key), DirectionOf(t.dirs, true, dv.key), d.pool);
        }
        c.type = FindOrAddVariant(d, base, m, c);
        if (!pad) continue;
        m.ownPads = true;
        if (!t.loc.empty()) {
            if (c.extra == kNone) {
                c.extra = static_cast<uint32_t>(m.extras.size());
                m.extras.emplace_back();
            }
            CellExtra& x = m.extras[c.extra];
            if (!*x.pinName) x.pinName = d.pool.Keep(t.loc);
        }
    }
    if (work.fault) std::rethrow_exception(work.fault);
}

}  // namespace nlw_json

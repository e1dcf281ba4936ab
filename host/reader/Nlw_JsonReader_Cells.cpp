// Reading the cells of a module: their types, parameters, the attributes the
// reader uses, and their connections checked against the pins of their types.
#include <cstring>
#include <string>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

using simdjson::dom::element;
using simdjson::dom::object;

namespace {

int DirectionCode(std::string_view s) {
    if (s == "input") return NLW_DIR_INPUT;
    if (s == "output") return NLW_DIR_OUTPUT;
    if (s == "inout") return NLW_DIR_INOUT;
    return NLW_DIR_UNTYPED;
}

// A cell's kept "port_directions" (none: no entries).
struct Dirs {
    const DirEntry* first = nullptr;
    uint32_t count = 0;
    bool have = false;
};

// The direction the cell gives a pin: its entry under the pin's name as the
// file may spell it, plain or with yosys's public mark; the first entry of
// a name counts, and one that is no string counts as none.
int DirectionOf(const Dirs& dirs, std::string_view pin) {
    if (!dirs.have) return NLW_DIR_UNTYPED;
    auto find = [&](std::string_view key, bool marked) -> const DirEntry* {
        for (uint32_t i = 0; i < dirs.count; ++i) {
            std::string_view k = dirs.first[i].key;
            if (marked ? (k.size() == key.size() + 1 && k[0] == '\\' && k.substr(1) == key)
                       : k == key)
                return &dirs.first[i];
        }
        return nullptr;
    };
    const DirEntry* e = find(pin, false);
    if (!e || !e->isString) e = find(pin, true);
    return e && e->isString ? e->dir : NLW_DIR_UNTYPED;
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

[[noreturn]] void NoSuchPin(const Where& where, std::string_view type, std::string_view pin) {
    Fail(where.Text() + ": cell type '" + std::string(type) + "' has no pin '" + std::string(pin) +
         "'");
}

[[noreturn]] void TooWide(const Where& where, uint32_t width, std::string_view pin,
                          std::string_view type, uint32_t has) {
    Fail(where.Text() + ": " + std::to_string(width) + " bits, but pin '" + std::string(pin) +
         "' of cell type '" + std::string(type) + "' has " + std::to_string(has));
}

// The type's pin of a connection. Instances list their connections in the
// same order as a rule, mostly the order of the type's pins, so the pin at
// the connection's position is tried before the index.
uint32_t LeafSlot(Design& d, LibType& lt, uint32_t position, std::string_view pin, uint32_t width,
                  const Dirs& dirs, const Where& where) {
    uint32_t idx;
    if (position < lt.pins.size() && pin == lt.pins[position].name) {
        idx = position;
    } else {
        auto it = lt.pinIndex.find(pin);
        // The library and a black box define every pin their cells have.
        if (it == lt.pinIndex.end() && (lt.def || lt.blackbox >= 0)) NoSuchPin(where, lt.name, pin);
        if (it == lt.pinIndex.end()) return AddPin(lt, pin, DirectionOf(dirs, pin), d.pool);
        idx = it->second;
    }
    LibType::Pin& p = lt.pins[idx];
    if (p.dir == NLW_DIR_UNTYPED) p.dir = DirectionOf(dirs, pin);
    if (p.fixedRange && width > p.width) TooWide(where, width, pin, lt.name, p.width);
    return idx;
}

// The same for a library cell whose pins all have directions, from the
// library alone: such a type's pins are the library's, in its order. With
// a guess, a pin that does not fit is left kUnresolved instead.
uint32_t LibrarySlot(const Nlw_CellDef& def, uint32_t position, std::string_view pin,
                     uint32_t width, const Where& where, bool guess) {
    uint32_t idx = 0;
    if (position < def.pins.size() && pin == def.pins[position].name) {
        idx = position;
    } else {
        while (idx < def.pins.size() && pin != def.pins[idx].name) ++idx;
        if (idx == def.pins.size()) {
            if (guess) return kUnresolved;
            NoSuchPin(where, def.name, pin);
        }
    }
    const uint32_t has = static_cast<uint32_t>(def.pins[idx].Width());
    if (width > has) {
        if (guess) return kUnresolved;
        TooWide(where, width, pin, def.name, has);
    }
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

// The scratch's entry for a cell type, made on first meeting it.
const CellType& LearnType(const Design& d, std::string_view file, TextPool& pool, bool speculate,
                          NameScratch& scratch) {
    if (const Nlw_NameTable::Slot* slot = scratch.typeIndex.Find(file))
        return *static_cast<const CellType*>(slot->sharer);
    CellType& t = scratch.types.emplace_back();
    const std::string_view name = PublicName(file);
    t.name = pool.Keep(name);
    t.file = pool.Keep(file);
    const Nlw_CellDef* def = d.cellLib.Find(std::string(name));
    const bool module = d.moduleIndex.count(name) != 0;
    bool typed = def != nullptr;
    if (def)
        for (const Nlw_CellPinDef& p : def->pins) typed = typed && p.dir != NLW_DIR_UNTYPED;
    t.def = typed && (!module || speculate) ? def : nullptr;
    t.speculative = module && t.def;
    // A module's instance has the module's ports, a black box's the
    // library's pins or its ports (which all have directions).
    t.keepDirs = def ? !typed : !module;
    scratch.typeIndex.Insert(t.file, &t);
    return t;
}

// The raw name of a cell, for a message.
std::string_view RawName(const Cell& c, std::string& buffer) {
    if (!c.marked) return c.name;
    buffer.assign("\\");
    buffer += c.name;
    return buffer;
}

// The cell's type: a module of the file, or a library type. Runs of cells
// of one type are common, so the last answer is kept.
struct TypeCache {
    Text last = nullptr;
    bool macro = false;
    uint32_t type = 0;
};

void ResolveType(Design& d, Text name, TypeCache& cache, Cell& c) {
    if (name != cache.last) {
        auto mit = d.moduleIndex.find(name);
        if (mit != d.moduleIndex.end() && !d.modules[mit->second].blackbox) {
            cache.macro = true;
            cache.type = mit->second;
        } else {
            cache.macro = false;
            cache.type = FindOrAddLibType(d, name);
        }
        cache.last = name;
    }
    c.macro = cache.macro;
    c.type = cache.type;
}

}  // namespace

void ReadCellTexts(const Design& d, Module& m, object cells, TextPool& pool, NameScratch& scratch,
                   bool speculate) {
    Where where{m.name, {}, {}, {}};
    Nlw_NameTable& cellNames = scratch.cellNames;
    // Room for a typical cell's connections and parameters; what is left
    // over is given back once the module is read.
    const size_t n = cells.size();
    cellNames.Reset(n);
    m.cells.reserve(m.cells.size() + n);
    m.conns.reserve(m.conns.size() + 4 * n);
    m.refs.reserve(m.refs.size() + 4 * n);
    m.params.reserve(m.params.size() + n);
    const CellType* type = nullptr;
    for (auto kv : cells) {
        where.cell = kv.key;
        where.section = {};
        where.key = {};
        object co;
        if (kv.value.get_object().get(co)) Fail(where.Text() + ": expected an object");
        // One walk over the cell's members; the connections wait for the
        // type and the directions.
        std::string_view typeName;
        bool typed = false, haveDirs = false, haveConns = false;
        object params, attrs, dirs, conns;
        bool haveParams = false, haveAttrs = false;
        for (auto f : co) {
            std::string_view k = f.key;
            if (k == "type") {
                typed = !f.value.get_string().get(typeName);
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
        if (!typed) Fail(where.Text() + ": missing or bad \"type\"");
        Text name = pool.Keep(PublicName(kv.key));
        if (!cellNames.Insert(name, nullptr).second) Fail(where.Text() + ": given twice");
        if (!type || typeName != type->file)
            type = &LearnType(d, typeName, pool, speculate, scratch);
        // From here on, a fault of the cell comes after those its type and
        // its connections so far have: the cell is resolved up to the fault.
        const uint32_t self = static_cast<uint32_t>(m.cells.size());
        Cell& c = m.cells.emplace_back();
        c.name = name;
        c.marked = PublicName(kv.key).size() != kv.key.size();
        c.typeName = type->name;
        c.speculative = type->speculative;
        c.paramFirst = static_cast<uint32_t>(m.params.size());
        c.connFirst = static_cast<uint32_t>(m.conns.size());
        if (haveDirs && type->keepDirs) {
            CellDirs cd;
            cd.cell = self;
            cd.first = static_cast<uint32_t>(m.dirEntries.size());
            for (auto dv : dirs) {
                DirEntry e;
                e.key = pool.Keep(dv.key);
                std::string_view s;
                e.isString = !dv.value.get_string().get(s);
                e.dir = e.isString ? DirectionCode(s) : NLW_DIR_UNTYPED;
                m.dirEntries.push_back(e);
            }
            cd.count = static_cast<uint32_t>(m.dirEntries.size()) - cd.first;
            m.cellDirs.push_back(cd);
        }

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
            std::string_view loc;
            ReadCellAttrs(attrs, pool, x, loc, where);
            if (*x.aka || *x.pinName || *x.typeAttr) {
                c.extra = static_cast<uint32_t>(m.extras.size());
                m.extras.push_back(x);
            }
            if (!loc.empty()) m.locs.emplace_back(self, std::string(loc));
        }
        if (haveConns) {
            where.section = "connection";
            uint32_t position = 0;
            for (auto cv : conns) {
                where.key = cv.key;
                Conn cn;
                cn.bitFirst = static_cast<uint32_t>(m.refs.size());
                cn.width = ReadBits(cv.value, m, where);
                cn.slot = type->def ? LibrarySlot(*type->def, position, PublicName(cv.key),
                                                  cn.width, where, type->speculative)
                                    : kUnresolved;
                if (cn.slot == kUnresolved)
                    m.pinKeys.emplace_back(static_cast<uint32_t>(m.conns.size()),
                                           pool.Keep(cv.key));
                m.conns.push_back(cn);
                ++c.connCount;
                ++position;
            }
        }
    }
}

bool ResolveCells(Design& d, Module& m) {
    // A cell read as a library cell whose type is a module after all.
    Text last = nullptr;
    bool macro = false;
    for (const Cell& c : m.cells) {
        if (!c.speculative) continue;
        if (c.typeName != last) {
            last = c.typeName;
            auto it = d.moduleIndex.find(c.typeName);
            macro = it != d.moduleIndex.end() && !d.modules[it->second].blackbox;
        }
        if (macro) return false;
    }
    Where where{m.name, {}, "connection", {}};
    TypeCache cache;
    std::string rawName;
    size_t nextKey = 0, nextDirs = 0, nextLoc = 0;
    for (uint32_t i = 0; i < m.cells.size(); ++i) {
        Cell& c = m.cells[i];
        where.cell = RawName(c, rawName);
        ResolveType(d, c.typeName, cache, c);
        // A leaf's type is its library type until its layout is known.
        const uint32_t base = c.type;
        const bool pad = !c.macro && d.types[base].pad;
        Dirs dirs;
        if (nextDirs < m.cellDirs.size() && m.cellDirs[nextDirs].cell == i) {
            const CellDirs& cd = m.cellDirs[nextDirs++];
            dirs.first = m.dirEntries.data() + cd.first;
            dirs.count = cd.count;
            dirs.have = true;
        }
        for (uint32_t k = 0; k < c.connCount; ++k) {
            Conn& cn = m.conns[c.connFirst + k];
            if (cn.slot != kUnresolved) continue;
            where.key = m.pinKeys[nextKey++].second;
            const std::string_view pin = PublicName(where.key);
            cn.slot = c.macro ? MacroSlot(d.modules[c.type], k, pin, cn.width, where)
                              : LeafSlot(d, d.types[base], k, pin, cn.width, dirs, where);
        }
        if (!c.macro) {
            // A type the library does not define also takes the pins its
            // instances declare without connecting them.
            LibType& lt = d.types[base];
            if (dirs.have && !lt.def && lt.blackbox < 0 && dirs.count != c.connCount) {
                for (uint32_t e = 0; e < dirs.count; ++e) {
                    const std::string_view key = dirs.first[e].key;
                    if (!lt.pinIndex.count(PublicName(key)))
                        AddPin(lt, PublicName(key), DirectionOf(dirs, key), d.pool);
                }
            }
            c.type = FindOrAddVariant(d, base, m, c);
        }
        const std::string* loc = nullptr;
        if (nextLoc < m.locs.size() && m.locs[nextLoc].first == i) loc = &m.locs[nextLoc++].second;
        if (!pad) continue;
        m.ownPads = true;
        if (loc) {
            if (c.extra == kNone) {
                c.extra = static_cast<uint32_t>(m.extras.size());
                m.extras.emplace_back();
            }
            CellExtra& x = m.extras[c.extra];
            if (!*x.pinName) x.pinName = d.pool.Keep(*loc);
        }
    }
    if (m.digestFault) std::rethrow_exception(m.digestFault);
    // What the resolution needed is done with.
    std::vector<std::pair<uint32_t, Text>>().swap(m.pinKeys);
    std::vector<DirEntry>().swap(m.dirEntries);
    std::vector<CellDirs>().swap(m.cellDirs);
    std::vector<std::pair<uint32_t, std::string>>().swap(m.locs);
    return true;
}

}  // namespace nlw_json

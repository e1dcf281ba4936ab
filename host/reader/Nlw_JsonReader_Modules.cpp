// Reading modules from the document: the module list, module attributes,
// ports, named nets, bit arrays and parameter values.
#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <limits>
#include <unordered_map>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

using simdjson::dom::element;
using simdjson::dom::element_type;
using simdjson::dom::object;

std::string Where::Text() const {
    std::string t = "module '" + std::string(module) + "'";
    if (!cell.empty()) t += " cell '" + std::string(cell) + "'";
    if (!section.empty()) t += " " + std::string(section);
    if (!key.empty()) t += " '" + std::string(key) + "'";
    return t;
}

namespace {

object AsObject(element e, const Where& where, const char* what) {
    object o;
    if (e.get_object().get(o)) Fail(where.Text() + ": expected an object for " + what);
    return o;
}

// The optional member of an object that must itself be an object.
bool OptionalObject(object parent, std::string_view key, const Where& where, object& out) {
    element e;
    if (parent.at_key(key).get(e)) return false;
    if (e.get_object().get(out))
        Fail(where.Text() + ": expected an object for \"" + std::string(key) + "\"");
    return true;
}

int ReadDirection(element e, const Where& where) {
    std::string_view s;
    if (e.get_string().get(s)) Fail(where.Text() + ": \"direction\" must be a string");
    if (s == "input") return NLW_DIR_INPUT;
    if (s == "output") return NLW_DIR_OUTPUT;
    if (s == "inout") return NLW_DIR_INOUT;
    Fail(where.Text() + ": unknown direction '" + std::string(s) + "'");
}

int64_t ReadInt(object o, std::string_view key, int64_t dflt, const Where& where) {
    element e;
    if (o.at_key(key).get(e)) return dflt;
    int64_t v;
    if (e.get_int64().get(v)) {
        bool b;
        if (!e.get_bool().get(b)) return b ? 1 : 0;
        Fail(where.Text() + ": \"" + std::string(key) + "\" must be an integer");
    }
    return v;
}

// The bus range of a port or net from its width, "offset" and "upto": bit i
// has index offset+i, or offset+width-1-i when upto, and msb is the index of
// the last bit.
void ReadRange(object o, uint32_t width, const Where& where, int32_t& msb, int32_t& lsb) {
    int64_t offset = ReadInt(o, "offset", 0, where);
    bool upto = ReadInt(o, "upto", 0, where) != 0;
    // Checked before the sum, which could overflow for offsets near 2^63.
    if (offset < std::numeric_limits<int32_t>::min() ||
        offset > std::numeric_limits<int32_t>::max())
        Fail(where.Text() + ": \"offset\" out of range");
    int64_t last = offset + static_cast<int64_t>(width ? width - 1 : 0);
    if (last > std::numeric_limits<int32_t>::max())
        Fail(where.Text() + ": \"offset\" out of range");
    msb = static_cast<int32_t>(upto ? offset : last);
    lsb = static_cast<int32_t>(upto ? last : offset);
}

bool IsBitChar(char c) {
    return c == '0' || c == '1' || c == 'x' || c == 'z';
}

// Binary text of a number that does not fit an integer property.
std::string BinaryText(uint64_t v, bool negative) {
    std::string t;
    int width = negative ? 64 : 1;
    for (int k = 63; k >= 0; --k)
        if ((v >> k) & 1) {
            width = std::max(width, k + 1);
            break;
        }
    for (int k = width - 1; k >= 0; --k) t += ((v >> k) & 1) ? '1' : '0';
    return t;
}

struct Attrs {
    Text aka = "", pinName = "";
    std::string_view global;
    int64_t setResetConn = 3, tristateConn = 3, floatVal = 0;
    uint8_t nameFlags = 0;
};

// The attributes of a named net that the reader uses.
Attrs ReadNetAttrs(object o, TextPool& pool, const Where& where) {
    Attrs a;
    object attrs;
    if (!OptionalObject(o, "attributes", where, attrs)) return a;
    for (auto kv : attrs) {
        std::string_view k = kv.key;
        if (k == "hdlname") {
            a.aka = JoinPath(ValueText(ReadValue(kv.value, pool, where), pool), pool);
        } else if (k == "PINNAME" || k == "LOC") {
            if (k == "PINNAME" || !*a.pinName)
                a.pinName = pool.Keep(ValueText(ReadValue(kv.value, pool, where), pool));
        } else if (k == "NAME_RECOVERED") {
            a.nameFlags |= kNameRecovered;
        } else if (k == "USER_VISIBLE") {
            a.nameFlags |= kUserVisible;
        } else if (k == "NLW_GLOBAL") {
            a.global = ValueText(ReadValue(kv.value, pool, where), pool);
        } else if (k == "NLW_SETRESET_CONN" || k == "NLW_TRISTATE_CONN" || k == "VL_FLOATVAL") {
            int64_t v;
            if (!ValueToInt(ReadValue(kv.value, pool, where), v))
                Fail(where.Text() + ": attribute '" + std::string(k) + "' must be an integer");
            (k == "VL_FLOATVAL"         ? a.floatVal
             : k == "NLW_SETRESET_CONN" ? a.setResetConn
                                        : a.tristateConn) = v;
        }
    }
    return a;
}

void ReadPorts(Module& m, TextPool& pool) {
    Where where{m.name, {}, "port", {}};
    object ports;
    if (!OptionalObject(m.json, "ports", where, ports)) return;
    for (auto kv : ports) {
        where.key = kv.key;
        object po = AsObject(kv.value, where, "a port");
        Port p;
        const std::string_view name = PublicName(kv.key);
        p.name = pool.Keep(name);
        element e;
        if (po.at_key("direction").get(e)) Fail(where.Text() + ": missing \"direction\"");
        p.dir = ReadDirection(e, where);
        if (po.at_key("bits").get(e)) Fail(where.Text() + ": missing \"bits\"");
        p.bitFirst = static_cast<uint32_t>(m.refs.size());
        p.width = ReadBits(e, m, where);
        ReadRange(po, p.width, where, p.msb, p.lsb);
        if (!m.portIndex.emplace(p.name, static_cast<uint32_t>(m.ports.size())).second)
            Fail(where.Text() + ": given twice");
        p.pinPos = m.numPins;
        m.numPins += p.width;
        m.ports.push_back(p);
    }
}

void ReadModuleAttrs(Module& m, TextPool& pool) {
    Where where{m.name, {}, {}, {}};
    object attrs;
    if (!OptionalObject(m.json, "attributes", where, attrs)) return;
    for (auto kv : attrs) {
        std::string_view k = kv.key;
        if (k == "blackbox" || k == "whitebox") {
            if (ValueIsTrue(ReadValue(kv.value, pool, where))) m.blackbox = true;
        } else if (k == "top") {
            m.topAttr = ValueIsTrue(ReadValue(kv.value, pool, where));
        } else if (k == "PART") {
            m.part = pool.Keep(ValueText(ReadValue(kv.value, pool, where), pool));
        }
    }
}

// The modules a module instantiates, each once, in cell order. Whether a
// child is a black box is known only when every module's attributes are
// read, so those are dropped later (DropBlackboxChildren).
void ReadChildren(const Design& d, Module& m, uint32_t self, std::vector<uint32_t>& stamp) {
    Where where{m.name, {}, {}, {}};
    object cells;
    if (!OptionalObject(m.json, "cells", where, cells)) return;
    // Runs of cells of one type are common: the last type is not looked up
    // again.
    std::string_view last;
    for (auto kv : cells) {
        where.cell = kv.key;
        object co = AsObject(kv.value, where, "a cell");
        element t;
        std::string_view type;
        if (co.at_key("type").get(t) || t.get_string().get(type))
            Fail(where.Text() + ": missing or bad \"type\"");
        if (type == last) continue;
        last = type;
        auto it = d.moduleIndex.find(PublicName(type));
        if (it == d.moduleIndex.end()) continue;
        if (stamp[it->second] == self + 1) continue;
        stamp[it->second] = self + 1;
        m.children.push_back(it->second);
    }
}

template <typename T>
void Trim(std::vector<T>& v) {
    if (v.capacity() - v.size() > v.size() / 8 + 256) v.shrink_to_fit();
}

}  // namespace

uint32_t ReadBits(element e, Module& m, const Where& where) {
    simdjson::dom::array arr;
    if (e.get_array().get(arr)) Fail(where.Text() + ": expected an array of bits");
    uint32_t n = 0;
    for (element b : arr) {
        int32_t ref;
        switch (b.type()) {
            case element_type::INT64: {
                int64_t v = int64_t(b);
                if (v < 0 || v > std::numeric_limits<int32_t>::max())
                    Fail(where.Text() + ": bad bit value " + std::to_string(v));
                ref = static_cast<int32_t>(v);
                break;
            }
            case element_type::STRING: {
                std::string_view s = std::string_view(b);
                if (s == "0")
                    ref = kConst0;
                else if (s == "1")
                    ref = kConst1;
                else if (s == "x")
                    ref = kConstX;
                else if (s == "z")
                    ref = kConstZ;
                else
                    Fail(where.Text() + ": bad bit value \"" + std::string(s) + "\"");
                break;
            }
            default:
                Fail(where.Text() +
                     ": bad bit value (expected a net number or \"0\", \"1\", "
                     "\"x\", \"z\")");
        }
        m.refs.push_back(ref);
        // The model holds buses of up to 2^24 bits.
        if (++n > (1u << 24)) Fail(where.Text() + ": more than 16777216 bits");
    }
    return n;
}

Value ReadValue(element e, TextPool& pool, const Where& where) {
    Value v;
    switch (e.type()) {
        case element_type::STRING: {
            std::string_view s = std::string_view(e);
            // A string of only bit characters and blanks carries one extra
            // trailing blank that marks it as a string, not a bit vector.
            size_t k = 0;
            while (k < s.size() && IsBitChar(s[k])) ++k;
            size_t bitsEnd = k;
            while (k < s.size() && s[k] == ' ') ++k;
            if (k == s.size() && bitsEnd == s.size() && !s.empty()) {
                v.kind = ValueKind::Bits;
                v.text = s;
            } else if (k == s.size() && bitsEnd < s.size()) {
                v.text = pool.Keep(s.substr(0, s.size() - 1));
            } else {
                v.text = s;
            }
            return v;
        }
        case element_type::INT64:
            v.i = int64_t(e);
            if (v.i < std::numeric_limits<int32_t>::min() ||
                v.i > std::numeric_limits<int32_t>::max()) {
                v.kind = ValueKind::Bits;
                v.text = pool.Keep(BinaryText(static_cast<uint64_t>(v.i), v.i < 0));
            } else {
                v.kind = ValueKind::Int;
            }
            return v;
        case element_type::UINT64:
            v.kind = ValueKind::Bits;
            v.text = pool.Keep(BinaryText(uint64_t(e), false));
            return v;
        case element_type::DOUBLE:
            v.kind = ValueKind::Float;
            v.d = double(e);
            return v;
        case element_type::BOOL:
            v.kind = ValueKind::Bool;
            v.i = bool(e) ? 1 : 0;
            return v;
        default:
            Fail(where.Text() + ": expected a string or a number as value");
    }
}

Text JoinPath(std::string_view hdlname, TextPool& pool) {
    std::string t(hdlname);
    std::replace(t.begin(), t.end(), ' ', '/');
    return pool.Keep(t);
}

std::string_view ValueText(const Value& v, TextPool& pool) {
    switch (v.kind) {
        case ValueKind::String:
            return v.text;
        case ValueKind::Bits: {
            int64_t n;
            if (v.text.size() <= 63 && ValueToInt(v, n)) return pool.Keep(std::to_string(n));
            return v.text;
        }
        case ValueKind::Int:
        case ValueKind::Bool:
            return pool.Keep(std::to_string(v.i));
        case ValueKind::Float: {
            char buf[64];
            std::snprintf(buf, sizeof buf, "%.17g", v.d);
            return pool.Keep(buf);
        }
    }
    return v.text;
}

bool ValueIsTrue(const Value& v) {
    switch (v.kind) {
        case ValueKind::Bits:
            return v.text.find('1') != std::string_view::npos;
        case ValueKind::String:
            return !v.text.empty() && v.text != "0";
        case ValueKind::Float:
            return v.d != 0;
        default:
            return v.i != 0;
    }
}

bool ValueToInt(const Value& v, int64_t& out) {
    switch (v.kind) {
        case ValueKind::Int:
        case ValueKind::Bool:
            out = v.i;
            return true;
        case ValueKind::Float:
            if (!std::isfinite(v.d) || v.d != std::floor(v.d) || std::fabs(v.d) > 9e18)
                return false;
            out = static_cast<int64_t>(v.d);
            return true;
        case ValueKind::Bits: {
            // Integers come as 32-bit two's complement vectors.
            uint64_t u = 0;
            size_t first = v.text.find('1');
            if (v.text.find_first_of("xz") != std::string_view::npos) return false;
            if (first == std::string_view::npos) {
                out = 0;
                return true;
            }
            if (v.text.size() - first > 63) return false;
            for (size_t k = first; k < v.text.size(); ++k) u = (u << 1) | (v.text[k] == '1');
            if (v.text.size() == 32 && v.text[0] == '1')
                out = static_cast<int64_t>(u) - (int64_t(1) << 32);
            else
                out = static_cast<int64_t>(u);
            return true;
        }
        case ValueKind::String: {
            std::string s(v.text);
            char* end = nullptr;
            errno = 0;
            long long n = std::strtoll(s.c_str(), &end, 10);
            if (s.empty() || errno != 0 || *end != '\0') return false;
            out = n;
            return true;
        }
    }
    return false;
}

namespace {

void ReadModuleListOnce(Design& d) {
    SplitModules(d);
    std::vector<uint32_t> all(d.modules.size());
    for (uint32_t i = 0; i < all.size(); ++i) all[i] = i;
    for (uint32_t i = 0; i < d.modules.size(); ++i)
        if (!d.moduleIndex.emplace(d.modules[i].name, i).second) {
            // A fault of the text anywhere is reported first.
            ParseAhead check(d, all);
            for (size_t k = 0; k < all.size(); ++k) check.Open(k);
            Fail("module '" + std::string(d.modules[i].name) + "' is defined twice");
        }
    if (d.modules.empty()) Fail("no modules");
    // Each module is parsed once, by either thread, and read by the thread
    // that parsed it. The first fault of a module's content is reported
    // only when every module has been parsed, so that a fault of the text
    // comes first.
    d.scratch.stamp.assign(d.modules.size(), 0);
    d.threadScratch.stamp.assign(d.modules.size(), 0);
    ParseAhead ahead(d, all, [&d](size_t k, int thread) {
        ReadModule(d, d.modules[k], static_cast<uint32_t>(k), thread ? d.threadPool : d.pool,
                   thread ? d.threadScratch : d.scratch);
    });
    for (size_t k = 0; k < all.size(); ++k) ahead.Open(k);
    for (const Module& m : d.modules)
        if (m.listFault) std::rethrow_exception(m.listFault);
    for (Module& m : d.modules) DropBlackboxChildren(d, m);
}

}  // namespace

void ReadModuleList(Design& d) {
    // Connections to library cells are matched while the modules are read.
    LoadCellLibrary(d);
    try {
        ReadModuleListOnce(d);
    } catch (const GuessFailed&) {
        d.modules.clear();
        d.moduleIndex.clear();
        d.exactSplit = true;
        ReadModuleListOnce(d);
    }
    // Every module's range has parsed: any later fault is the text's.
    d.exactSplit = true;
}

namespace {

void ReadNetNames(Module& m, TextPool& pool, std::vector<NetEntry>& entries) {
    Where where{m.name, {}, "net", {}};
    entries.clear();
    object netnames;
    if (!OptionalObject(m.json, "netnames", where, netnames)) return;
    for (auto kv : netnames) {
        where.key = kv.key;
        object no = AsObject(kv.value, where, "a net");
        NetEntry n;
        n.name = pool.Keep(PublicName(kv.key));
        n.hidden = ReadInt(no, "hide_name", 0, where) != 0;
        element bits;
        if (no.at_key("bits").get(bits)) Fail(where.Text() + ": missing \"bits\"");
        n.bitFirst = static_cast<uint32_t>(m.refs.size());
        n.width = ReadBits(bits, m, where);
        ReadRange(no, n.width, where, n.msb, n.lsb);
        Attrs a = ReadNetAttrs(no, pool, where);
        n.aka = a.aka;
        n.flags = a.nameFlags;
        auto pit = m.portIndex.find(PublicName(kv.key));
        if (pit != m.portIndex.end()) {
            n.port = static_cast<int32_t>(pit->second);
            if (*a.pinName) m.ports[pit->second].pinName = a.pinName;
        }
        if (a.global == "SETRESET" || a.global == "TRISTATE") {
            if (n.width > 0 && m.refs[n.bitFirst] >= 0) {
                GlobalNet g;
                g.setReset = a.global == "SETRESET";
                g.ref = static_cast<int32_t>(n.bitFirst);  // mapped below
                g.conn = static_cast<int32_t>(g.setReset ? a.setResetConn : a.tristateConn);
                g.floatVal = static_cast<int32_t>(a.floatVal);
                m.globals.push_back(g);
            }
        }
        entries.push_back(n);
    }
}

}  // namespace

void DropBlackboxChildren(const Design& d, Module& m) {
    auto& ch = m.children;
    ch.erase(
        std::remove_if(ch.begin(), ch.end(), [&](uint32_t c) { return d.modules[c].blackbox; }),
        ch.end());
}

void ReadModule(const Design& d, Module& m, uint32_t self, TextPool& pool, NameScratch& scratch,
                bool speculate) {
    try {
        ReadModuleAttrs(m, pool);
        ReadPorts(m, pool);
        ReadChildren(d, m, self, scratch.stamp);
    } catch (...) {
        m.listFault = std::current_exception();
        return;
    }
    try {
        ReadNetNames(m, pool, scratch.entries);
        object cells;
        if (OptionalObject(m.json, "cells", Where{m.name, {}, {}, {}}, cells))
            ReadCellTexts(d, m, cells, pool, scratch, speculate);
        NameNets(m, scratch, pool);
        for (GlobalNet& g : m.globals) g.ref = m.refs[static_cast<size_t>(g.ref)];
        // Growth left room at the ends of the tables; the model is built
        // while they live.
        Trim(m.refs);
        Trim(m.cells);
        Trim(m.conns);
        Trim(m.params);
    } catch (...) {
        // A fault of the content, or no memory: raised in file order, and
        // only should the top reach the module.
        m.digestFault = std::current_exception();
    }
}

}  // namespace nlw_json

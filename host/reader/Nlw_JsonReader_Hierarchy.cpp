// The module hierarchy: instantiation cycles, the top module, the modules
// the top reaches (listed bottom-up) and the resolution of their cells.
#include <string>

#include "port/Port.h"
#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

std::string NameList(const Design& d, const std::vector<uint32_t>& mods, const char* sep) {
    std::string t;
    for (uint32_t m : mods) {
        if (!t.empty()) t += sep;
        t += d.modules[m].name;
    }
    return t;
}

// Depth-first over the instantiation graph with an explicit stack (chains of
// nested modules can be as deep as the file is long). Leaves every module's
// finish order in postOrder: a module after all it instantiates.
void CheckCycles(const Design& d, std::vector<uint32_t>& postOrder) {
    const size_t n = d.modules.size();
    enum : uint8_t { kNew, kOpen, kDone };
    std::vector<uint8_t> state(n, kNew);
    std::vector<std::pair<uint32_t, size_t>> stack;
    for (uint32_t s = 0; s < n; ++s) {
        if (d.modules[s].blackbox || state[s] != kNew) continue;
        state[s] = kOpen;
        stack.push_back({s, 0});
        while (!stack.empty()) {
            auto& [m, next] = stack.back();
            const std::vector<uint32_t>& ch = d.modules[m].children;
            if (next < ch.size()) {
                uint32_t c = ch[next++];
                if (state[c] == kOpen) {
                    std::vector<uint32_t> cycle;
                    size_t k = stack.size();
                    while (k > 0 && stack[k - 1].first != c) --k;
                    for (size_t j = k - 1; j < stack.size(); ++j) cycle.push_back(stack[j].first);
                    cycle.push_back(c);
                    Fail("module instantiation cycle: " + NameList(d, cycle, " -> "));
                }
                if (state[c] == kNew) {
                    state[c] = kOpen;
                    stack.push_back({c, 0});
                }
            } else {
                state[m] = kDone;
                postOrder.push_back(m);
                stack.pop_back();
            }
        }
    }
}

uint32_t ChooseTop(const Design& d) {
    if (d.options.top) {
        auto it = d.moduleIndex.find(d.options.top);
        if (it == d.moduleIndex.end())
            Fail("top module '" + std::string(d.options.top) + "' not found");
        if (d.modules[it->second].blackbox)
            Fail("top module '" + std::string(d.options.top) + "' is a blackbox");
        return it->second;
    }
    std::vector<uint32_t> marked, unused;
    std::vector<bool> instantiated(d.modules.size(), false);
    for (const Module& m : d.modules)
        for (uint32_t c : m.children) instantiated[c] = true;
    for (uint32_t i = 0; i < d.modules.size(); ++i) {
        const Module& m = d.modules[i];
        if (m.blackbox) continue;
        if (m.topAttr) marked.push_back(i);
        if (!instantiated[i]) unused.push_back(i);
    }
    if (marked.size() == 1) return marked[0];
    if (marked.size() > 1)
        Fail("several modules carry the \"top\" attribute: " + NameList(d, marked, ", ") +
             "; name the top module");
    if (unused.size() == 1) return unused[0];
    if (unused.empty()) Fail("no top module candidate: every module is a blackbox or instantiated");
    Fail("several top module candidates: " + NameList(d, unused, ", ") + "; name the top module");
}

// A module read on the guess that a library cell's name names no module
// of its own is read again when it does.
void Reread(Design& d, Module& m, uint32_t self) {
    Module fresh;
    fresh.name = m.name;
    fresh.nameText = m.nameText;
    fresh.textBegin = m.textBegin;
    fresh.textEnd = m.textEnd;
    fresh.reachable = m.reachable;
    m = std::move(fresh);
    simdjson::dom::parser parser;
    simdjson::dom::element root;
    const simdjson::error_code error =
        parser
            .parse(reinterpret_cast<const uint8_t*>(d.text + m.textBegin), m.textEnd - m.textBegin,
                   false)
            .get(root);
    // The text parsed before.
    if (error == simdjson::MEMALLOC) throw std::bad_alloc();
    if (error || root.get_object().get(m.json)) FailParse(d, error);
    NameScratch scratch;
    scratch.stamp.assign(d.modules.size(), 0);
    ReadModule(d, m, self, d.pool, scratch, false);
    if (m.listFault) std::rethrow_exception(m.listFault);
    DropBlackboxChildren(d, m);
}

}  // namespace

void LoadCellLibrary(Design& d) {
    const char* path = Port_Env::GetDataFileName("cells.dat", 0);
    if (!path) return;
    std::string error;
    if (!d.cellLib.Load(path, error)) d.cellLibError = "cannot use the cell library: " + error;
}

void ResolveHierarchy(Design& d) {
    std::vector<uint32_t> postOrder;
    CheckCycles(d, postOrder);
    d.top = ChooseTop(d);
    // Reach from the top; the finish order is already bottom-up.
    std::vector<uint32_t> todo{d.top};
    d.modules[d.top].reachable = true;
    while (!todo.empty()) {
        uint32_t m = todo.back();
        todo.pop_back();
        for (uint32_t c : d.modules[m].children)
            if (!d.modules[c].reachable) {
                d.modules[c].reachable = true;
                todo.push_back(c);
            }
    }
    for (uint32_t m : postOrder)
        if (d.modules[m].reachable) d.bottomUp.push_back(m);

    if (!d.cellLibError.empty()) Fail(d.cellLibError);
    // Types are met in file order of modules and cells.
    for (uint32_t i = 0; i < d.modules.size(); ++i) {
        Module& m = d.modules[i];
        if (!m.reachable) continue;
        if (!ResolveCells(d, m)) {
            Reread(d, m, i);
            ResolveCells(d, m);
        }
    }
    for (uint32_t mi : d.bottomUp) {
        Module& m = d.modules[mi];
        m.padsBelow = m.ownPads;
        for (uint32_t c : m.children) m.padsBelow = m.padsBelow || d.modules[c].padsBelow;
    }
}

}  // namespace nlw_json

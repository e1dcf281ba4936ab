// Unfolding the hierarchy: every instance of a module becomes a macro block
// with its own ports, signals and children, made depth-first in cell order.
// The walk keeps its own stack, so nesting depth is bounded only by memory.
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <deque>
#include <string>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

struct Frame {
    Nlw_NlBlock* block = nullptr;
    uint32_t module = 0;
    uint32_t nextCell = 0;
    std::vector<Nlw_NlSignal*> signals;
    Nlw_NlSignal* consts[4] = {nullptr, nullptr, nullptr, nullptr};
    // The top-level port pin name that reaches each net, for pad cells.
    std::vector<Text> pinNames;
};

class Unfolder {
public:
    Unfolder(Design& d, Nlw_NlView& view) : d_(d), b_(&view) {}

    void Run() {
        Nlw_NlBlock* root = CreateTop(d_, b_);
        stack_.emplace_back();
        stack_.back().block = root;
        stack_.back().module = d_.top;
        Open(nullptr, nullptr);
        ApplyGlobals(d_.modules[d_.top], b_, root, stack_.back().signals);
        while (!stack_.empty()) {
            if (!Step()) stack_.pop_back();
        }
    }

private:
    // Signals of a new frame's module and the inside connections of its
    // ports. parent and via (the cell the frame's block was made for) are
    // null for the top.
    void Open(const Frame* parent, const Cell* via) {
        Frame& f = stack_.back();
        const Module& m = d_.modules[f.module];
        f.signals.resize(m.numNets);
        buses_.assign(m.buses.size(), nullptr);
        for (uint32_t n = 0; n < m.numNets; ++n) {
            const NetName& nn = m.nets[n];
            if (nn.bus >= 0) {
                Nlw_NlBus*& bus = buses_[static_cast<size_t>(nn.bus)];
                if (!bus) {
                    const NetBus& nb = m.buses[static_cast<size_t>(nn.bus)];
                    bus = b_.AddSignalBus(f.block, nb.name, nb.msb, nb.lsb);
                    if (*nb.aka) bus->SetAka(nb.aka);
                }
                f.signals[n] = b_.GetSignalBusMember(bus, nn.index);
                AddNameFlags(f.signals[n], m.buses[static_cast<size_t>(nn.bus)].flags);
            } else {
                f.signals[n] = b_.AddSignal(f.block, nn.name);
                if (*nn.aka) f.signals[n]->SetAka(nn.aka);
                AddNameFlags(f.signals[n], nn.flags);
            }
        }
        MakeConstMembers(b_, m, buses_, constMembers_);
        for (const Port& p : m.ports)
            for (uint32_t i = 0; i < p.width; ++i) {
                int32_t ref = m.refs[p.bitFirst + i];
                Nlw_NlSignal* s = ref >= 0 ? f.signals[static_cast<size_t>(ref)]
                                           : PortConstSignal(b_, f.block, p, p.bitFirst + i, ref,
                                                             constMembers_, f.consts);
                if (s) b_.ConnectChild(f.block->GetPin(p.BitPos(i)), s);
            }
        if (m.padsBelow) InheritPinNames(f, m, parent, via);
    }

    void InheritPinNames(Frame& f, const Module& m, const Frame* parent, const Cell* via) {
        f.pinNames.assign(m.numNets, "");
        if (!parent) {
            for (const Port& p : m.ports)
                for (uint32_t i = 0; i < p.width && *p.pinName; ++i) {
                    int32_t ref = m.refs[p.bitFirst + i];
                    if (ref >= 0 && !*f.pinNames[size_t(ref)]) f.pinNames[size_t(ref)] = p.pinName;
                }
            return;
        }
        const Module& pm = d_.modules[parent->module];
        for (uint32_t k = 0; k < via->connCount; ++k) {
            const Conn& cn = pm.conns[via->connFirst + k];
            const Port& p = m.ports[cn.slot];
            for (uint32_t i = 0; i < cn.width; ++i) {
                int32_t outer = pm.refs[cn.bitFirst + i];
                int32_t inner = m.refs[p.bitFirst + i];
                if (outer >= 0 && inner >= 0 && !*f.pinNames[size_t(inner)])
                    f.pinNames[size_t(inner)] = parent->pinNames[size_t(outer)];
            }
        }
    }

    // Makes the frame's next cells; returns false when the frame is done.
    // Stops after making a macro, whose frame is then worked on first.
    bool Step() {
        size_t fi = stack_.size() - 1;
        const Module& m = d_.modules[stack_[fi].module];
        while (stack_[fi].nextCell < m.cells.size()) {
            Frame& f = stack_[fi];
            const Cell& c = m.cells[f.nextCell++];
            if (!c.macro) {
                const LibVariant& v = d_.variants[c.type];
                const LibType& lt = d_.types[v.base];
                Text padName = "";
                if (lt.pad && !*m.ExtraOf(c).pinName && !f.pinNames.empty()) {
                    int32_t ref = PadPinRef(m, c, lt);
                    if (ref >= 0) padName = f.pinNames[size_t(ref)];
                }
                std::vector<Nlw_NlSignal*>& sig = f.signals;
                CreateLeafCell(b_, m, c, v, lt, f.block, c.name, padName,
                               [&sig](int32_t ref, int32_t&) { return sig[size_t(ref)]; });
                continue;
            }
            Module& child = d_.modules[c.type];
            Nlw_NlBlock* mb = b_.CreateMacro(f.block, ModuleType(child, b_), c.name);
            if (*m.ExtraOf(c).aka) mb->SetAka(m.ExtraOf(c).aka);
            AddPorts(b_, child, mb);
            for (uint32_t k = 0; k < c.connCount; ++k) {
                const Conn& cn = m.conns[c.connFirst + k];
                const Port& p = child.ports[cn.slot];
                for (uint32_t i = 0; i < cn.width; ++i) {
                    int32_t ref = m.refs[cn.bitFirst + i];
                    Nlw_NlPin* pin = mb->GetPin(p.BitPos(i));
                    if (ref >= 0)
                        b_.Connect(pin, f.signals[size_t(ref)]);
                    else
                        TieConstant(b_, pin, ref);
                }
            }
            AddBlockProperties(m, c, nullptr, "", mb);
            stack_.emplace_back();
            stack_.back().block = mb;
            stack_.back().module = c.type;
            // The parent frame stays in place: Open reads it through the
            // stack, which has just grown.
            Open(&stack_[fi], &c);
            return true;
        }
        return false;
    }

    Design& d_;
    Nlw_NlBuilder b_;
    std::deque<Frame> stack_;
    std::vector<Nlw_NlBus*> buses_;
    std::vector<std::pair<uint32_t, Nlw_NlSignal*>> constMembers_;
};

}  // namespace

// Counted in floating point, so that a hierarchy that multiplies out to
// 2^60 instances cannot overflow the count.
void CheckUnfoldedSize(const Design& d) {
    struct Size {
        double blocks = 0, pins = 0, nets = 0;
    };
    std::vector<Size> size(d.modules.size());
    for (uint32_t mi : d.bottomUp) {
        const Module& m = d.modules[mi];
        Size& s = size[mi];
        s.nets = m.numNets;
        for (const Cell& c : m.cells) {
            s.blocks += 1;
            if (c.macro) {
                const Size& child = size[c.type];
                s.blocks += child.blocks;
                s.pins += d.modules[c.type].numPins + child.pins;
                s.nets += child.nets;
            } else {
                for (uint32_t w : d.variants[c.type].width) s.pins += w;
            }
        }
    }
    const Size& top = size[d.top];
    // The model's objects with a share of their lists and names.
    const double bytes =
        1.5 * (top.blocks * (sizeof(Nlw_NlBlock) + 32) + top.pins * sizeof(Nlw_NlPin) +
               top.nets * (sizeof(Nlw_NlSignal) + 32));
    double limit = double(::sysconf(_SC_PHYS_PAGES)) * double(::sysconf(_SC_PAGESIZE));
    struct rlimit rl;
    if (::getrlimit(RLIMIT_AS, &rl) == 0 && rl.rlim_cur != RLIM_INFINITY)
        limit = std::min(limit, double(rl.rlim_cur));
    if (limit <= 0) limit = 1e18;
    if (bytes <= limit && top.blocks < 4e9) return;
    const double gib = 1024.0 * 1024.0 * 1024.0;
    char text[256];
    std::snprintf(text, sizeof text,
                  "the hierarchy unfolds to %.4g instances, which need about %.3g GiB of "
                  "memory; this machine has %.3g GiB",
                  top.blocks, bytes / gib, limit / gib);
    Fail(text);
}

void BuildUnfolded(Design& d, Nlw_NlView& view) {
    Unfolder(d, view).Run();
}

}  // namespace nlw_json

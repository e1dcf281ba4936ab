// Flattening the hierarchy: every library cell below the top becomes a leaf
// of the top block, named by its instance path joined with "/". A module
// instance's port nets merge with the nets they connect to in the parent; a
// merged net takes the name of its highest-level member.
#include <string>
#include <unordered_map>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

// One module instance of the flattened tree, in depth-first order.
struct Inst {
    uint32_t module;
    uint32_t base;   // its first net in the flat numbering
    int32_t parent;  // index of the parent instance, -1 for the top
    Text name;       // the cell name in the parent
};

class Flattener {
public:
    Flattener(Design& d, Nlw_NlView& view) : d_(d), b_(&view) {}

    void Run() {
        Enumerate();
        ChooseNames();
        Nlw_NlBlock* root = CreateTop(d_, b_);
        CreateSignals(root);
        ConnectTopPorts(root);
        const Module& top = d_.modules[d_.top];
        std::vector<Nlw_NlSignal*> topSignals(top.numNets);
        for (uint32_t n = 0; n < top.numNets; ++n) topSignals[n] = signal_[Find(n)];
        ApplyGlobals(top, b_, root, topSignals);
        CreateLeaves(root);
    }

private:
    uint32_t Find(uint32_t x) {
        while (uf_[x] != x) {
            uf_[x] = uf_[uf_[x]];
            x = uf_[x];
        }
        return x;
    }

    void Union(uint32_t a, uint32_t b) {
        a = Find(a);
        b = Find(b);
        if (a == b) return;
        // The lower number stays the root, so a root is always the member
        // met first; its constant tag carries over.
        if (b < a) std::swap(a, b);
        uf_[b] = a;
        if (!const_[a]) const_[a] = const_[b];
    }

    void Tie(uint32_t net, int32_t ref) {
        uint32_t r = Find(net);
        if (!const_[r]) const_[r] = static_cast<int8_t>(ref);
    }

    // Lists the instances depth-first and merges port nets with the parent's.
    void Enumerate() {
        uint64_t total = d_.modules[d_.top].numNets;
        insts_.push_back({d_.top, 0, -1, ""});
        std::vector<std::pair<uint32_t, uint32_t>> stack{{0, 0}};  // instance, next cell
        while (!stack.empty()) {
            auto [ii, next] = stack.back();
            const Module& m = d_.modules[insts_[ii].module];
            if (next >= m.cells.size()) {
                stack.pop_back();
                continue;
            }
            stack.back().second = next + 1;
            const Cell& c = m.cells[next];
            if (!c.macro) continue;
            const Module& child = d_.modules[c.type];
            Inst ci{c.type, static_cast<uint32_t>(total), static_cast<int32_t>(ii), c.name};
            total += child.numNets;
            if (total > 0xFFFFFFF0u) Fail("design too large to flatten");
            insts_.push_back(ci);
            stack.push_back({static_cast<uint32_t>(insts_.size() - 1), 0});
            links_.push_back({ii, next});
        }
        uf_.resize(total);
        for (uint32_t k = 0; k < total; ++k) uf_[k] = k;
        const_.assign(total, 0);
        for (size_t k = 0; k < links_.size(); ++k)
            Link(insts_[links_[k].first], insts_[k + 1], links_[k].second);
    }

    void Link(const Inst& parent, const Inst& child, uint32_t cellIndex) {
        const Module& pm = d_.modules[parent.module];
        const Module& cm = d_.modules[child.module];
        const Cell& c = pm.cells[cellIndex];
        for (uint32_t k = 0; k < c.connCount; ++k) {
            const Conn& cn = pm.conns[c.connFirst + k];
            const Port& p = cm.ports[cn.slot];
            for (uint32_t i = 0; i < cn.width; ++i) {
                int32_t outer = pm.refs[cn.bitFirst + i];
                int32_t inner = cm.refs[p.bitFirst + i];
                // A constant crosses a port only the way the port carries
                // values: a module ties the parent's net through an output,
                // the parent ties the module's net through an input. An
                // open or constant connection of an output leaves the
                // module's net as the module drives it, and a constant a
                // module gives its input inside leaves the parent's net.
                const bool in = p.dir == NLW_DIR_INPUT || p.dir == NLW_DIR_UNTYPED;
                const bool out = p.dir != NLW_DIR_INPUT;
                if (outer >= 0 && inner >= 0)
                    Union(parent.base + uint32_t(outer), child.base + uint32_t(inner));
                else if (outer >= 0 && out && inner != kConstZ)
                    Tie(parent.base + uint32_t(outer), inner);
                else if (inner >= 0 && in && outer != kConstZ)
                    Tie(child.base + uint32_t(inner), outer);
            }
        }
    }

    // The name of a merged net: its member in the highest instance (the
    // first met, as instances are listed parents first), best ranked there.
    void ChooseNames() {
        best_.assign(uf_.size(), -1);
        for (size_t ii = 0; ii < insts_.size(); ++ii) {
            const Inst& in = insts_[ii];
            const Module& m = d_.modules[in.module];
            for (uint32_t n = 0; n < m.numNets; ++n) {
                uint32_t r = Find(in.base + n);
                int32_t& b = best_[r];
                if (b < 0) {
                    b = static_cast<int32_t>(in.base + n);
                } else if (uint32_t(b) >= in.base && uint32_t(b) < in.base + m.numNets &&
                           m.nets[n].rank < m.nets[uint32_t(b) - in.base].rank) {
                    b = static_cast<int32_t>(in.base + n);
                }
            }
        }
    }

    // Keeps path_ as the instance path of insts_[ii] followed by "/".
    void EnterPath(size_t ii) {
        int32_t parent = insts_[ii].parent;
        while (!pathStack_.empty() && pathStack_.back().first != parent) pathStack_.pop_back();
        path_.resize(pathStack_.empty() ? 0 : pathStack_.back().second);
        if (parent >= 0) {
            path_ += insts_[ii].name;
            path_ += '/';
        }
        pathStack_.push_back({static_cast<int32_t>(ii), path_.size()});
    }

    const char* Named(std::string_view name) {
        name_.assign(path_);
        name_ += name;
        return name_.c_str();
    }

    void CreateSignals(Nlw_NlBlock* root) {
        signal_.assign(uf_.size(), nullptr);
        std::vector<Nlw_NlBus*> buses;
        for (size_t ii = 0; ii < insts_.size(); ++ii) {
            EnterPath(ii);
            const Inst& in = insts_[ii];
            const Module& m = d_.modules[in.module];
            buses.assign(m.buses.size(), nullptr);
            for (uint32_t n = 0; n < m.numNets; ++n) {
                uint32_t g = in.base + n;
                uint32_t r = Find(g);
                if (const_[r] || best_[r] != static_cast<int32_t>(g)) continue;
                const NetName& nn = m.nets[n];
                Nlw_NlSignal* s;
                if (nn.bus >= 0) {
                    Nlw_NlBus*& bus = buses[size_t(nn.bus)];
                    if (!bus) {
                        const NetBus& nb = m.buses[size_t(nn.bus)];
                        bus = b_.AddSignalBus(root, Named(nb.name), nb.msb, nb.lsb);
                        if (*nb.aka) bus->SetAka(nb.aka);
                    }
                    s = b_.GetSignalBusMember(bus, nn.index);
                    AddNameFlags(s, m.buses[size_t(nn.bus)].flags);
                } else {
                    s = b_.AddSignal(root, Named(nn.name));
                    if (*nn.aka) s->SetAka(nn.aka);
                    AddNameFlags(s, nn.flags);
                }
                signal_[r] = s;
            }
            MakeConstMembers(b_, m, buses, made_);
            if (ii == 0) topConsts_ = made_;
        }
        pathStack_.clear();
        path_.clear();
    }

    void ConnectTopPorts(Nlw_NlBlock* root) {
        const Module& top = d_.modules[d_.top];
        for (const Port& p : top.ports)
            for (uint32_t i = 0; i < p.width; ++i) {
                int32_t ref = top.refs[p.bitFirst + i];
                if (ref >= 0) {
                    uint32_t r = Find(uint32_t(ref));
                    if (!const_[r]) {
                        b_.ConnectChild(root->GetPin(p.BitPos(i)), signal_[r]);
                        if (*p.pinName) topPinName_.emplace(r, p.pinName);
                        continue;
                    }
                    ref = const_[r];
                }
                if (Nlw_NlSignal* s =
                        PortConstSignal(b_, root, p, p.bitFirst + i, ref, topConsts_, consts_))
                    b_.ConnectChild(root->GetPin(p.BitPos(i)), s);
            }
    }

    void CreateLeaves(Nlw_NlBlock* root) {
        for (size_t ii = 0; ii < insts_.size(); ++ii) {
            EnterPath(ii);
            const Inst& in = insts_[ii];
            const Module& m = d_.modules[in.module];
            auto net = [this, &in](int32_t ref, int32_t& constRef) -> Nlw_NlSignal* {
                uint32_t r = Find(in.base + uint32_t(ref));
                if (const_[r]) {
                    constRef = const_[r];
                    return nullptr;
                }
                return signal_[r];
            };
            for (const Cell& c : m.cells) {
                if (c.macro) continue;
                const LibVariant& v = d_.variants[c.type];
                const LibType& lt = d_.types[v.base];
                Text padName = "";
                if (lt.pad && !*m.ExtraOf(c).pinName) {
                    int32_t ref = PadPinRef(m, c, lt);
                    if (ref >= 0) {
                        auto it = topPinName_.find(Find(in.base + uint32_t(ref)));
                        if (it != topPinName_.end()) padName = it->second;
                    }
                }
                CreateLeafCell(b_, m, c, v, lt, root, Named(c.name), padName, net);
            }
        }
    }

    Design& d_;
    Nlw_NlBuilder b_;
    std::vector<Inst> insts_;
    // The cell each instance after the top was made for: parent instance,
    // cell index.
    std::vector<std::pair<uint32_t, uint32_t>> links_;
    std::vector<uint32_t> uf_;
    std::vector<int8_t> const_;  // per merged net: the constant it is tied to, or 0
    std::vector<int32_t> best_;
    std::vector<Nlw_NlSignal*> signal_;
    std::unordered_map<uint32_t, Text> topPinName_;
    Nlw_NlSignal* consts_[4] = {nullptr, nullptr, nullptr, nullptr};
    std::vector<std::pair<uint32_t, Nlw_NlSignal*>> made_, topConsts_;
    std::string path_, name_;
    std::vector<std::pair<int32_t, size_t>> pathStack_;
};

}  // namespace

void BuildFlat(Design& d, Nlw_NlView& view) {
    Flattener(d, view).Run();
}

}  // namespace nlw_json

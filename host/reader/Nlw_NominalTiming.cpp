#include "reader/Nlw_NominalTiming.h"

#include <algorithm>
#include <cstring>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

#include "model/Nlw_Nl.h"
#include "port/Port.h"
#include "reader/Nlw_Liberty.h"

namespace {

// A pin's name without a bus index: "DO" for "DO[3]".
std::string BaseName(const char* name) {
    const char* bracket = std::strchr(name, '[');
    return bracket && bracket != name ? std::string(name, bracket) : std::string(name);
}

class Builder {
public:
    Builder(const Nlw_Liberty& library, Nlw_Timing& timing) : library_(library), timing_(timing) {}

    size_t Run(Nlw_NlView& view) {
        const UT_DARRAY<Nlw_NlBlock*>& macros = view.GetMacros();
        for (size_t i = 0; i < macros.GetCount(); ++i) {
            Nlw_NlBlock* macro = macros[i];
            if (macro == nullptr) continue;
            for (Nlw_NlBlock* child : macro->GetChildren())
                if (!child->IsMacro()) AddCell(child);
        }
        // Nets: from every cell output and every input port of the top, to
        // every cell input and output port of the top they reach, through
        // the module ports between.
        for (size_t i = 0; i < macros.GetCount(); ++i) {
            Nlw_NlBlock* macro = macros[i];
            if (macro == nullptr) continue;
            if (macro->GetParent() == nullptr)
                for (Nlw_NlPin& port : macro->GetPins())
                    if (port.IsInput() && port.GetChildSignal())
                        AddNet(&port, port.GetChildSignal());
            for (Nlw_NlBlock* child : macro->GetChildren()) {
                if (child->IsMacro()) continue;
                for (Nlw_NlPin& pin : child->GetPins())
                    if (pin.IsOutput() && pin.GetSignal()) AddNet(&pin, pin.GetSignal());
            }
        }
        for (const std::string& type : unknown_)
            NLW_MSG().issueWarning(
                "The cell library's timing does not describe cell type '%s'; its cells get no "
                "nominal delays.\n",
                type.c_str());
        return cells_;
    }

private:
    Nlw_Rvalue Value(double ps) {
        Nlw_Rvalue r;
        r.v[0] = r.v[1] = r.v[2] = ps;
        r.present = 7;
        return r;
    }

    void Push(Nlw_TimingKind kind, Nlw_NlPin* pin1, uint8_t edge1, Nlw_NlPin* pin2, uint8_t edge2,
              std::initializer_list<double> values) {
        Nlw_TimingEntry e;
        e.kind = kind;
        e.pin1 = pin1;
        e.pin2 = pin2;
        e.edge1 = edge1;
        e.edge2 = edge2;
        e.firstValue = static_cast<uint32_t>(timing_.values.size());
        for (double v : values) timing_.values.push_back(Value(v));
        e.numValues = static_cast<uint8_t>(values.size());
        timing_.entries.push_back(e);
    }

    // A cell type's entries, worked out on its first cell by pin position
    // and replayed on the others: the cells of one model type share their
    // pin layout.
    struct Item {
        Nlw_TimingKind kind;
        uint8_t edge1, edge2;
        uint32_t pin1, pin2;
        std::vector<double> values;
    };
    struct TypeItems {
        bool known = false;
        std::vector<Item> items;
    };

    void AddCell(Nlw_NlBlock* cell) {
        auto found = byType_.find(cell->GetType());
        if (found == byType_.end()) found = byType_.emplace(cell->GetType(), Work(cell)).first;
        const TypeItems& type = found->second;
        if (!type.known) {
            unknown_.insert(cell->GetTypeName());
            return;
        }
        if (type.items.empty()) return;
        ++cells_;
        for (const Item& item : type.items) {
            Nlw_TimingEntry e;
            e.kind = item.kind;
            e.pin1 = cell->GetPin(item.pin1);
            e.pin2 = cell->GetPin(item.pin2);
            e.edge1 = item.edge1;
            e.edge2 = item.edge2;
            e.firstValue = static_cast<uint32_t>(timing_.values.size());
            for (double v : item.values) timing_.values.push_back(Value(v));
            e.numValues = static_cast<uint8_t>(item.values.size());
            timing_.entries.push_back(e);
        }
    }

    TypeItems Work(Nlw_NlBlock* cell) {
        TypeItems type;
        const std::vector<Nlw_LibertyArc>* arcs = library_.FindCell(cell->GetTypeName());
        if (arcs == nullptr) return type;
        type.known = true;
        auto index = [cell](const Nlw_NlPin* pin) {
            return static_cast<uint32_t>(pin - cell->GetPin(0));
        };
        // Paths first, then checks, as a cell's entries are kept.
        for (Nlw_NlPin& pin : cell->GetPins()) {
            const std::string base = BaseName(pin.GetWritableName());
            for (const Nlw_LibertyArc& arc : *arcs) {
                if (arc.kind != Nlw_TimingKind::IoPath || arc.pin != base) continue;
                Nlw_NlPin* from = cell->GetPinByAlias(arc.related.c_str());
                if (from == nullptr) continue;
                const double rise = arc.hasRise ? arc.rise : arc.fall;
                const double fall = arc.hasFall ? arc.fall : arc.rise;
                type.items.push_back({Nlw_TimingKind::IoPath,
                                      arc.edge,
                                      NLW_EDGE_NONE,
                                      index(from),
                                      index(&pin),
                                      {rise, fall}});
            }
        }
        for (Nlw_NlPin& pin : cell->GetPins()) {
            const std::string base = BaseName(pin.GetWritableName());
            for (const Nlw_LibertyArc& arc : *arcs) {
                if (arc.pin != base) continue;
                if (arc.kind != Nlw_TimingKind::Setup && arc.kind != Nlw_TimingKind::Recovery)
                    continue;
                Nlw_NlPin* ref = cell->GetPinByAlias(arc.related.c_str());
                if (ref == nullptr) continue;
                // A setup limit with its hold limit is one SETUPHOLD, a
                // recovery limit with its removal limit one RECREM.
                const Nlw_TimingKind partner = arc.kind == Nlw_TimingKind::Setup
                                                   ? Nlw_TimingKind::Hold
                                                   : Nlw_TimingKind::Removal;
                const Nlw_LibertyArc* other = nullptr;
                for (const Nlw_LibertyArc& o : *arcs)
                    if (o.kind == partner && o.pin == base && o.related == arc.related &&
                        o.edge == arc.edge)
                        other = &o;
                const double limit = std::max(arc.rise, arc.fall);
                if (other) {
                    type.items.push_back({arc.kind == Nlw_TimingKind::Setup
                                              ? Nlw_TimingKind::SetupHold
                                              : Nlw_TimingKind::RecRem,
                                          NLW_EDGE_NONE,
                                          arc.edge,
                                          index(&pin),
                                          index(ref),
                                          {limit, std::max(other->rise, other->fall)}});
                } else {
                    type.items.push_back(
                        {arc.kind, NLW_EDGE_NONE, arc.edge, index(&pin), index(ref), {limit}});
                }
            }
        }
        return type;
    }

    // Walks a net from its driver through module ports to its loads.
    void AddNet(Nlw_NlPin* driver, Nlw_NlSignal* start) {
        std::vector<Nlw_NlSignal*> todo{start};
        std::vector<Nlw_NlSignal*> seen{start};
        while (!todo.empty()) {
            Nlw_NlSignal* s = todo.back();
            todo.pop_back();
            for (Nlw_NlPin* p : s->GetPins()) {
                if (p == driver) continue;
                Nlw_NlBlock* block = p->GetBlock();
                Nlw_NlSignal* next = nullptr;
                if (!block->IsMacro()) {
                    if (p->GetDirection() == NLW_DIR_INPUT || p->GetDirection() == NLW_DIR_INOUT)
                        Push(Nlw_TimingKind::Interconnect, driver, NLW_EDGE_NONE, p, NLW_EDGE_NONE,
                             {0.0});
                    continue;
                }
                if (p->IsParentPin(s)) {
                    // A port of the module the net is in: out to the parent,
                    // or a load when it is an output of the top.
                    if (block->GetParent() == nullptr) {
                        if (p->IsOutput())
                            Push(Nlw_TimingKind::Interconnect, driver, NLW_EDGE_NONE, p,
                                 NLW_EDGE_NONE, {0.0});
                        continue;
                    }
                    next = p->GetSignal();
                } else {
                    next = p->GetChildSignal();
                }
                if (next == nullptr) continue;
                bool known = false;
                for (Nlw_NlSignal* k : seen) known = known || k == next;
                if (known) continue;
                seen.push_back(next);
                todo.push_back(next);
            }
        }
    }

    const Nlw_Liberty& library_;
    Nlw_Timing& timing_;
    std::set<std::string> unknown_;
    std::unordered_map<const Nlw_NlType*, TypeItems> byType_;
    size_t cells_ = 0;
};

}  // namespace

size_t Nlw_NominalTiming::Make(const Nlw_Liberty& library, Nlw_NlView& view, Nlw_Timing& timing) {
    timing.nominal = true;
    timing.source = "nominal";
    return Builder(library, timing).Run(view);
}

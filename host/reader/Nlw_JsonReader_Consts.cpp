// Constants and open bits: how constant bits of ports, named buses and pins
// are written as legal Verilog that keeps the design's meaning, and nets for
// the open bits of output buses.
#include <string>
#include <unordered_set>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

void TieConstant(Nlw_NlBuilder& b, Nlw_NlPin* pin, int32_t ref) {
    if (ref == kConstZ) return;
    const int dir = pin->GetDirection();
    if (dir == NLW_DIR_OUTPUT || dir == NLW_DIR_INOUT) return;
    b.SetTieOff(pin, ref == kConst1 ? 1 : ref == kConstX ? 2 : 0);
}

void MakeConstMembers(Nlw_NlBuilder& b, const Module& m, const std::vector<Nlw_NlBus*>& buses,
                      std::vector<std::pair<uint32_t, Nlw_NlSignal*>>& made) {
    made.clear();
    for (const ConstMember& c : m.constMembers) {
        Nlw_NlBus* bus = buses[static_cast<size_t>(c.bus)];
        if (!bus) continue;
        Nlw_NlSignal* s = b.GetSignalBusMember(bus, c.index);
        if (!s || s->GetPropertyByName("NLW_CONSTANT")) continue;
        s->AddProperty(Vdm_Property::NewInt("NLW_CONSTANT", c.ref == kConst1   ? 1
                                                            : c.ref == kConstX ? 2
                                                                               : 0));
        made.emplace_back(c.pos, s);
    }
}

Nlw_NlSignal* PortConstSignal(Nlw_NlBuilder& b, Nlw_NlBlock* block, const Port& p, uint32_t pos,
                              int32_t ref,
                              const std::vector<std::pair<uint32_t, Nlw_NlSignal*>>& members,
                              Nlw_NlSignal* (&cache)[4]) {
    // Inside, an input bit the design ties is read as the constant by the
    // pins themselves; the port's value goes nowhere. Assigning the
    // constant to it would drive the port.
    if (p.dir == NLW_DIR_INPUT) return nullptr;
    for (const auto& m : members)
        if (m.first == pos) return m.second;
    return ConstSignal(b, block, ref, cache);
}

namespace {

bool IsConnected(const Nlw_NlPin& pin) {
    return pin.GetSignal() || pin.GetPropertyByName("TIEOFF");
}

class OpenOutputs {
public:
    explicit OpenOutputs(Nlw_NlView& view) : b_(&view) {}

    void Mend(Nlw_NlBlock* macro) {
        used_.clear();
        next_ = 0;
        for (Nlw_NlBlock* child : macro->GetChildren()) {
            const size_t n = child->GetPinCount();
            for (size_t i = 0; i < n;) {
                Nlw_NlPin* first = child->GetPin(i);
                const Nlw_NlPinBus* bus = first->GetBus();
                size_t j = i + 1;
                while (j < n && bus && child->GetPin(j)->GetBus() == bus) ++j;
                const int dir = first->GetDirection();
                if (bus && (dir == NLW_DIR_OUTPUT || dir == NLW_DIR_INOUT))
                    Mend(macro, child, i, j);
                i = j;
            }
        }
    }

private:
    void Mend(Nlw_NlBlock* macro, Nlw_NlBlock* child, size_t from, size_t to) {
        bool any = false, open = false;
        for (size_t k = from; k < to; ++k) (IsConnected(*child->GetPin(k)) ? any : open) = true;
        if (!any || !open) return;
        for (size_t k = from; k < to; ++k) {
            Nlw_NlPin* pin = child->GetPin(k);
            if (!IsConnected(*pin)) b_.Connect(pin, b_.AddSignal(macro, FreshName(macro).c_str()));
        }
    }

    std::string FreshName(Nlw_NlBlock* macro) {
        if (used_.empty()) {
            used_.insert("");
            for (const Nlw_NlSignal* s : macro->GetSignals()) used_.insert(s->GetWritableName());
            for (const Nlw_NlPin& p : macro->GetPins()) used_.insert(p.GetWritableName());
            for (const Nlw_NlBlock* c : macro->GetChildren()) used_.insert(c->GetWritableName());
        }
        std::string name;
        do {
            name = "nlw_open_" + std::to_string(next_++);
        } while (!used_.insert(name).second);
        return name;
    }

    Nlw_NlBuilder b_;
    std::unordered_set<std::string> used_;
    uint32_t next_ = 0;
};

}  // namespace

void ConnectOpenOutputs(Nlw_NlView& view) {
    OpenOutputs mender(view);
    const UT_DARRAY<Nlw_NlBlock*>& macros = view.GetMacros();
    for (size_t i = 0; i < macros.GetCount(); ++i)
        if (macros[i]) mender.Mend(macros[i]);
}

}  // namespace nlw_json

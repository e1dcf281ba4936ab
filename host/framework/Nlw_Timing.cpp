#include "framework/Nlw_Timing.h"

#include "model/Nlw_Nl.h"

const char* Nlw_Timing::Keyword(Nlw_TimingKind kind) {
    switch (kind) {
        case Nlw_TimingKind::IoPath:
            return "IOPATH";
        case Nlw_TimingKind::Port:
            return "PORT";
        case Nlw_TimingKind::Interconnect:
            return "INTERCONNECT";
        case Nlw_TimingKind::Setup:
            return "SETUP";
        case Nlw_TimingKind::Hold:
            return "HOLD";
        case Nlw_TimingKind::SetupHold:
            return "SETUPHOLD";
        case Nlw_TimingKind::Recovery:
            return "RECOVERY";
        case Nlw_TimingKind::Removal:
            return "REMOVAL";
        case Nlw_TimingKind::RecRem:
            return "RECREM";
        case Nlw_TimingKind::Skew:
            return "SKEW";
        case Nlw_TimingKind::Width:
            return "WIDTH";
        case Nlw_TimingKind::Period:
            return "PERIOD";
        case Nlw_TimingKind::NoChange:
            return "NOCHANGE";
    }
    return "";
}

namespace {

int Depth(const Nlw_NlBlock* b) {
    int d = 0;
    for (; b; b = b->GetParent()) ++d;
    return d;
}

}  // namespace

Nlw_NlBlock* Nlw_Timing::GetScope(const Nlw_NlPin* pin) {
    Nlw_NlBlock* block = pin->GetBlock();
    return block->IsMacro() ? block : block->GetParent();
}

Nlw_NlBlock* Nlw_Timing::GetOwner(const Nlw_TimingEntry& e) {
    if (e.pin1 == nullptr) return nullptr;
    Nlw_NlBlock* a = GetScope(e.pin1);
    if (e.kind != Nlw_TimingKind::Interconnect || e.pin2 == nullptr) return a;
    Nlw_NlBlock* b = GetScope(e.pin2);
    // The innermost common ancestor: bring both to one depth, then climb
    // together. Hierarchies are shallow, so this stays cheap per entry.
    int da = Depth(a), db = Depth(b);
    for (; da > db; --da) a = a->GetParent();
    for (; db > da; --db) b = b->GetParent();
    while (a != b) {
        a = a->GetParent();
        b = b->GetParent();
    }
    return a;
}

const std::vector<uint32_t>& Nlw_Timing::GetEntriesOf(const Nlw_NlBlock* macro) {
    if (!ownersMade_) {
        ownersMade_ = true;
        for (uint32_t i = 0; i < entries.size(); ++i) byOwner_[GetOwner(entries[i])].push_back(i);
    }
    static const std::vector<uint32_t> kNone;
    auto it = byOwner_.find(macro);
    return it == byOwner_.end() ? kNone : it->second;
}

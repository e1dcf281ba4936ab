// Creation of model objects: types, blocks, ports, signals and connections.
#include "model/Nlw_NlBuilder.h"

#include <cstring>
#include <new>
#include <unordered_set>

#include "port/Port.h"

namespace {

// Wider buses are refused: their member tables would exhaust memory long
// before any real design needs them.
constexpr int64_t kMaxBusWidth = int64_t(1) << 24;

int64_t WidthOf(int32_t msb, int32_t lsb) {
    return (msb > lsb ? int64_t(msb) - lsb : int64_t(lsb) - msb) + 1;
}

bool CheckWidth(const char* what, const char* name, int32_t msb, int32_t lsb) {
    if (WidthOf(msb, lsb) <= kMaxBusWidth) return true;
    NLW_MSG().issueInternal("Nlw_NlBuilder: %s %s[%d:%d] is too wide; it is left out.\n", what,
                            name ? name : "", msb, lsb);
    return false;
}

bool CheckMacro(const Nlw_NlBlock* block, const char* operation) {
    if (block && block->IsMacro()) return true;
    NLW_MSG().issueInternal("Nlw_NlBuilder: %s needs a macro block.\n", operation);
    return false;
}

}  // namespace

// Types

Nlw_NlType* Nlw_NlBuilder::AddLibraryType(const char* name, bool timcell, bool funcell,
                                          int primType) {
    Nlw_NlType* type = new Nlw_NlType;
    type->view_ = view_;
    type->name_ = view_->Intern(name);
    type->timcell_ = timcell;
    type->funcell_ = funcell;
    type->primType_ = primType;
    type->index_.reset(new Nlw_NlNameIndex);
    view_->types_.push_back(type);
    return type;
}

Nlw_NlType* Nlw_NlBuilder::AddModuleType(const char* name) {
    Nlw_NlType* type = AddLibraryType(name, false, false, 0);
    type->isModule_ = true;
    return type;
}

void Nlw_NlBuilder::AddTypePin(Nlw_NlType* type, const char* name, int dir, int pinType) {
    if (type == nullptr || type->isModule_ || type->instantiated_) {
        NLW_MSG().issueInternal("Nlw_NlBuilder: pin %s added to a type that cannot take it.\n",
                                name ? name : "");
        return;
    }
    type->pinDefs_.push_back(
        {view_->Intern(name), static_cast<uint8_t>(dir), static_cast<uint8_t>(pinType), nullptr});
    type->index_->pinsBuilt = false;
}

Nlw_NlPinBus* Nlw_NlBuilder::AddTypePinBus(Nlw_NlType* type, const char* name, int dir, int32_t msb,
                                           int32_t lsb) {
    if (type == nullptr || type->isModule_ || type->instantiated_) {
        NLW_MSG().issueInternal("Nlw_NlBuilder: bus %s added to a type that cannot take it.\n",
                                name ? name : "");
        return nullptr;
    }
    if (!CheckWidth("pin bus", name, msb, lsb)) return nullptr;
    Nlw_NlPinBus* bus = NewPinBus(name, dir, msb, lsb, type->pinDefs_.size());
    bus->type_ = type;
    for (int64_t i = msb;; i += bus->posStep_ > 0 ? 1 : -1) {
        Nlw_NlMemberName(memberName_, bus->name_, i);
        type->pinDefs_.push_back({view_->Intern(memberName_.data(), memberName_.size()),
                                  static_cast<uint8_t>(dir), 0, bus});
        if (i == lsb) break;
    }
    type->pinBuses_.push_back(bus);
    type->pinBusArray_.Add(bus);
    type->index_->pinsBuilt = false;
    type->index_->busesBuilt = false;
    return bus;
}

// Blocks

Nlw_NlBlock* Nlw_NlBuilder::NewBlock(Nlw_NlBlock* parent, Nlw_NlType* type,
                                     const char* instanceName, bool macro) {
    void* mem = view_->arena_->Allocate(sizeof(Nlw_NlBlock), alignof(Nlw_NlBlock));
    Nlw_NlBlock* block = new (mem) Nlw_NlBlock;
    block->type_ = type;
    block->name_ = view_->Intern(instanceName);
    block->parent_ = parent;
    block->view_ = view_;
    if (macro) {
        block->macro_ = new Nlw_NlBlock::MacroData;
        view_->macros_.Add(block);
    }
    if (parent) parent->macro_->children.push_back(block);
    return block;
}

Nlw_NlBlock* Nlw_NlBuilder::CreateRoot(Nlw_NlType* type, const char* instanceName) {
    if (view_->root_) {
        NLW_MSG().issueInternal("Nlw_NlBuilder: the view already has a root block.\n");
        return view_->root_;
    }
    view_->root_ = NewBlock(nullptr, type, instanceName, true);
    return view_->root_;
}

Nlw_NlBlock* Nlw_NlBuilder::CreateMacro(Nlw_NlBlock* parent, Nlw_NlType* type,
                                        const char* instanceName) {
    if (!CheckMacro(parent, "CreateMacro")) return nullptr;
    return NewBlock(parent, type, instanceName, true);
}

Nlw_NlBlock* Nlw_NlBuilder::CreateLeaf(Nlw_NlBlock* parent, Nlw_NlType* type,
                                       const char* instanceName) {
    if (!CheckMacro(parent, "CreateLeaf")) return nullptr;
    if (type == nullptr || type->isModule_) {
        NLW_MSG().issueInternal("Nlw_NlBuilder: leaf %s needs a library cell type.\n",
                                instanceName ? instanceName : "");
        return nullptr;
    }
    Nlw_NlBlock* block = NewBlock(parent, type, instanceName, false);
    type->instantiated_ = true;
    const size_t n = type->pinDefs_.size();
    if (n) {
        void* mem = view_->arena_->Allocate(n * sizeof(Nlw_NlPin), alignof(Nlw_NlPin));
        Nlw_NlPin* pins = static_cast<Nlw_NlPin*>(mem);
        for (size_t i = 0; i < n; ++i) {
            const Nlw_NlType::PinDef& def = type->pinDefs_[i];
            Nlw_NlPin* pin = new (pins + i) Nlw_NlPin;
            pin->name_ = def.name;  // shared with the definition
            pin->owner_ = block;
            pin->bus_ = def.bus;
            pin->dir_ = def.dir;
            pin->pinType_ = def.pinType;
        }
        block->pins_ = pins;
        block->numPins_ = static_cast<uint32_t>(n);
    }
    ++view_->numLeaves_;
    return block;
}

// Ports

void Nlw_NlBuilder::ReservePorts(Nlw_NlBlock* macro, size_t count) {
    if (!CheckMacro(macro, "ReservePorts")) return;
    GrowPins(macro, count);
}

void Nlw_NlBuilder::GrowPins(Nlw_NlBlock* macro, size_t capacity) {
    Nlw_NlBlock::MacroData& data = *macro->macro_;
    if (capacity <= data.pinCapacity) return;
    Nlw_NlPin* old = macro->pins_;
    const size_t n = macro->numPins_;
    void* mem = view_->arena_->Allocate(capacity * sizeof(Nlw_NlPin), alignof(Nlw_NlPin));
    Nlw_NlPin* fresh = static_cast<Nlw_NlPin*>(mem);
    // A pin holds its properties through one owning pointer, so its bytes
    // can move; the old copies are abandoned to the arena, never destroyed.
    if (n) std::memcpy(static_cast<void*>(fresh), static_cast<const void*>(old), n * sizeof(*old));
    macro->pins_ = fresh;
    data.pinCapacity = capacity;

    // Signal lists that hold moved pins are mended.
    const uintptr_t low = reinterpret_cast<uintptr_t>(old);
    const uintptr_t high = low + n * sizeof(Nlw_NlPin);
    auto moved = [&](Nlw_NlPin* p) {
        const uintptr_t a = reinterpret_cast<uintptr_t>(p);
        return p && a >= low && a < high ? fresh + (a - low) / sizeof(Nlw_NlPin) : p;
    };
    std::unordered_set<Nlw_NlSignal*> mended;
    for (size_t i = 0; i < n; ++i) {
        for (Nlw_NlSignal* s : {fresh[i].signal_, fresh[i].child_}) {
            if (s == nullptr || !mended.insert(s).second) continue;
            s->firstPin_ = moved(s->firstPin_);
            s->lastPin_ = moved(s->lastPin_);
            s->refPin_ = moved(s->refPin_);
            for (Nlw_NlPin* p = s->firstPin_; p; p = s->NextPin(p)) {
                p->nextOnSignal_ = moved(p->nextOnSignal_);
                p->nextOnChild_ = moved(p->nextOnChild_);
            }
        }
    }
}

Nlw_NlPin* Nlw_NlBuilder::AppendPort(Nlw_NlBlock* macro, const char* name, int dir) {
    Nlw_NlBlock::MacroData& data = *macro->macro_;
    if (macro->numPins_ == data.pinCapacity)
        GrowPins(macro, data.pinCapacity < 4 ? 4 : 2 * data.pinCapacity);
    Nlw_NlPin* pin = new (macro->pins_ + macro->numPins_) Nlw_NlPin;
    ++macro->numPins_;
    pin->name_ = name;
    pin->owner_ = macro;
    pin->dir_ = static_cast<uint8_t>(dir);
    data.index.pinsBuilt = false;
    return pin;
}

Nlw_NlPin* Nlw_NlBuilder::AddPort(Nlw_NlBlock* macro, const char* name, int dir) {
    if (!CheckMacro(macro, "AddPort")) return nullptr;
    return AppendPort(macro, view_->Intern(name), dir);
}

Nlw_NlPinBus* Nlw_NlBuilder::AddPortBus(Nlw_NlBlock* macro, const char* name, int dir, int32_t msb,
                                        int32_t lsb) {
    if (!CheckMacro(macro, "AddPortBus") || !CheckWidth("port bus", name, msb, lsb)) return nullptr;
    Nlw_NlBlock::MacroData& data = *macro->macro_;
    const int64_t width = WidthOf(msb, lsb);
    const size_t needed = macro->numPins_ + static_cast<size_t>(width);
    if (needed > data.pinCapacity)
        GrowPins(macro, needed > 2 * data.pinCapacity ? needed : 2 * data.pinCapacity);

    Nlw_NlPinBus* bus = NewPinBus(name, dir, msb, lsb, macro->numPins_);
    bus->owner_ = macro;
    for (int64_t i = msb;; i += bus->posStep_ > 0 ? 1 : -1) {
        Nlw_NlMemberName(memberName_, bus->name_, i);
        Nlw_NlPin* pin =
            AppendPort(macro, view_->Intern(memberName_.data(), memberName_.size()), dir);
        pin->bus_ = bus;
        if (i == lsb) break;
    }
    data.pinBuses.Add(bus);
    data.index.busesBuilt = false;
    return bus;
}

// Signals

Nlw_NlBus* Nlw_NlBuilder::NewBus(const char* name, int32_t msb, int32_t lsb, bool pinBus) {
    Nlw_NlBus* bus;
    if (pinBus) {
        void* mem = view_->arena_->Allocate(sizeof(Nlw_NlPinBus), alignof(Nlw_NlPinBus));
        bus = new (mem) Nlw_NlPinBus;
    } else {
        void* mem = view_->arena_->Allocate(sizeof(Nlw_NlBus), alignof(Nlw_NlBus));
        bus = new (mem) Nlw_NlBus;
    }
    bus->name_ = view_->Intern(name);
    bus->arena_ = view_->arena_.get();
    bus->msb_ = msb;
    bus->lsb_ = lsb;
    bus->isPinBus_ = pinBus;
    return bus;
}

Nlw_NlPinBus* Nlw_NlBuilder::NewPinBus(const char* name, int dir, int32_t msb, int32_t lsb,
                                       size_t firstPin) {
    Nlw_NlPinBus* bus = static_cast<Nlw_NlPinBus*>(NewBus(name, msb, lsb, true));
    bus->dir_ = static_cast<uint8_t>(dir);
    // Members follow from firstPin, from msb to lsb; the member of the
    // lowest index is the last when msb > lsb and the first otherwise.
    bus->posStep_ = msb >= lsb ? -1 : 1;
    bus->firstPinPos_ =
        static_cast<int32_t>(msb >= lsb ? firstPin + WidthOf(msb, lsb) - 1 : firstPin);
    return bus;
}

Nlw_NlSignal* Nlw_NlBuilder::NewSignal(Nlw_NlBlock* macro, const char* name, size_t len) {
    void* mem = view_->arena_->Allocate(sizeof(Nlw_NlSignal), alignof(Nlw_NlSignal));
    Nlw_NlSignal* signal = new (mem) Nlw_NlSignal;
    signal->name_ = view_->Intern(name, len);
    signal->model_ = signal->name_;
    signal->owner_ = macro;
    macro->macro_->signals.push_back(signal);
    return signal;
}

Nlw_NlSignal* Nlw_NlBuilder::AddSignal(Nlw_NlBlock* macro, const char* name) {
    if (!CheckMacro(macro, "AddSignal")) return nullptr;
    return NewSignal(macro, name ? name : "", name ? std::strlen(name) : 0);
}

Nlw_NlBus* Nlw_NlBuilder::AddSignalBus(Nlw_NlBlock* macro, const char* name, int32_t msb,
                                       int32_t lsb) {
    if (!CheckMacro(macro, "AddSignalBus") || !CheckWidth("signal bus", name, msb, lsb))
        return nullptr;
    Nlw_NlBus* bus = NewBus(name, msb, lsb, false);
    bus->owner_ = macro;
    const size_t width = static_cast<size_t>(WidthOf(msb, lsb));
    bus->members_ =
        static_cast<void**>(view_->arena_->Allocate(width * sizeof(void*), alignof(void*)));
    std::memset(static_cast<void*>(bus->members_), 0, width * sizeof(void*));
    macro->macro_->signalBuses.Add(bus);
    return bus;
}

Nlw_NlSignal* Nlw_NlBuilder::GetSignalBusMember(Nlw_NlBus* bus, int32_t index) {
    if (bus == nullptr || bus->isPinBus_ || bus->members_ == nullptr) return nullptr;
    const int64_t low = bus->msb_ < bus->lsb_ ? bus->msb_ : bus->lsb_;
    const int64_t high = bus->msb_ < bus->lsb_ ? bus->lsb_ : bus->msb_;
    if (index < low || index > high) return nullptr;
    void*& slot = bus->members_[int64_t(index) - low];
    if (slot == nullptr) {
        Nlw_NlMemberName(memberName_, bus->name_, index);
        Nlw_NlSignal* signal = NewSignal(bus->owner_, memberName_.data(), memberName_.size());
        signal->bus_ = bus;
        slot = signal;
    }
    return static_cast<Nlw_NlSignal*>(slot);
}

// Connections

Nlw_NlPin*& Nlw_NlBuilder::LinkOf(Nlw_NlPin* p, const Nlw_NlSignal* s) {
    return p->signal_ == s ? p->nextOnSignal_ : p->nextOnChild_;
}

void Nlw_NlBuilder::Append(Nlw_NlSignal* s, Nlw_NlPin* p) {
    LinkOf(p, s) = nullptr;
    if (s->lastPin_)
        LinkOf(s->lastPin_, s) = p;
    else
        s->firstPin_ = p;
    s->lastPin_ = p;
}

void Nlw_NlBuilder::Unlink(Nlw_NlSignal* s, Nlw_NlPin* p) {
    Nlw_NlPin* prev = nullptr;
    Nlw_NlPin** link = &s->firstPin_;
    while (*link && *link != p) {
        prev = *link;
        link = &LinkOf(prev, s);
    }
    if (*link == nullptr) return;
    *link = LinkOf(p, s);
    if (s->lastPin_ == p) s->lastPin_ = prev;
    if (s->refPin_ == p) s->refPin_ = nullptr;
    LinkOf(p, s) = nullptr;
}

void Nlw_NlBuilder::Connect(Nlw_NlPin* pin, Nlw_NlSignal* outside) {
    if (pin == nullptr || outside == nullptr) return;
    if (pin->owner_->parent_ != outside->owner_) {
        NLW_MSG().issueInternal("Nlw_NlBuilder: %s cannot reach signal %s.\n",
                                pin->ToString().c_str(), outside->name_);
        return;
    }
    if (pin->signal_ == outside) return;
    if (pin->signal_) Unlink(pin->signal_, pin);
    pin->signal_ = outside;
    Append(outside, pin);
}

void Nlw_NlBuilder::ConnectChild(Nlw_NlPin* port, Nlw_NlSignal* inside) {
    if (port == nullptr || inside == nullptr) return;
    if (!port->owner_->IsMacro() || port->owner_ != inside->owner_) {
        NLW_MSG().issueInternal("Nlw_NlBuilder: %s cannot reach signal %s from inside.\n",
                                port->ToString().c_str(), inside->name_);
        return;
    }
    if (port->child_ == inside) return;
    if (port->child_) Unlink(port->child_, port);
    port->child_ = inside;
    Append(inside, port);
}

void Nlw_NlBuilder::SetTieOff(Nlw_NlPin* pin, int value) {
    if (pin) pin->AddProperty(Vdm_Property::NewInt("TIEOFF", value));
}

void Nlw_NlBuilder::SetVisible(Nlw_NlPin* pin, bool visible) {
    if (pin) pin->visible_ = visible;
}

void Nlw_NlBuilder::SetVisible(Nlw_NlSignal* signal, bool visible) {
    if (signal) signal->visible_ = visible;
}

void Nlw_NlBuilder::SetValid(Nlw_NlBus* bus, bool valid) {
    if (bus) bus->valid_ = valid;
}

void Nlw_NlBuilder::SetPinType(Nlw_NlPin* pin, int pinType) {
    if (pin) pin->pinType_ = static_cast<uint8_t>(pinType);
}

Nlw_NlNetwork* Nlw_NlBuilder::GetOrCreateNetwork(Nlw_NlSignal* signal) {
    if (signal == nullptr) return nullptr;
    if (signal->network_) return signal->network_;
    void* mem = view_->arena_->Allocate(sizeof(Nlw_NlNetwork), alignof(Nlw_NlNetwork));
    Nlw_NlNetwork* network = new (mem) Nlw_NlNetwork;
    view_->networks_.push_back(network);
    // Walk the hierarchical net: down through ports of child macros, up
    // through the enclosing block's ports. Signals that already have a
    // network keep it.
    std::vector<Nlw_NlSignal*> pending{signal};
    signal->network_ = network;
    while (!pending.empty()) {
        Nlw_NlSignal* s = pending.back();
        pending.pop_back();
        for (Nlw_NlPin* p = s->firstPin_; p; p = s->NextPin(p)) {
            Nlw_NlSignal* other = p->signal_ == s ? p->child_ : p->signal_;
            if (other && other->network_ == nullptr) {
                other->network_ = network;
                pending.push_back(other);
            }
        }
    }
    return network;
}

void Nlw_NlBuilder::SetRefPin(Nlw_NlSignal* signal, Nlw_NlPin* pin) {
    if (signal) signal->refPin_ = pin;
}

void Nlw_NlBuilder::SetSetReset(Nlw_NlSignal* signal) {
    view_->setReset_ = signal;
}

void Nlw_NlBuilder::SetTristate(Nlw_NlSignal* signal) {
    view_->tristate_ = signal;
}

void Nlw_NlBuilder::SetDevice(const char* device, const char* part) {
    view_->device_ = device ? device : "";
    view_->part_ = part ? part : "";
}

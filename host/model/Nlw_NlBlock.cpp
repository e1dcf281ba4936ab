// Blocks: type queries, hierarchy lists and pin lookup by name.
#include <cstring>

#include "model/Nlw_NlBuilder.h"

namespace {

const std::vector<Nlw_NlBlock*> kNoBlocks;
const std::vector<Nlw_NlSignal*> kNoSignals;

bool NameIs(const char* name, const char* text, size_t len) {
    return std::strncmp(name, text, len) == 0 && name[len] == '\0';
}

}  // namespace

const char* Nlw_NlBlock::GetTypeName() const {
    return type_ ? type_->GetName() : "";
}
bool Nlw_NlBlock::IsTimcell() const {
    return type_ && type_->IsTimcell();
}
bool Nlw_NlBlock::IsFuncell() const {
    return type_ && type_->IsFuncell();
}
int Nlw_NlBlock::GetPrimType() const {
    return type_ ? type_->GetPrimType() : 0;
}
const char* Nlw_NlBlock::GetFileBaseName() const {
    return type_ ? type_->GetFileBaseName() : "";
}

const UT_DARRAY<Nlw_NlPinBus*>* Nlw_NlBlock::GetPinBuses() const {
    const UT_DARRAY<Nlw_NlPinBus*>* buses =
        macro_ ? &macro_->pinBuses : (type_ ? &type_->pinBusArray_ : nullptr);
    return buses && buses->GetCount() ? buses : nullptr;
}

const std::vector<Nlw_NlBlock*>& Nlw_NlBlock::GetChildren() const {
    return macro_ ? macro_->children : kNoBlocks;
}

const std::vector<Nlw_NlSignal*>& Nlw_NlBlock::GetSignals() const {
    return macro_ ? macro_->signals : kNoSignals;
}

const UT_DARRAY<Nlw_NlBus*>* Nlw_NlBlock::GetSignalBuses() const {
    return macro_ && macro_->signalBuses.GetCount() ? &macro_->signalBuses : nullptr;
}

void Nlw_NlBlock::SetExternalProperties(Vdm_Property* list) {
    if (list == extProps_) return;
    delete extProps_;
    extProps_ = list;
}

std::string Nlw_NlBlock::ToString() const {
    std::string text(GetTypeName());
    text += ' ';
    text += name_;
    return text;
}

void Nlw_NlBlock::SetWritableName(const char* name) {
    name_ = view_->Intern(name);
}

void Nlw_NlBlock::SetAka(const char* aka) {
    aka_ = aka ? view_->Intern(aka) : nullptr;
}

Nlw_NlPin* Nlw_NlBlock::FindPin(const char* name) const {
    if (name == nullptr) return nullptr;
    // A leaf's pins carry the names of its type's definitions, which the
    // type indexes once for all its instances.
    if (!macro_ && type_ && !type_->pinsDiverge_ && numPins_ > Nlw_NlNameIndex::kDirect) {
        const int pos = type_->FindPinDef(name);
        return pos >= 0 && size_t(pos) < numPins_ ? pins_ + pos : nullptr;
    }
    if (!macro_ || numPins_ <= Nlw_NlNameIndex::kDirect) {
        for (Nlw_NlPin& pin : GetPins())
            if (std::strcmp(pin.GetWritableName(), name) == 0) return &pin;
        return nullptr;
    }
    Nlw_NlNameIndex& index = macro_->index;
    if (!index.pinsBuilt) {
        index.pins.clear();
        for (uint32_t i = 0; i < numPins_; ++i) index.pins.emplace(pins_[i].GetWritableName(), i);
        index.pinsBuilt = true;
    }
    auto it = index.pins.find(name);
    return it == index.pins.end() ? nullptr : pins_ + it->second;
}

Nlw_NlPinBus* Nlw_NlBlock::FindPinBus(const char* name, size_t len) const {
    const UT_DARRAY<Nlw_NlPinBus*>* buses = GetPinBuses();
    if (buses == nullptr) return nullptr;
    if (buses->GetCount() <= Nlw_NlNameIndex::kDirect) {
        for (Nlw_NlPinBus* bus : *buses)
            if (NameIs(bus->GetWritableName(), name, len)) return bus;
        return nullptr;
    }
    Nlw_NlNameIndex& index = macro_ ? macro_->index : *type_->index_;
    if (!index.busesBuilt) {
        index.buses.clear();
        for (Nlw_NlPinBus* bus : *buses) index.buses.emplace(bus->GetWritableName(), bus);
        index.busesBuilt = true;
    }
    auto it = index.buses.find(std::string_view(name, len));
    return it == index.buses.end() ? nullptr : it->second;
}

Nlw_NlPin* Nlw_NlBlock::GetBusMember(const Nlw_NlPinBus* bus, int32_t index) const {
    const int64_t low = bus->msb_ < bus->lsb_ ? bus->msb_ : bus->lsb_;
    const int64_t high = bus->msb_ < bus->lsb_ ? bus->lsb_ : bus->msb_;
    if (index < low || index > high) return nullptr;
    const int64_t pos = bus->firstPinPos_ + bus->posStep_ * (int64_t(index) - low);
    if (pos < 0 || pos >= int64_t(numPins_)) return nullptr;
    return pins_ + pos;
}

Nlw_NlPin* Nlw_NlBlock::GetPinByAlias(const char* alias) const {
    if (alias == nullptr) return nullptr;
    const size_t len = std::strlen(alias);
    size_t left = 0;
    int32_t index = 0;
    if (Nlw_NlSplitIndex(alias, len, 4, left, index) && left > 0) {
        if (const Nlw_NlPinBus* bus = FindPinBus(alias, left)) {
            if (Nlw_NlPin* pin = GetBusMember(bus, index)) return pin;
        }
    }
    return FindPin(alias);
}

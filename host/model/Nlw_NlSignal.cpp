// Pins and signals: names, texts and the walk over a signal's pins.
#include "model/Nlw_NlBuilder.h"

// Pins

Nlw_NlView* Nlw_NlPin::GetView() const {
    return owner_ ? owner_->GetView() : nullptr;
}

std::string Nlw_NlPin::ToString() const {
    std::string text(owner_ ? owner_->GetWritableName() : "");
    text += '/';
    text += name_;
    return text;
}

void Nlw_NlPin::SetWritableName(const char* name) {
    name_ = GetView()->Intern(name);
    if (owner_->macro_)
        owner_->macro_->index.pinsBuilt = false;
    else if (owner_->type_)
        owner_->type_->pinsDiverge_ = true;  // no longer the definition's name
}

void Nlw_NlPin::SetAka(const char* aka) {
    aka_ = aka ? GetView()->Intern(aka) : nullptr;
}

// Signals

Nlw_NlSignal::PinIter& Nlw_NlSignal::PinIter::operator++() {
    p_ = s_->NextPin(p_);
    return *this;
}

size_t Nlw_NlSignal::GetPinCount() const {
    size_t n = 0;
    for (const Nlw_NlPin* p = firstPin_; p; p = NextPin(p)) ++n;
    return n;
}

Nlw_NlPin* Nlw_NlSignal::FindDriverPin() const {
    // A pin that can only drive wins over a bidirectional one met earlier.
    Nlw_NlPin* inout = nullptr;
    for (Nlw_NlPin* p = firstPin_; p; p = NextPin(p)) {
        const bool port = p->child_ == this;  // a port seen from inside
        if (port ? p->dir_ == NLW_DIR_INPUT : p->dir_ == NLW_DIR_OUTPUT) return p;
        if (p->dir_ == NLW_DIR_INOUT && inout == nullptr) inout = p;
    }
    return inout;
}

void Nlw_NlSignal::SetWritableName(const char* name) {
    name_ = owner_->GetView()->Intern(name);
}

void Nlw_NlSignal::SetAka(const char* aka) {
    aka_ = aka ? owner_->GetView()->Intern(aka) : nullptr;
}

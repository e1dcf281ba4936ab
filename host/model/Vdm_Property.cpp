// Properties and property holders.
#include "model/Vdm_Property.h"

#include <cstring>

Vdm_Property::Vdm_Property(const char* name, int type) : name_(name ? name : ""), type_(type) {}

const std::vector<std::string>& Vdm_Property::GetValueTexts() const {
    static const std::vector<std::string> none;
    return values_ ? *values_ : none;
}

Vdm_Property::~Vdm_Property() {
    ClearElements();
}

Vdm_Property* Vdm_Property::NewBool(const char* name, bool v) {
    auto* p = new Vdm_Property(name, VDM_PROP_BOOL);
    p->i_ = v ? 1 : 0;
    return p;
}

Vdm_Property* Vdm_Property::NewFloat(const char* name, double v) {
    auto* p = new Vdm_Property(name, VDM_PROP_FLOAT);
    p->d_ = v;
    return p;
}

Vdm_Property* Vdm_Property::NewInt(const char* name, int32_t v) {
    auto* p = new Vdm_Property(name, VDM_PROP_INT);
    p->i_ = v;
    return p;
}

Vdm_Property* Vdm_Property::NewString(const char* name, const char* text) {
    auto* p = new Vdm_Property(name, VDM_PROP_STRING);
    p->text_ = text ? text : "";
    return p;
}

Vdm_Property* Vdm_Property::NewList(const char* name) {
    return new Vdm_Property(name, VDM_PROP_LIST);
}

Vdm_Property* Vdm_Property::NewBorrowingList(const char* name) {
    auto* p = new Vdm_Property(name, VDM_PROP_LIST);
    p->ownsElements_ = false;
    return p;
}

Vdm_Property* Vdm_Property::NewBits(const char* name, const char* bits) {
    auto* p = new Vdm_Property(name, VDM_PROP_BITS);
    p->text_ = bits ? bits : "";
    return p;
}

Vdm_Property* Vdm_Property::NewTypeDef(const char* name, const std::vector<std::string>& values) {
    auto* p = new Vdm_Property(name, VDM_PROP_TYPEDEF);
    p->values_ = std::make_unique<std::vector<std::string>>(values);
    return p;
}

const char* Vdm_Property::GetPropertyTypeName() const {
    switch (type_) {
        case VDM_PROP_BOOL:
            return "bool";
        case VDM_PROP_FLOAT:
            return "float";
        case VDM_PROP_INT:
            return "integer";
        case VDM_PROP_STRING:
            return "string";
        case VDM_PROP_TYPEDEF:
            return "typedef";
        case VDM_PROP_LIST:
            return "list";
        case VDM_PROP_BITS:
            return "bits";
        default:
            return "unknown";
    }
}

Vdm_Property* Vdm_Property::Add(Vdm_Property* p) {
    if (p) elems_.push_back(p);
    return p;
}

void Vdm_Property::ClearElements() {
    if (ownsElements_)
        for (Vdm_Property* e : elems_) delete e;
    elems_.clear();
}

Vdm_Property* Vdm_Property::CreatePropertyString(const char* name, const char* text) {
    return Add(NewString(name, text));
}

Vdm_PropertyHolder::~Vdm_PropertyHolder() {
    if (!props_) return;
    for (Vdm_Property* p : *props_) delete p;
    delete props_;
}

Vdm_Property* Vdm_PropertyHolder::GetPropertyByName(const char* name) const {
    if (!props_ || !name) return nullptr;
    for (Vdm_Property* p : *props_)
        if (std::strcmp(p->GetName(), name) == 0) return p;
    return nullptr;
}

void Vdm_PropertyHolder::AddProperty(Vdm_Property* p) {
    if (!p) return;
    if (!props_) props_ = new std::vector<Vdm_Property*>;
    for (Vdm_Property*& slot : *props_) {
        if (std::strcmp(slot->GetName(), p->GetName()) == 0) {
            // The replacement takes the old property's place in the order.
            if (slot != p) delete slot;
            slot = p;
            return;
        }
    }
    props_->push_back(p);
}

void Vdm_PropertyHolder::RemoveProperty(const char* name) {
    if (!props_ || !name) return;
    for (auto it = props_->begin(); it != props_->end(); ++it) {
        if (std::strcmp((*it)->GetName(), name) == 0) {
            delete *it;
            props_->erase(it);
            return;
        }
    }
}

// Properties of model objects and the holders that carry them.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

// Property type codes.
enum Vdm_PropType {
    VDM_PROP_BOOL = 0,
    VDM_PROP_FLOAT = 1,
    VDM_PROP_INT = 3,
    VDM_PROP_STRING = 9,
    VDM_PROP_TYPEDEF = 10,  // type-library definition with value texts
    VDM_PROP_LIST = 11,     // list of properties
    VDM_PROP_BITS = 12,     // bit vector from a design file: text of 0 1 x z, MSB first
};

// A named, typed value. A list-valued property holds its elements in order
// and owns them. Names and texts are owned by the property.
class Vdm_Property {
public:
    Vdm_Property(const char* name, int type);
    ~Vdm_Property();
    Vdm_Property(const Vdm_Property&) = delete;
    Vdm_Property& operator=(const Vdm_Property&) = delete;

    static Vdm_Property* NewBool(const char* name, bool v);
    static Vdm_Property* NewFloat(const char* name, double v);
    static Vdm_Property* NewInt(const char* name, int32_t v);
    static Vdm_Property* NewString(const char* name, const char* text);
    static Vdm_Property* NewList(const char* name);
    // A list that refers to elements owned elsewhere: deleting it leaves
    // its elements alone.
    static Vdm_Property* NewBorrowingList(const char* name);
    static Vdm_Property* NewBits(const char* name, const char* bits);
    static Vdm_Property* NewTypeDef(const char* name, const std::vector<std::string>& values);

    const char* GetName() const { return name_.c_str(); }
    int GetType() const { return type_; }
    // The host's name of the type code: "bool", "float", "integer", "string",
    // "typedef", "list", "bits" or "unknown".
    const char* GetPropertyTypeName() const;

    bool GetBool() const { return i_ != 0; }
    double GetFloat() const { return d_; }
    int32_t GetInt32() const { return i_; }
    // The text value of a string property, else null.
    const char* GetString() const {
        return type_ == VDM_PROP_STRING || type_ == VDM_PROP_BITS ? text_.c_str() : nullptr;
    }
    void SetString(const char* text) { text_ = text ? text : ""; }

    // Value texts of a type-library definition (code 10).
    const std::vector<std::string>& GetValueTexts() const;

    // List elements (code 11).
    size_t GetCount() const { return elems_.size(); }
    Vdm_Property* GetElement(size_t i) const { return elems_[i]; }
    const std::vector<Vdm_Property*>& GetElements() const { return elems_; }
    // Appends an element (an owning list takes ownership) and returns it.
    Vdm_Property* Add(Vdm_Property* p);
    // Removes every element (deleting those an owning list owns).
    void ClearElements();
    // Appends a new string element.
    Vdm_Property* CreatePropertyString(const char* name, const char* text);

private:
    // A design holds a few of these per cell: the members are ordered so
    // that none pads, and what only a type definition has is kept apart.
    std::string name_;
    std::string text_;
    std::vector<Vdm_Property*> elems_;
    std::unique_ptr<std::vector<std::string>> values_;
    double d_ = 0;
    int type_;
    int32_t i_ = 0;
    bool ownsElements_ = true;
};

// Carries properties in their stored order. Lookup by name is exact; a holder
// carries few properties, so it costs a few comparisons.
class Vdm_PropertyHolder {
public:
    Vdm_PropertyHolder() = default;
    ~Vdm_PropertyHolder();
    Vdm_PropertyHolder(const Vdm_PropertyHolder&) = delete;
    Vdm_PropertyHolder& operator=(const Vdm_PropertyHolder&) = delete;

    Vdm_Property* GetPropertyByName(const char* name) const;
    // Adds a property (the holder takes ownership). A property of the same name
    // is replaced.
    void AddProperty(Vdm_Property* p);
    void RemoveProperty(const char* name);
    // The properties in stored order (null when none).
    const std::vector<Vdm_Property*>* GetProperties() const { return props_; }

private:
    std::vector<Vdm_Property*>* props_ = nullptr;
};

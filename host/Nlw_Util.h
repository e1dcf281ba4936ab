// Small host helpers the writers call: time stamps, property access, texts.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "Vdm_Property.h"

class Nlw_NlBlock;
class Nlw_NlView;
class PM_PIC;

// The type library: per block type, the property definitions of its
// configuration, such as an INIT whose value texts are "16'h0000".
class Ldm_TypeBlock {
public:
    explicit Ldm_TypeBlock(const char* name) : name_(name) {}
    ~Ldm_TypeBlock();
    const char* GetName() const { return name_.c_str(); }
    // Definitions of a property group ("Config_General_Data"), in order.
    const std::vector<Vdm_Property*>& GetPropertyCItr(const char* group) const;
    void AddDefinition(const char* group, Vdm_Property* def);

private:
    std::string name_;
    std::vector<std::pair<std::string, std::vector<Vdm_Property*>>> groups_;
};

class Ldm_TypeLib {
public:
    ~Ldm_TypeLib();
    // Exact name lookup; null when the library has no such block type.
    Ldm_TypeBlock* GetBlockByName(const char* name) const;
    Ldm_TypeBlock* AddBlock(const char* name);

private:
    std::vector<Ldm_TypeBlock*> blocks_;
};

class Nlw_Util {
public:
    // The run's time stamp. When NLW_TIMESTAMP is set, or a fixed text was
    // given with SetFixedTimeStamp, that text; otherwise the local time as
    // "Sun Dec  6 10:51:33 2026".
    static const char* GetTimeStampString(int flag);
    static void SetFixedTimeStamp(const char* text);
    static int32_t GetInt32Prop(const Vdm_PropertyHolder* h, const char* name, int32_t dflt = 0);
    static const char* GetStringProp(const Vdm_PropertyHolder* h, const char* name);
    // "INPUT", "OUTPUT", "BIDIR" or "UNKNOWN".
    static const char* ToString(int direction);
    // The part of the view as device data, or null when the view has none.
    static PM_PIC* CreatePicSpec(Nlw_NlView* view, bool flag);
};

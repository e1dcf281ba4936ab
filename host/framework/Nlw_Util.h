// Small host helpers the writers call: time stamps, property access, texts.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

#include "model/Vdm_Property.h"

class Nlw_NlBlock;
class Nlw_NlView;
class PM_PIC;

// The type library: per block type, the property definitions of its
// configuration, such as an INIT whose value texts are "16'h0000".
class Ldm_TypeBlock {
public:
    explicit Ldm_TypeBlock(const char* name) : name_(name ? name : "") {}
    ~Ldm_TypeBlock();
    Ldm_TypeBlock(const Ldm_TypeBlock&) = delete;
    Ldm_TypeBlock& operator=(const Ldm_TypeBlock&) = delete;
    const char* GetName() const { return name_.c_str(); }
    // Definitions of a property group ("Config_General_Data"), in order;
    // an empty list for a group the block type does not have.
    const std::vector<Vdm_Property*>& GetPropertyCItr(const char* group) const;
    // Appends a definition to a group (the block type takes ownership).
    void AddDefinition(const char* group, Vdm_Property* def);

private:
    std::string name_;
    std::vector<std::pair<std::string, std::vector<Vdm_Property*>>> groups_;
};

class Ldm_TypeLib {
public:
    Ldm_TypeLib() = default;
    ~Ldm_TypeLib();
    Ldm_TypeLib(const Ldm_TypeLib&) = delete;
    Ldm_TypeLib& operator=(const Ldm_TypeLib&) = delete;
    // Exact name lookup; null when the library has no such block type.
    Ldm_TypeBlock* GetBlockByName(const char* name) const;
    // The block type of that name, created when new.
    Ldm_TypeBlock* AddBlock(const char* name);

private:
    std::vector<Ldm_TypeBlock*> blocks_;
    std::unordered_map<std::string, Ldm_TypeBlock*> byName_;
};

class Nlw_Util {
public:
    // The run's time stamp: a fixed text given with SetFixedTimeStamp, else
    // the value of NLW_TIMESTAMP when set, else the local time of the first
    // call as "Sun Dec  6 10:51:33 2026" (every file of a run carries the
    // same stamp).
    static const char* GetTimeStampString(int flag);
    // A null text drops the fixed stamp.
    static void SetFixedTimeStamp(const char* text);
    // An integer property's value; a string property holding a decimal
    // number also counts. Otherwise (absent, other type, not a number) dflt.
    static int32_t GetInt32Prop(const Vdm_PropertyHolder* h, const char* name, int32_t dflt = 0);
    // The text of a string property, or null.
    static const char* GetStringProp(const Vdm_PropertyHolder* h, const char* name);
    // Text as it may stand in a "//" comment: null gives "", and a line
    // break or other control character (a tab aside) becomes a blank, so the
    // comment cannot end early and put the rest of the text into the code.
    static std::string CommentText(const char* text);
    // "INPUT", "OUTPUT", "BIDIR" or "UNKNOWN".
    static const char* ToString(int direction);
    // The part of the view as device data, or null when the view has none.
    // The caller deletes the result.
    static PM_PIC* CreatePicSpec(Nlw_NlView* view, bool flag);
    // How many threads writing may use, as NLW_WRITE_THREADS asks: 1 keeps
    // one thread, 2 takes two whatever the size of the work; 0 when it asks
    // neither, and the size of the work decides.
    static int WriteThreadsAsked();
    // Whether writing work of that size (instances, pins, nets) takes two
    // threads: as NLW_WRITE_THREADS asks, else from 50 000 on a machine of
    // two cores or more; below that, a second thread costs more than it
    // saves.
    static bool WriteOnTwoThreads(size_t work);
};
